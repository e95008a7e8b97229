-- A session of Neovim without a screen: it opens a file, breaks it, sees the diagnostics, mends it,
-- and renames a name. Given: the file, the settings, and where to write what was seen.

local file, report = vim.env.EDITED_FILE, vim.env.EDITOR_REPORT
local seen = {}

local function wait(what, condition)
  if not vim.wait(20000, condition, 20) then
    error('waited in vain: ' .. what)
  end
end

local function diagnostics()
  return vim.tbl_map(function(one)
    return { one.lnum, one.col, one.code, one.message }
  end, vim.diagnostic.get(0))
end

local function session()
  vim.cmd('luafile ' .. vim.fn.fnameescape(vim.env.EDITOR_SETTINGS))
  vim.cmd('edit ' .. vim.fn.fnameescape(file))
  local client
  wait('the server', function()
    client = (vim.lsp.get_clients or vim.lsp.get_active_clients)()[1]
    return client and client.initialized and vim.lsp.buf_is_attached(0, client.id)
  end)

  vim.api.nvim_buf_set_lines(0, 3, 3, false, { 'broken = (1' })
  wait('a problem', function() return #diagnostics() == 1 end)
  seen.broken = diagnostics()
  vim.api.nvim_buf_set_text(0, 3, 11, 3, 11, { ')' })
  wait('no problem', function() return #diagnostics() == 0 end)

  vim.api.nvim_win_set_cursor(0, { 1, 4 })
  vim.lsp.buf.rename('circle')
  wait('the rename', function()
    return vim.api.nvim_buf_get_lines(0, 0, 1, false)[1]:find('circle') ~= nil
  end)
  seen.rows = vim.api.nvim_buf_get_lines(0, 0, -1, false)
  vim.cmd('write')
  vim.lsp.stop_client(client.id)
end

local done, message = pcall(session)
seen.failure = not done and tostring(message) or nil
vim.fn.writefile({ vim.fn.json_encode(seen) }, report)
vim.cmd('qall!')
