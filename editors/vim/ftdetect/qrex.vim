autocmd BufNewFile,BufRead *.qrex,*.qrws,*.qrpj setfiletype qrex
" Files of this name are of many languages: ours are told by their first statement.
autocmd BufNewFile,BufRead *.inc if qrex#IsSettings() | set filetype=qrex | endif
