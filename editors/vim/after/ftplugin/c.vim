" C++ reads this, too: `gf`, `[i` and their like go through @import as they do through #include.
setlocal include=^\\s*\\%(#\\s*include\\\|@\\s*import\\)
let b:undo_ftplugin = get(b:, 'undo_ftplugin', 'execute') . ' | setlocal include<'
