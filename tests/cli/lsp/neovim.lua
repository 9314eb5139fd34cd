-- Neovim as a client, on a copy of the demonstration. neovim.sh starts it.
local person = dofile(vim.env.CLIENT)
local expect = person.expect

person.run(function()
  person.open('kestrel.acd')

  -- A keystroke, its finding, and its fix.
  local line = vim.fn.search('^OPERATION')
  local before = vim.fn.getline(line)
  vim.fn.setline(line, (before:gsub('^OPERATION', 'OPERATOIN')))
  person.waitForFindings({ 'K102' })
  vim.lsp.util.apply_workspace_edit(person.actions(line)[1].edit, 'utf-16')
  expect(vim.fn.getline(line) == before, 'the fix made ' .. vim.fn.getline(line))
  person.waitForFindings({})

  -- A name is renamed in files that are not open, too.
  local hover = person.hover('KS50\\]')
  expect(hover:find('device %*%*KS50'), 'hover: ' .. hover)
  person.rename('KS50\\]', 'KS51')
  person.wait(function()
    return vim.fn.search('^\\[KS51\\]') ~= 0 and #vim.diagnostic.get(nil) == 0
  end, 'no finding after the name was changed')
  vim.cmd('silent wall')

  -- The canonical form.
  vim.fn.append(0, 'PROPERTY=A,1')
  person.format()
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
end)
