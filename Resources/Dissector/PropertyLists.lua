
do  -- PropertyLists.lua: extra packets and the messages of IFX: text where they are XML, data where
    -- they are binary.

local maximumLines = 10000

function kestro.propertyListFields(word)
  return {text = ProtoField.string("kestro." .. word .. ".property_list.text", "Text"),
          line = ProtoField.string("kestro." .. word .. ".property_list.line", "Line"),
          data = ProtoField.bytes("kestro." .. word .. ".property_list.data", "Data")}
end

-- Whether the bytes are a text: no control characters but those of a text's lines.
local function isText(bytes)
  return bytes:sub(1, 6) ~= "bplist" and not bytes:find("[%z\1-\8\11\12\14-\31]")
end

local function addLines(item, field, tvb, base, text)
  local from, count = 1, 0
  while from <= #text do
    if count == maximumLines then
      item:add(tvb(base + from - 1), "(and more lines)")
      return
    end
    local to = text:find("\n", from, true) or #text + 1
    item:add_packet_field(field, tvb(base + from - 1, to - from), ENC_UTF_8)
    from, count = to + 1, count + 1
  end
end

-- Shows the list that begins at `base`; returns what the column Info says of it.
function kestro.showPropertyList(fields, tvb, base, tree)
  local size = tvb:len() - base
  if size <= 0 then return "no property list" end
  local bytes = tvb:raw(base, size)
  if not isText(bytes) then
    local item = tree:add(tvb(base), "Property list, binary")
    item:add(fields.data, tvb(base))
    return string.format("binary property list of %d bytes", size)
  end
  local item = tree:add(tvb(base), "Property list, XML")
  item:add_packet_field(fields.text, tvb(base), ENC_UTF_8)
  addLines(item, fields.line, tvb, base, bytes)
  return string.format("property list of %d bytes", size)
end

end
