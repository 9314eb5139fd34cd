-- A family of ten devices written from nothing in Neovim: <typed|label> is typed, then completed by that item.
local person = dofile(vim.env.CLIENT)
local expect = person.expect

local function toEnd()
  local line = vim.fn.line('$')
  vim.api.nvim_win_set_cursor(0, { line, #vim.fn.getline(line) })
end

local function put(text)
  local line = vim.fn.line('$')
  local column = #vim.fn.getline(line)
  vim.api.nvim_buf_set_text(0, line - 1, column, line - 1, column, vim.split(text, '\n'))
  toEnd()
end

local function complete(label)
  toEnd()
  local labels = {}
  for _, item in ipairs(person.ask('textDocument/completion', vim.lsp.util.make_position_params()).items) do
    if item.label == label then
      vim.lsp.util.apply_text_edits({ item.textEdit }, 0, 'utf-16')
      return
    end
    table.insert(labels, item.label)
  end
  expect(false, string.format('after %q there is %s, not %q', vim.fn.getline('$'), table.concat(labels, ' '), label))
end

local function write(text)
  local rest = 1
  for before, typed, label, after in text:gmatch('([^<]*)<([^|]*)|([^>]*)>()') do
    put(before .. typed)
    complete(label)
    rest = after
  end
  put(text:sub(rest))
end

person.run(function()
  -- The base database, whose first fix makes its two lists.
  person.open('base.acd')
  person.waitForFindings({ 'B104' })
  vim.lsp.util.apply_workspace_edit(person.actions()[1].edit, 'utf-16')
  write('<B|BS><o|outputs>,<P|PARALLEL>,<U|USB2>:<f|families>\n<S|SM><|outputs>,<|USB2>:<|families>\n')
  write('<I|IDCODE>SW10,0xX9001FB7')
  for number = 2, 9 do
    write(string.format(':SW%d0,0xX90%d1FB7', number, number))
  end
  write(':SW100,0xX90A1FB7\n')

  -- The family: its tables and properties, then its devices.
  person.open('sparrow.acd')
  write([[
<OP|OPERATION><PROGRAM|PROGRAM>,<B|Bscan>,<P|PARALLEL>,<U|USB2>: \
  <PROG|PROGRAM>,<Sm|Smap>,<U|USB2>:<VER|VERIFY>,<|Bscan>,<|PARALLEL>,<|USB2>
<BSD|BSDL_OPERATION><BYP|BYPASS>,<|PARALLEL>,<|USB2>
<PROGRAM_O|PROGRAM_OPTION><|ERASE>,<|Bscan>,<|PARALLEL>,<|USB2>:<V|VERIFY>,<|Bscan>,<|USB2>
<PROPERT|PROPERTY>VENDOR,Acme:IRLENGTH,6
<PROPERTI|PROPERTIES><PROGRAM|PROGRAM>,2,<|BS>,<|SM>:<VER|VERIFY>,1,<|BS>:<OP_PROGRAM|OP_PROGRAM>,1,<E|ERASE>
]])
  for number = 1, 10 do
    write(string.format('\n[<|SW%d0>]\n', number))
    if number == 1 then
      write('PROPERTY = PINS,100:FLASH,TRUE\n<PROPERTIES|PROPERTIES><PAC|PACKAGES>,2,TQ100,PQ208\n')
    else
      write(string.format('<PROPERTY|PROPERTY><PI|PINS>,%d:<FL|FLASH>,<|TRUE>\n', 90 + 10 * number))
      write('<PROPERTIES|PROPERTIES><PAC|PACKAGES>,2,<TQ|TQ100>,<PQ|PQ208>\n')
    end
  end
  person.waitForFindings({ 'B104', 'T112', 'T112' })
  local listing = person.actions(1)[1]
  expect(listing.title == 'B104: insert ",sparrow" in base.acd (a guess)', listing.title)
  vim.lsp.util.apply_workspace_edit(listing.edit, 'utf-16')
  person.waitForFindings({})

  -- A device with options of its own, and a part that is excluded.
  vim.fn.append(vim.fn.search('^\\[SW90\\]'), 'PROGRAM_OPTION = ERASE,Bscan,USB2')
  person.waitForFindings({ 'K202' })
  vim.lsp.util.apply_workspace_edit(person.actions()[1].edit, 'utf-16')
  person.waitForFindings({})
  person.open('base.acd')
  write('<NOT|NOT_SUPPORTED_PART_IN_MODE><SM|SM_><SW2|SM_SW20_><T|SM_SW20_TQ100>\n')
  person.waitForFindings({})

  -- Flashes, and a chain with one of the devices.
  person.open('spi.acd')
  person.waitForFindings({ 'B104' })
  vim.lsp.util.apply_workspace_edit(person.actions()[1].edit, 'utf-16')
  write('<DEV|DEVICE_FAMILY><A|AT1>\n<AT1_D|AT1_DEVICES>OV1,OV2\n<AT1_P|AT1_PROPERTY>VENDOR,Acme:BUS,SPI\n')
  write('<OV1|OV1_PROPERTY>DENSITY,1024:PACKAGE,SO8\n<OV2|OV2_PROPERTY><D|DENSITY>,2048:<P|PACKAGE>,<S|SO8>\n')
  write('<TYPE_MB_SPI_NONE_L|TYPE_MB_SPI_NONE_LEAD><|OV1>,<SW1|SW10>\n')
  person.waitForFindings({})

  -- What the editor says about it, a rename, and the canonical form.
  person.open('sparrow.acd')
  local hover = person.hover('PINS,120')
  expect(hover:find('In force: `PINS,120` of SW30'), hover)
  hover = person.hover('SW100\\]')
  expect(hover:find('packages TQ100, PQ208; IDCODE `0xX90A1FB7`'), hover)
  person.rename('SW100\\]', 'SW110')
  vim.cmd('bufdo normal! gg')
  for _, name in ipairs({ 'base.acd', 'spi.acd', 'sparrow.acd' }) do
    person.open(name)
    person.format()
  end
  person.waitForFindings({})
  vim.cmd('silent wall')
end)
