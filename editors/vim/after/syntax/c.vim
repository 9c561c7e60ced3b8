" What Qrex adds to C and C++, whose syntax reads that of C.

runtime! syntax/qrexmacros.vim
syn match qrexSubstitution '\$(\h\w*)' contained containedin=cString,cppString

" `$TYPE NAME` of fields and methods; the words below it are more than types.
syn match qrexMember '\$\%(\%(const\|static\|inline\|virtual\)\s\+\)*\h\w*\%(::\h\w*\)*'
syn match qrexWord '\$\%(this\|new\|init\|uninit\|evict\|visit\|dropped\|evolve\|makefunctor\|makeconstfunctor\|warning\)\>'
syn match qrexWord '\$\$'
syn match qrexDeclare '\$\%(type\|typedef\|var\|function\|polymorphic\|functor\|cache\)\>' nextgroup=qrexMark,qrexQualifiers skipwhite
syn match qrexDeclare '\$enum\>' nextgroup=qrexMark,qrexTypeName,qrexKind skipwhite
syn match qrexMark '[-+^]\+' contained nextgroup=qrexQualifiers,qrexTypeName,qrexKind skipwhite
syn match qrexTypeName '\h\w*\%(::\h\w*\)*' contained
syn match qrexKind '\<\%(class\|implement\|ipc\|rmi\)\>' contained nextgroup=qrexTypeName skipwhite

" The name behind a word of a type is its own; what follows up to the body are others.
syn region qrexHeading matchgroup=qrexDeclare start='\$\%(struct\|class\|mixin\|model\|adt\|variant\|interface\|implementing\)\>'
      \ end='[;{}]'me=s-1 contains=qrexDeclared,qrexMixinList,qrexHeadingMark,qrexKind,qrexHeadingWord,qrexQualifiers,cString,cppString,cNumbers,cppNumbers,cComment,cCommentL,qrexComment
syn match qrexDeclared '\%(\$\h\w*\s*+\=\s*\%(\%(implement\|ipc\|rmi\)\s\+\)\=\)\@60<=\<\%(\%(implement\|ipc\|rmi\)\>\)\@!\h\w*\%(::\h\w*\)*' contained
syn match qrexHeadingMark '+' contained
syn keyword qrexHeadingWord contained isa model mixin public protected private virtual final
syn match qrexMixins '^\s*\zsmixin\ze\s*\[' nextgroup=qrexMixinList skipwhite
syn region qrexMixinList matchgroup=qrexDelimiter start='\[' end='\]' contained transparent contains=ALLBUT,@qrexNotCode,qrexSection,qrexQualifiers
syn region qrexQualifiers start='<<' end='>>' end='$' contained oneline contains=qrexQualifier
syn keyword qrexQualifier contained reflect register abstract dc copy compare print ser os ar passbyvalue
      \ returnbyvalue rod traits nested extern genop multiline async io queue visit

" In parentheses the syntax of C takes whatever it does not know to be part of something else.
syn cluster qrexInner contains=qrexExported,qrexMacroName,qrexMacroType,qrexParameters,qrexParameter,qrexParameterType,qrexVariable
syn cluster qrexInner add=qrexVariableType,qrexIn,qrexSubstitution,qrexMark,qrexTypeName,qrexKind,qrexDeclared,qrexHeadingMark
syn cluster qrexInner add=qrexQualifier,qrexRelease,qrexChange,qrexHeadingWord
syn cluster qrexInner add=qrexLoop,qrexLoopHead,qrexParens,qrexMixinList
" What the syntax of C keeps out of parentheses; braces are no errors in our lists.
syn cluster qrexNotCode contains=@qrexInner,cErrInParen,cErrInBracket,cParenError,cIncluded,cSpecial,cCommentSkip,cCommentString
syn cluster qrexNotCode add=cComment2String,@cCommentGroup,cCommentStartError,cUserLabel,cBitField,cOctalZero,@cCppOutInGroup,cFormat
syn cluster qrexNotCode add=cNumber,cFloat,cOctal,cOctalError,cNumbersCom
syn cluster cParenGroup add=@qrexInner,qrexSection,qrexQualifiers
syn cluster cPreProcGroup add=@qrexInner,qrexSection,qrexQualifiers
syn cluster cMultiGroup add=@qrexInner,qrexSection,qrexQualifiers

" Sections of code between the name of a calculated field and its semicolon.
syn region qrexCalculated matchgroup=qrexDeclare start='\$\%(dep\|indep\)\>\s*[-^]*' matchgroup=NONE end=';' end='}'me=s-1 transparent
      \ contains=ALLBUT,@qrexNotCode
syn match qrexSection '\<\%(calc\|create\|destroy\|evict\|evictable\|invalidate\|visit\)\ze\%(\s*{\|\s*$\)' contained

syn region qrexSchema matchgroup=qrexDeclare start='\$schema\>' matchgroup=NONE end='}' contains=qrexRelease,qrexChange,cComment,cCommentL,qrexComment
syn match qrexRelease '\<\d\+\ze\s*:' contained
syn match qrexChange '[-+]' contained

hi def link qrexChange Operator
hi def link qrexDeclare Structure
hi def link qrexDeclared Typedef
hi def link qrexHeadingMark Operator
hi def link qrexHeadingWord Statement
hi def link qrexKind StorageClass
hi def link qrexMark Operator
hi def link qrexMember Type
hi def link qrexMixins Statement
hi def link qrexQualifier StorageClass
hi def link qrexRelease Number
hi def link qrexSection Label
hi def link qrexTypeName Typedef
hi def link qrexWord Keyword
