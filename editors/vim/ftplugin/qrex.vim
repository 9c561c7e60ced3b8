if exists('b:did_ftplugin')
  finish
endif
let b:did_ftplugin = 1

setlocal commentstring=//\ %s comments=s1:/*,mb:*,ex:*/,://
setlocal formatoptions-=t formatoptions+=croql
setlocal include=^\\s*@\\s*import suffixesadd=.qrpj,.qrws,.inc
setlocal cindent cinoptions+=L0
let b:undo_ftplugin = 'setlocal commentstring< comments< formatoptions< include< suffixesadd< cindent< cinoptions<'
