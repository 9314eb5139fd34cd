-- What a person does in Neovim with the language server, for scripts that take the place of init.lua, since Neovim 0.7 of
-- Debian 12 has no option to run a script.
vim.opt.runtimepath:prepend(vim.env.EDITOR_FILES)
vim.cmd('filetype plugin on')
vim.cmd('syntax on')
vim.opt.virtualedit = 'all'

local person = {}

local function fail(text)
  io.stderr:write(text .. '\n')
  vim.cmd('cquit 1')
end

function person.expect(condition, text)
  if not condition then
    fail(text)
  end
end

function person.wait(condition, text)
  person.expect(vim.wait(20000, condition, 10), 'never: ' .. text)
end

-- Opens a file of the database with the server, which is started for the first one.
function person.open(name)
  local directory = vim.env.DATABASE
  vim.cmd('silent edit ' .. directory .. '/' .. name)
  person.expect(vim.bo.filetype == 'acd', 'the type of the file is ' .. vim.bo.filetype)
  person.client = person.client
    or vim.lsp.start_client({ name = 'tarvik', cmd = { vim.env.TARVIK, 'lsp' }, root_dir = directory })
  vim.lsp.buf_attach_client(0, person.client)
  person.wait(function()
    local client = vim.lsp.buf_get_clients(0)[person.client]
    return client ~= nil and client.initialized
  end, 'initialized')
end

function person.ask(method, params)
  local answers = vim.lsp.buf_request_sync(0, method, params, 20000)
  local answer = answers and answers[person.client]
  person.expect(answer and not answer.err, method .. ': ' .. vim.inspect(answer))
  return answer.result
end

-- The actions for lines of the file; of all lines without a number.
function person.actions(line)
  local params = vim.lsp.util.make_range_params()
  params.range['start'] = { line = (line or 1) - 1, character = 0 }
  params.range['end'] = { line = line or vim.fn.line('$'), character = 0 }
  params.context = { diagnostics = {} }
  return person.ask('textDocument/codeAction', params)
end

function person.waitForFindings(codes)
  local found
  person.expect(vim.wait(20000, function()
    found = {}
    for _, diagnostic in ipairs(vim.diagnostic.get(nil)) do
      table.insert(found, diagnostic.code)
    end
    table.sort(found)
    return vim.deep_equal(found, codes)
  end, 10), 'the findings are ' .. table.concat(found, ' ') .. ', not ' .. table.concat(codes, ' '))
end

function person.hover(pattern)
  vim.fn.cursor(1, 1)
  vim.fn.search(pattern, 'cW')
  local hover = person.ask('textDocument/hover', vim.lsp.util.make_position_params())
  return hover and hover.contents.value or ''
end

function person.rename(pattern, name)
  vim.fn.cursor(1, 1)
  vim.fn.search(pattern, 'cW')
  local params = vim.lsp.util.make_position_params()
  params.newName = name
  vim.lsp.util.apply_workspace_edit(person.ask('textDocument/rename', params), 'utf-16')
end

function person.format()
  local edits = person.ask('textDocument/formatting', vim.lsp.util.make_formatting_params())
  vim.lsp.util.apply_text_edits(edits, 0, 'utf-16')
end

-- Runs what a person does, and stops the server.
function person.run(steps)
  vim.schedule(function()
    local isDone, fault = pcall(function()
      steps()
      vim.lsp.stop_client(person.client)
      person.wait(function()
        return vim.lsp.client_is_stopped(person.client)
      end, 'the end of the server')
    end)
    if not isDone then
      fail(fault)
    end
    vim.cmd('qall!')
  end)
end

return person
