" The macro layer of Qrex, which every text of it has: `@` directives and $(name). Read by the syntax of the languages below it.

syn match qrexDirective '@\s*\%(str\|strx\|strW\|strxW\|unstr\|quote\|relativepath\|print\|println\|assert\|assertfails\|fail\|runpython\|scope\)\>'
syn match qrexConditional '@\s*\%(if\|elseif\|else\)\>'
syn match qrexRepeat '@\s*while\>'
syn match qrexRepeat '@\s*for\>' nextgroup=qrexLoop skipwhite
syn match qrexInclude '@\s*\%(import\|importpath\)\>'
syn match qrexDefine '@\s*\%(def\|exportdef\|nakeddef\|defpython\)\>' nextgroup=qrexExported,qrexMacroName,qrexMacroType skipwhite
syn match qrexDefine '@\s*let\>' nextgroup=qrexVariable,qrexVariableType skipwhite
syn match qrexOperator '@\s*@'
syn match qrexOperator '@\ze\s*[([]'
syn match qrexSubstitution '@\s*\$\s*\h\w*'

syn match qrexExported '+' contained nextgroup=qrexMacroName,qrexMacroType skipwhite
syn match qrexMacroName '\h\w*' contained nextgroup=qrexParameters skipwhite
syn match qrexMacroType '\<\%(bool\|int\|double\|char\|string\)\>\ze\s\+\h' contained nextgroup=qrexMacroName skipwhite
syn region qrexParameters start='(' end=')\ze\_s*=' end='$' contained oneline contains=qrexParameter,qrexParameterType
syn match qrexParameter '\h\w*' contained
syn match qrexParameterType '\<\%(bool\|int\|double\|char\|string\)\>\ze\s\+\h' contained
syn match qrexVariable '\h\w*' contained
syn match qrexVariableType '\<\%(bool\|int\|double\|char\|string\)\>\ze\s\+\h' contained nextgroup=qrexVariable skipwhite
syn region qrexLoop matchgroup=qrexDelimiter start='(' end=')' contained contains=qrexLoopHead,@qrexLoopList
syn match qrexIn '\<in\>' contained
syn region qrexParens matchgroup=qrexDelimiter start='(' end=')' contained contains=@qrexLoopList
syn match qrexLoopHead '\%(@\s*for\s*(\)\@30<=[^{}]\{-}\<in\>' contained contains=qrexIn,qrexParameter
syn cluster qrexLoopList contains=qrexParens,qrexDirective,qrexPredefined,qrexOperator,qrexComment,qrexString,qrexNumber,qrexLineComment
syn cluster qrexLoopList add=cString,cppString,cNumbers,cppNumbers,cComment,cCommentL

syn match qrexPredefined '@macro\h\w*'
syn match qrexPredefined '@\%(is_public_header\|is_header\|is_cpp\|root_to_file_path\|file_path\|filename\|filename_without_extension\)\>'
syn match qrexPredefined '@\%(file_extension\|workspace\|project\|root_to_projdir_path\|root_path\|target_type\|platform\)\>'
syn match qrexPredefined '@\%(system_name\|system_processor\|system_version\|size_of_pointer\|config\|api\|macros\)\>'
syn match qrexSubstitution '\$(\h\w*)' contained

syn region qrexComment start='@\s*//' end='$' contains=@Spell
syn region qrexComment start='@\s*/\*' end='\*/' contains=@Spell

hi def link qrexComment Comment
hi def link qrexConditional PreCondit
hi def link qrexDefine Define
hi def link qrexDelimiter Delimiter
hi def link qrexDirective PreProc
hi def link qrexExported Operator
hi def link qrexIn PreCondit
hi def link qrexInclude Include
hi def link qrexMacroName Macro
hi def link qrexMacroType Type
hi def link qrexOperator Operator
hi def link qrexParameter Identifier
hi def link qrexParameterType Type
hi def link qrexPredefined Constant
hi def link qrexRepeat PreCondit
hi def link qrexSubstitution Identifier
hi def link qrexVariable Identifier
hi def link qrexVariableType Type
