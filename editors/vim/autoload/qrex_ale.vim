" The language server for ALE. Each file below ale_linters says its language.

function! qrex_ale#Define(language) abort
  call ale#linter#Define(a:language, {
        \ 'name': 'qrex',
        \ 'lsp': 'stdio',
        \ 'executable': {buffer -> get(g:, 'qrex_lsp', 'qrex-lsp')},
        \ 'command': '%e',
        \ 'language': a:language,
        \ 'project_root': {buffer -> qrex#Root(bufname(buffer))},
        \ 'initialization_options': {buffer -> get(g:, 'qrex_options', {})},
        \ })
endfunction
