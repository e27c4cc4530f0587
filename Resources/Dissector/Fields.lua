
do  -- Fields.lua: Wireshark's fields, one for each name. Values of one name share a field, though they
    -- may come from several packets.

-- Lower case; every run of other characters is one "_".
local function part(text)
  return (text:lower():gsub("[^a-z0-9]+", "_"))
end

function kestro.fieldName(word, section, key)
  return "kestro." .. word .. "." .. part(section) .. "." .. part(key)
end

-- The kind that holds the numbers of both.
local function common(one, other)
  if one == nil or one == other then return other end
  if one == "string" or other == "string" then return "string" end
  if one == "double" or other == "double" then return "double" end
  return "int64"
end

local function addNames(wanted, shown)
  wanted.texts = wanted.texts or {}
  for _, name in ipairs(shown.names) do
    local known = wanted.texts[name.value]
    if known ~= nil and known ~= name.text then wanted.contradicts = true end
    wanted.texts[name.value] = name.text
  end
end

local function addUnit(wanted, unit)
  if wanted.unit ~= nil and wanted.unit ~= unit then wanted.contradicts = true end
  wanted.unit = unit
end

-- Notes in `wanted`, by name, what the field must hold.
function kestro.wantField(wanted, word, value)
  local name = kestro.fieldName(word, value.section, value.key)
  local field = wanted[name]
  if not field then
    field = {name = name, title = value.key}
    wanted[name] = field
    wanted[#wanted + 1] = field
  end
  field.kind = common(field.kind, kestro.numberKind(value.shown, value.places[1]))
  field.mayLackNumber = field.mayLackNumber or kestro.mayLackNumber(value)
  if value.shown.names and #value.shown.names > 0 then addNames(field, value.shown) end
  addUnit(field, value.shown.unit or "")
  value.field = field
end

local makers = {}

function makers.string(name, title) return ProtoField.string(name, title) end

local function integerMaker(make)
  return function(name, title, wanted)
    if wanted.contradicts then return make(name, title, base.DEC) end
    if wanted.texts then return make(name, title, base.DEC, wanted.texts) end
    if wanted.unit == "" then return make(name, title, base.DEC) end
    return make(name, title, base.UNIT_STRING, {" " .. wanted.unit})
  end
end
makers.int = integerMaker(ProtoField.int32)
makers.uint = integerMaker(ProtoField.uint32)
function makers.int64(name, title) return ProtoField.int64(name, title, base.DEC) end
function makers.double(name, title) return ProtoField.double(name, title) end

-- Makes the fields; returns all of them.
function kestro.makeFields(wanted)
  local all = {}
  for _, field in ipairs(wanted) do
    field.number = makers[field.kind](field.name, field.title, field)
    all[#all + 1] = field.number
    if field.kind == "string" then
      field.text = field.number
    elseif field.mayLackNumber then
      field.text = ProtoField.string(field.name .. ".text", field.title)
      all[#all + 1] = field.text
    end
  end
  return all
end

end
