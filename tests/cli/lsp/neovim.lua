-- Neovim as a client. This is its configuration, since Neovim 0.7 of Debian 12 has no option to run a script:
--   TARVIK=... EDITOR_FILES=... DATABASE=... nvim --headless -u neovim.lua
vim.opt.runtimepath:prepend(vim.env.EDITOR_FILES)
vim.cmd('filetype plugin on')
vim.cmd('syntax on')

local function fail(text)
  io.stderr:write(text .. '\n')
  vim.cmd('cquit 1')
end

local function expect(condition, text)
  if not condition then
    fail(text)
  end
end

local function wait(condition, text)
  expect(vim.wait(20000, condition, 10), 'never: ' .. text)
end

local function run()
  local directory = vim.env.DATABASE
  vim.cmd('edit ' .. directory .. '/kestrel.acd')
  expect(vim.bo.filetype == 'acd', 'the type of the file is ' .. vim.bo.filetype)
  local client = vim.lsp.start_client({ name = 'tarvik', cmd = { vim.env.TARVIK, 'lsp' }, root_dir = directory })
  vim.lsp.buf_attach_client(0, client)
  wait(function()
    return vim.lsp.buf_get_clients(0)[client] ~= nil and vim.lsp.buf_get_clients(0)[client].initialized
  end, 'initialized')

  -- A keystroke, its finding, and its fix.
  local line = vim.fn.search('^OPERATION')
  local before = vim.fn.getline(line)
  vim.fn.setline(line, (before:gsub('^OPERATION', 'OPERATOIN')))
  wait(function()
    local all = vim.diagnostic.get(0)
    return #all == 1 and all[1].code == 'K102'
  end, 'a finding')
  local function ask(method, params)
    local answers = vim.lsp.buf_request_sync(0, method, params, 20000)
    local answer = answers and answers[client]
    expect(answer and not answer.err, method .. ': ' .. vim.inspect(answer))
    return answer.result
  end
  vim.fn.cursor(line, 1)
  local params = vim.lsp.util.make_range_params()
  params.context = { diagnostics = {} }
  local actions = ask('textDocument/codeAction', params)
  vim.lsp.util.apply_workspace_edit(actions[1].edit, 'utf-16')
  expect(vim.fn.getline(line) == before, 'the fix made ' .. vim.fn.getline(line))
  wait(function()
    return #vim.diagnostic.get(0) == 0
  end, 'no finding')

  -- A name is renamed in files that are not open, too.
  vim.fn.cursor(vim.fn.search('^\\[KS50\\]'), 2)
  local hover = ask('textDocument/hover', vim.lsp.util.make_position_params())
  expect(hover.contents.value:find('device %*%*KS50'), 'hover: ' .. vim.inspect(hover))
  params = vim.lsp.util.make_position_params()
  params.newName = 'KS51'
  vim.lsp.util.apply_workspace_edit(ask('textDocument/rename', params), 'utf-16')
  wait(function()
    return vim.fn.search('^\\[KS51\\]') ~= 0 and #vim.diagnostic.get(nil) == 0
  end, 'no finding after the name was changed')
  vim.cmd('silent wall')

  -- The canonical form.
  vim.fn.append(0, 'PROPERTY=A,1')
  local edits = ask('textDocument/formatting', vim.lsp.util.make_formatting_params())
  vim.lsp.util.apply_text_edits(edits, 0, 'utf-16')
  expect(vim.fn.getline(1):find('PROPERTY%s+= A,1'), 'formatted: ' .. vim.fn.getline(1))

  -- Syntax: a header and a comment of the demonstration.
  local function group(pattern, column)
    return vim.fn.synIDattr(vim.fn.synID(vim.fn.search(pattern), column, 1), 'name')
  end
  expect(group('^\\[KS51\\]', 2) == 'acdName', 'a header is ' .. group('^\\[KS51\\]', 2))
  expect(group('^#', 1) == 'acdComment', 'a comment is ' .. group('^#', 1))
  expect(group('^OPERATION', 1) == 'acdKey', 'a key is ' .. group('^OPERATION', 1))
  for number = 1, vim.fn.line('$') do
    local name = vim.fn.synIDattr(vim.fn.synID(number, 1, 1), 'name')
    expect(name ~= 'acdMalformed', 'malformed: ' .. vim.fn.getline(number))
  end
  vim.lsp.stop_client(client)
  wait(function()
    return vim.lsp.client_is_stopped(client)
  end, 'the end of the server')
end

vim.schedule(function()
  local isDone, fault = pcall(run)
  if not isDone then
    fail(fault)
  end
  vim.cmd('qall!')
end)
