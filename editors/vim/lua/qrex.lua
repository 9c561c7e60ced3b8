-- The language server in Neovim, 0.7.2 or later: require('qrex').setup{}.
local M = {}

local settings = { cmd = { 'qrex-lsp' } }
local clients = {} -- of each folder, where vim.lsp.start does not keep them
local attached = {} -- the client of each buffer
local generated = {} -- what is shown of each source: its URI, and the buffer with the text

local function send(bufnr, method, params, handler)
  local client = vim.lsp.get_client_by_id(attached[bufnr] or -1)
  if not client then return false end
  if vim.fn.has('nvim-0.11') == 1 then
    client:request(method, params, handler, bufnr)
  else
    client.request(method, params, handler, bufnr)
  end
  return true
end

local function write(bufnr, text)
  vim.bo[bufnr].modifiable = true
  vim.api.nvim_buf_set_lines(bufnr, 0, -1, false, vim.split(text:gsub('\r\n', '\n'), '\n'))
  vim.bo[bufnr].modifiable = false
  vim.bo[bufnr].modified = false
end

local function follow(_, changed)
  local bufnr = generated[changed.uri]
  if bufnr and vim.api.nvim_buf_is_valid(bufnr) then write(bufnr, changed.text) end
end

local function on_attach(client, bufnr)
  attached[bufnr] = client.id
  if vim.fn.has('nvim-0.8') == 0 then -- later ones set these themselves
    vim.bo[bufnr].omnifunc = 'v:lua.vim.lsp.omnifunc'
    vim.bo[bufnr].tagfunc = 'v:lua.vim.lsp.tagfunc'
  end
  if settings.on_attach then settings.on_attach(client, bufnr) end
end

local function configuration_of(root)
  return {
    name = 'qrex',
    cmd = settings.cmd,
    root_dir = root,
    workspace_folders = { { uri = vim.uri_from_fname(root), name = vim.fn.fnamemodify(root, ':t') } },
    capabilities = settings.capabilities,
    init_options = vim.tbl_extend('force', vim.empty_dict(), {
      configuration = settings.configuration,
      arguments = settings.arguments,
      clangd = settings.clangd,
    }),
    handlers = { ['qrex/generatedChanged'] = follow },
    on_attach = on_attach,
    get_language_id = function(_, filetype) return filetype end,
  }
end

-- Starts the server of the workspace that the buffer belongs to, or joins the one that runs.
function M.start(bufnr)
  local file = vim.api.nvim_buf_get_name(bufnr)
  if file == '' or vim.bo[bufnr].buftype ~= '' then return end
  local root = vim.fn['qrex#Root'](file)
  if root == '' then return end
  local configuration = configuration_of(root)
  if vim.lsp.start then
    vim.lsp.start(configuration, { bufnr = bufnr })
    return
  end
  if not clients[root] or not vim.lsp.get_client_by_id(clients[root]) then
    configuration.on_exit = function() clients[root] = nil end
    clients[root] = vim.lsp.start_client(configuration)
  end
  if clients[root] then vim.lsp.buf_attach_client(bufnr, clients[root]) end
end

-- Opens the C++ that the source in this window becomes beside it.
function M.show_generated()
  local source = vim.api.nvim_get_current_buf()
  local uri = vim.uri_from_bufnr(source)
  local function show(failed, answer)
    if failed or not answer or answer == vim.NIL then
      vim.notify(failed and failed.message or 'There is no generated text of this file', vim.log.levels.ERROR)
      return
    end
    local bufnr = generated[uri]
    if not bufnr or not vim.api.nvim_buf_is_valid(bufnr) then
      bufnr = vim.api.nvim_create_buf(false, true)
      vim.api.nvim_buf_set_name(bufnr, vim.uri_to_fname(uri) .. ' (generated)')
      vim.bo[bufnr].bufhidden = 'wipe'
      vim.bo[bufnr].syntax = answer.languageId -- not its type, at which servers of C++ would begin to read it
      generated[uri] = bufnr
      vim.api.nvim_create_autocmd('BufWipeout', {
        buffer = bufnr,
        callback = function()
          generated[uri] = nil
          send(source, 'workspace/executeCommand', { command = 'qrex.hideGenerated', arguments = { uri } }, function() end)
        end,
      })
    end
    write(bufnr, answer.text)
    if vim.fn.bufwinid(bufnr) == -1 then
      vim.cmd('vertical sbuffer ' .. bufnr)
      vim.cmd('wincmd p')
    end
  end
  if not send(source, 'workspace/executeCommand', { command = 'qrex.showGenerated', arguments = { uri } }, show) then
    vim.notify('No qrex-lsp serves this file', vim.log.levels.ERROR)
  end
end

-- OPTIONS: cmd = { 'qrex-lsp' }, configuration = 'PATH', arguments = { 'LINE', ... }, clangd = 'PATH', on_attach, capabilities.
function M.setup(options)
  settings = vim.tbl_extend('force', settings, options or {})
  local group = vim.api.nvim_create_augroup('qrex', {})
  vim.api.nvim_create_autocmd('FileType', {
    group = group,
    pattern = { 'c', 'cpp', 'qrex' },
    callback = function(event) M.start(event.buf) end,
  })
  vim.api.nvim_create_user_command('QrexShowGenerated', M.show_generated, {})
  -- What has been opened already.
  for _, bufnr in ipairs(vim.api.nvim_list_bufs()) do
    if vim.tbl_contains({ 'c', 'cpp', 'qrex' }, vim.bo[bufnr].filetype) then M.start(bufnr) end
  end
end

return M
