-- examples/tour with the settings of the file that QREX_SETTINGS names, qrex-lsp and clangd: types an error, completes, follows a
-- generated function to its declaration, renames. Prints what happened, a line for each step.
local function say(...) io.stdout:write(table.concat({ ... }, ' '), '\n') end
local function wait(what, holds)
  if not vim.wait(120000, holds, 50) then
    say('not in time:', what)
    vim.cmd('cquit')
  end
end
local function line_of(text)
  for number, line in ipairs(vim.api.nvim_buf_get_lines(0, 0, -1, false)) do
    if line:find(text, 1, true) then return number end
  end
  say('no such line:', text)
  vim.cmd('cquit')
end
local function go_to(text, word)
  local number = line_of(text)
  vim.fn.cursor(number, vim.fn.getline(number):find(word, 1, true))
end
local function replace(text, new)
  local number = line_of(text)
  local line = vim.fn.getline(number)
  local first, last = line:find(text, 1, true)
  vim.fn.setline(number, line:sub(1, first - 1) .. new .. line:sub(last + 1))
end
local function ask(method, more)
  local params = vim.tbl_extend('force', vim.lsp.util.make_position_params(0), more or {})
  local answers = vim.lsp.buf_request_sync(0, method, params, 120000) or {}
  for _, answer in pairs(answers) do return answer.result end
end
local function errors()
  return vim.diagnostic.get(0, { severity = vim.diagnostic.severity.ERROR })
end

dofile(os.getenv('QREX_SETTINGS'))
vim.cmd('edit tree/app/src/shop.h')
wait('a client', function() return #vim.lsp.buf_get_clients(0) == 1 end)
replace('$dep float64 subtotal', '$dep flaot64 subtotal')
wait('an error', function() return #errors() > 0 end)
say('error:', vim.fn.getline(errors()[1].lnum + 1):match('^%s*(.-)%s*$'))
replace('flaot64', 'float64')
wait('no error', function() return #errors() == 0 end)

vim.cmd('edit! tree/app/src/app.cpp')
go_to('orders::Order order;', 'orders')
vim.fn.append(vim.fn.line('.'), '    order.')
vim.fn.cursor(vim.fn.line('.') + 1, 10)
vim.o.virtualedit = 'onemore' -- a place behind the last character
local names = {}
wait('completion', function()
  vim.fn.cursor(vim.fn.line('.'), 11)
  local list = ask('textDocument/completion') or {}
  for _, item in ipairs(list.items or list) do names[vim.trim(item.label)] = true end
  return names['Getpieces() const'] ~= nil
end)
say('completes: Getpieces')
vim.fn.setline(vim.fn.line('.'), '    order.Getpieces();')
go_to('order.Getpieces', 'Getpieces')
local places
wait('a definition', function()
  places = ask('textDocument/definition')
  return places and #places > 0
end)
vim.lsp.util.jump_to_location(places[1], vim.lsp.get_active_clients()[1].offset_encoding)
say('leads to:', vim.fn.fnamemodify(vim.api.nvim_buf_get_name(0), ':t'), vim.fn.getline('.'):match('^%s*(.-)%s*$'))

vim.cmd('edit! tree/app/src/app.cpp')
go_to('orders1::Order old;', 'old')
local edit = ask('textDocument/rename', { newName = 'first_release' })
vim.lsp.util.apply_workspace_edit(edit, vim.lsp.get_active_clients()[1].offset_encoding)
say('renamed:', vim.fn.getline(line_of('orders1::Order first_release')):match('^%s*(.-)%s*$'))
vim.cmd('qall!')
