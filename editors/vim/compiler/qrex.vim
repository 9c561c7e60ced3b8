" `:compiler qrex`, then `:make zoo.qrex`, in the folder of the configuration.

if exists('current_compiler')
  finish
endif
let current_compiler = 'qrex'

CompilerSet makeprg=Qrex
" A message of a compiler stands below the line of the source that it is about; without one, it is taken as it is.
CompilerSet errorformat=
      \%f(%l)\ :\ %trror\ :\ %m,
      \%f(%l)\ :\ %tarning\ W%n\ :\ %m,
      \%f(%l)\ :\ %tarning\ :\ %m,
      \%A%f(%l)\ ...%.%#,
      \%Z%*[^:]:%*\\d:%*\\d:\ %trror:\ %m,
      \%Z%*[^:]:%*\\d:%*\\d:\ fatal\ %trror:\ %m,
      \%Z%*[^:]:%*\\d:%*\\d:\ %tarning:\ %m,
      \%Z%*[^:]:%*\\d:%*\\d:\ %m,
      \%f:%l:%c:\ fatal\ %trror:\ %m,
      \%f:%l:%c:\ %trror:\ %m,
      \%f:%l:%c:\ %tarning:\ %m,
      \%f:%l:%c:\ %m
