" Configurations, workspaces and projects of Qrex.

if exists('b:current_syntax')
  finish
endif
runtime! syntax/qrexmacros.vim

syn keyword qrexKey mode compiler runtime platform systemName systemProcessor systemVersion sizeofPointer
      \ platformToolset sourceFolder depfile windowsSdk buildTrace schemaLock report targetXP defaultToDll diagnostics
      \ translateOnly rebuildAll exportPublicHeaders repackageExecutableTargets solutionContainsPrepackagedProjects
      \ makeTranslatedFilesReadOnly makeExportedHeaderFilesReadOnly writeTokenEquivalent modernCpp compilableText
      \ lineDirectives positionMaps annotations ninja failOnErrors keepGoing fingerprints commandFiles compileCommands
      \ jobs virtualTree workspaces launcher PATH INCLUDE LIB OutputDirectory IntermediateDirectory
      \ DeleteExtensionsOnClean BuildLogFile InheritedPropertySheets ConfigurationType UseOfMFC UseOfATL
      \ ATLMinimizesCRunTimeLibraryUsage CharacterSet ManagedExtensions WholeProgramOptimization PlatformToolset
syn keyword qrexStatement subproj toolfiles directories prebuildevent prelinkevent postbuildevent general qrex export
syn keyword qrexStatement as flat exclude
" A statement of projects and a key share this word.
syn match qrexStatement '\<config\>'
syn match qrexKey '\<config\ze\s*='
syn keyword qrexBoolean true false
syn match qrexWord '=\s*\zs\<\%(clean\|compile\|build\|gen\|show\|vc\d\+\|gcc\|winegcc\|clang\|none\|source\|built\)\>'
syn match qrexNumber '\<\%(0[xX]\x\+\|\d\+\)\>'
syn match qrexSetting '\$\h\w*'

syn region qrexString start='"' skip='\\.' end='"' end='$' contains=qrexSubstitution,qrexEscape,qrexBadEscape oneline
syn match qrexBadEscape '\\.' contained
syn match qrexEscape '\\\%(x\x\x\|[rnabftv0"\\'?]\)' contained
syn region qrexRawString start='\<[rR]"' end='"' oneline
syn region qrexLineComment start='//' end='$' contains=@Spell
syn region qrexLineComment start='/\*' end='\*/' contains=@Spell

" What stands in the braces is the compiler's. A scope in parentheses may be ahead of them.
syn match qrexStatement '[+-]\%(cpp\|rc\|link\)\>' nextgroup=qrexScope,qrexSwitches skipwhite skipnl skipempty
syn region qrexScope start='(' end=')' contained contains=qrexString nextgroup=qrexSwitches skipwhite skipnl skipempty
syn cluster qrexText contains=qrexDirective,qrexConditional,qrexRepeat,qrexInclude,qrexDefine,qrexOperator,qrexPredefined,qrexSubstitution,qrexComment,qrexLineComment,qrexString
syn region qrexSwitches matchgroup=qrexDelimiter start='{' end='}' contained contains=@qrexText,qrexSwitch
syn match qrexSwitch '\%([^[:space:]{]\)\@1<![-/]\a[^[:space:]"'{}]*' contained

hi def link qrexBadEscape Error
hi def link qrexBoolean Boolean
hi def link qrexEscape SpecialChar
hi def link qrexKey Identifier
hi def link qrexLineComment Comment
hi def link qrexNumber Number
hi def link qrexRawString String
hi def link qrexSetting Identifier
hi def link qrexStatement Statement
hi def link qrexString String
hi def link qrexSwitch Special
hi def link qrexWord Constant

" Files are short.
syn sync fromstart

let b:current_syntax = 'qrex'
