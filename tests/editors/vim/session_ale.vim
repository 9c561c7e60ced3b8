" Vim with ALE and the settings of the file that $QREX_SETTINGS names: the errors that it shows.
packadd ale
source $QREX_SETTINGS
filetype plugin on
set hidden

function! s:ErrorOf(file) abort
  call setloclist(0, [])
  execute 'edit' a:file
  for _ in range(500)
    let found = getloclist(0)
    if !empty(found)
      return found[0].text
    endif
    sleep 20m
  endfor
  return 'none'
endfunction

let s:errors = [s:ErrorOf('src/a.cpp'), s:ErrorOf('common.inc')]
call writefile(s:errors, 'errors.txt')
qall!
