-- A session with the settings of the file that QREX_SETTINGS names; prints what happened, a line for each step.
local function say(...) io.stdout:write(table.concat({ ... }, ' '), '\n') end
local function wait(what, holds)
  if not vim.wait(10000, holds, 20) then
    say('not within 10 seconds:', what)
    vim.cmd('cquit')
  end
end
-- Neovim of today keeps clients itself; this is what setup makes of it there.
if os.getenv('QREX_NEWER') then
  vim.lsp.start = function(configuration, options)
    say('vim.lsp.start', configuration.name, vim.fn.fnamemodify(configuration.root_dir, ':t'))
    local id = vim.g.test_client or vim.lsp.start_client(configuration)
    vim.g.test_client = id
    vim.lsp.buf_attach_client(options.bufnr, id)
    return id
  end
end

dofile(os.getenv('QREX_SETTINGS'))
vim.cmd('edit src/a.cpp')
local source = vim.api.nvim_get_current_buf()
wait('an error', function() return #vim.diagnostic.get(source) == 1 end)
say('error', vim.diagnostic.get(source)[1].message)
say('mapped', tostring(vim.fn.maparg('gd', 'n') ~= ''), vim.bo.omnifunc)

vim.cmd('QrexShowGenerated')
wait('generated text', function() return #vim.api.nvim_list_wins() == 2 end)
local shown
for _, window in ipairs(vim.api.nvim_list_wins()) do
  local bufnr = vim.api.nvim_win_get_buf(window)
  if bufnr ~= source then shown = bufnr end
end
local function text() return table.concat(vim.api.nvim_buf_get_lines(shown, 0, -1, false), '|') end
say('shown', text(), vim.bo[shown].syntax, tostring(vim.bo[shown].modifiable))
vim.api.nvim_buf_set_lines(source, 0, -1, false, { 'int second;' })
wait('what follows', function() return text():find('SECOND') ~= nil end)
say('follows', text())

vim.cmd('edit! common.inc')
wait('a second file', function() return #vim.diagnostic.get(0) == 1 end)
say('error', vim.diagnostic.get(0)[1].message)

local client = vim.lsp.get_active_clients()
say('clients', tostring(#client))
local function state() return client[1].request_sync('workspace/executeCommand', { command = 'test.state' }, 5000).result end
local started = state().started
say('options', vim.fn.json_encode(started.options), 'arguments', vim.fn.json_encode(started.arguments))
say('shown there', tostring(#state().shown))
vim.cmd('bwipeout ' .. shown)
wait('the end of it', function() return #state().shown == 0 end)

vim.cmd('edit ' .. os.getenv('QREX_ELSEWHERE'))
vim.wait(100)
say('elsewhere', vim.bo.filetype, tostring(#vim.lsp.buf_get_clients(0)))
vim.cmd('qall!')
