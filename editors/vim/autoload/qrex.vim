" What the other files ask.

let s:statement = '\C^\%(' . join([
      \ '[+-]\%(cpp\|rc\|link\)\>\s*[({]',
      \ '\$\h\w*\s*=\s*"',
      \ '\%(config\|subproj\|toolfiles\|general\|prebuildevent\|prelinkevent\|postbuildevent\)\_s*{',
      \ '\%(general\|prebuildevent\|prelinkevent\|postbuildevent\)\s*(',
      \ 'directories\s*[-+["]',
      \ '\a\w*\s*+\==\s*\%([{"]\|\%(true\|false\)\>\|\w\+\s*\%(\n\|$\)\)',
      \ '\%(PATH\|INCLUDE\|LIB\)\s*("',
      \ ], '\|') . '\)'

" Blanks, comments and macros may stand ahead of statements; C++ has them, too.
let s:ahead = '\C^\%(' . join([
      \ '\_s\+',
      \ '@\=\s*//[^\n]*',
      \ '@\=\s*/\*\_.\{-}\*/',
      \ '@\s*\%(import\|importpath\)\s*"[^"\n]*"',
      \ '@\s*def\>[^\n{]*=\_s*{[^}]*}',
      \ '@\s*\%(def\|let\|assert\|print\|println\)\>[^\n]*',
      \ ], '\|') . '\)\+'

" True if the first statement of the buffer is one of a configuration or project.
function! qrex#IsSettings() abort
  return substitute(join(getline(1, 200), "\n"), s:ahead, '', '') =~# s:statement
endfunction

" The folder of the nearest *.qrex beside or above the file, or an empty text.
function! qrex#Root(file) abort
  let folder = fnamemodify(a:file, ':p:h')
  while 1
    if !empty(globpath(escape(folder, ',*?[]{}\ '), '*.qrex', 1, 1))
      return folder
    endif
    let above = fnamemodify(folder, ':h')
    if above ==# folder
      return ''
    endif
    let folder = above
  endwhile
endfunction
