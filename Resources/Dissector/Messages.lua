
do  -- Messages.lua: messages: prefix, header, contents, columns; and the registration of all.

-- --- Columns --------------------------------------------------------------------------------------

local briefNames = {
  ["Physical Cell ID"] = "PCI",
  ["Serving Physical Cell ID"] = "PCI",
  ["Measured RSRP"] = "RSRP",
  ["Serving Filtered RSRP"] = "RSRP",
  ["Cell ID"] = "cell",
  ["Cell Identity"] = "cell",
  ["ARFCN"] = "ARFCN",
  ["BSIC"] = "BSIC",
  ["RSSI"] = "RSSI",
  ["RR State"] = "state",
  ["MM State"] = "state",
  ["MM Service State"] = "state",
  ["State"] = "state",
  ["Service Type"] = "service",
  ["Serving Cell ID"] = "cell",
  ["Downlink UARFCN"] = "UARFCN",
  ["System ID"] = "system",
  ["Network ID"] = "network",
  ["Rx 0 AGC"] = "Rx AGC",
}
local maximumBrief = 3

local function note(notes, what, text)
  if #notes < maximumBrief then notes[#notes + 1] = what .. " " .. text end
end

-- Notes a value for the column Info.
function kestro.noteBrief(packet, value, text)
  local name = briefNames[value.key]
  if name and not packet.briefKeys[name] then
    packet.briefKeys[name] = true
    note(packet.brief, name, text)
  elseif value.shown.kind ~= "hidden" and value.key ~= "Version" and value.key ~= "count" then
    note(packet.others, value.key, text)
  end
end

-- Notes how many records there are. Several sections may read the same ones.
function kestro.noteCount(packet, part, count)
  if packet.briefKeys[part.list] then return end
  packet.briefKeys[part.list] = true
  note(packet.counts, part.list .. ":", string.format("%d", count))
end

local function infoOf(packet)
  for _, notes in ipairs({packet.brief, packet.others, packet.counts}) do
    if #notes > 0 then return table.concat(notes, ", ") end
  end
end

-- --- Header ---------------------------------------------------------------------------------------

local function headerFields(word, names)
  local function name(key) return kestro.fieldName(word, "header", key) end
  return {
    prefix = ProtoField.bytes(name("Prefix"), "Prefix"),
    type = ProtoField.uint8(name("Type"), "Type", base.HEX),
    length = ProtoField.uint16(name("Length"), "Length", base.DEC),
    code = ProtoField.uint24(name("Log code"), "Log code", base.HEX, names),
    time = ProtoField.absolute_time(name("Time"), "Time", base.UTC),
    remark = ProtoField.string(name("Remark"), "Remark"),
  }
end

local origins = {record = 0, packet = 0, twin = 0}

local function timeOf(data, offset)
  local microseconds = 0
  for i = 8, 1, -1 do microseconds = microseconds * 256 + (data:byte(offset + i) or 0) end
  return NSTime.new(math.min(math.floor(microseconds / 1e6), 2 ^ 53), microseconds % 1e6 * 1000)
end

local function codeText(code) return string.format("0x%04X", code) end

local function showHeader(technology, packet)
  local fields, header = technology.headerFields, kestro.header
  local item = packet.tree:add(kestro.rangeOfBytes(packet, 0, header.size), "Header")
  local function add(field, place, ...)
    item:add(field, kestro.rangeOfPlace(packet, place, origins), ...)
  end
  if packet.base > 0 then item:add(fields.prefix, packet.tvb(0, packet.base)) end
  add(fields.type, header.type, packet.type)
  add(fields.length, header.length, header.length.read(packet.data, origins))
  local name = packet.known and packet.known.name or ""
  add(fields.code, header.code, packet.code,
      "Log code: " .. codeText(packet.code) .. (name ~= "" and " " .. name or ""))
  item:add(fields.time, kestro.rangeOfBytes(packet, header.timeOffset, 8),
           timeOf(packet.data, header.timeOffset))
end

-- --- Contents -------------------------------------------------------------------------------------

-- A remark of fmt's form with one number in it.
local function filled(remark, number)
  remark = remark:gsub("{:02x}", function() return string.format("%02x", number) end)
  return (remark:gsub("{}", function() return string.format("%d", number) end))
end

-- Why nothing was read.
local function reasonForNothing(packet)
  local remarks, known = kestro.remarks, packet.known
  if packet.type ~= kestro.header.basebandType and packet.type ~= kestro.header.extraType then
    return filled(remarks.unknownType, packet.type)
  elseif not known then
    return remarks.unknownCode
  elseif known.name == "" then
    return remarks.unknownContents
  elseif packet.size < known.minimumLength then
    return filled(remarks.tooShort, known.minimumLength)
  end
  return remarks.noValue
end

local function showRemark(technology, packet, remark)
  packet.tree:add(technology.headerFields.remark, packet.tvb(packet.base), remark)
  return remark
end

local function isDropped(technology, packet)
  local isKnown =
      packet.type == kestro.header.basebandType or packet.type == kestro.header.extraType
  return technology.dropsUnknownTypes and not isKnown
end

-- Shows what a packet holds; returns what the column Info says of it.
local function showContents(technology, packet)
  if packet.type == kestro.header.extraType then
    return kestro.showPropertyList(technology.propertyListFields, packet.tvb,
                                   packet.base + kestro.header.size, packet.tree)
  end
  local isRead = packet.known and not isDropped(technology, packet) and
      kestro.walk(packet, packet.known.takers)
  if isRead then return infoOf(packet) end
  return showRemark(technology, packet, reasonForNothing(packet))
end

-- --- Messages -------------------------------------------------------------------------------------

local function packetOf(technology, tvb, tree)
  local header, size = kestro.header, tvb:len()
  local hasPrefix = size >= header.prefixSize and tvb(0, 1):uint() == header.prefixMark
  local base = hasPrefix and header.prefixSize or 0
  local packet = {tvb = tvb, base = base, size = size - base, tree = tree,
                  data = size > base and tvb:raw(base, size - base) or "",
                  brief = {}, others = {}, counts = {}, briefKeys = {}}
  packet.type = header.type.read(packet.data, origins)
  packet.code = header.code.read(packet.data, origins)
  if packet.type == header.extraType then packet.code = packet.code + header.extraCodes end
  packet.known = technology.known[packet.code]
  return packet
end

local function dissectPacket(technology, tvb, pinfo, tree)
  local packet = packetOf(technology, tvb, tree)
  if tvb:len() < kestro.header.size then
    pinfo.cols.info = showRemark(technology, packet, kestro.remarks.tooShortForAPacket)
    return
  end
  showHeader(technology, packet)
  local info = showContents(technology, packet)
  local name = packet.known and packet.known.name or ""
  local title = codeText(packet.code) .. (name ~= "" and " " .. name or "")
  pinfo.cols.info = info and title .. ": " .. info or title
end

local function dissectPropertyList(technology, tvb, pinfo, tree)
  pinfo.cols.info = kestro.showPropertyList(technology.propertyListFields, tvb, 0, tree)
end

-- --- Registration ---------------------------------------------------------------------------------

-- Makes a technology's codes ready; returns its fields.
local function prepareCodes(technology)
  local wanted, names = {}, {}
  technology.known = {}
  for _, code in ipairs(technology.codes) do
    technology.known[code.code] = code
    if code.name ~= "" then names[code.code] = code.name end
    kestro.prepare(wanted, technology.word, code.takers)
  end
  local fields = kestro.makeFields(wanted)
  technology.headerFields = headerFields(technology.word, names)
  for _, field in pairs(technology.headerFields) do fields[#fields + 1] = field end
  return fields
end

local function registerTechnology(technology)
  local proto = Proto("kestro." .. technology.word, "Kestro " .. technology.title)
  local fields = technology.codes and prepareCodes(technology) or {}
  technology.propertyListFields = kestro.propertyListFields(technology.word)
  for _, field in pairs(technology.propertyListFields) do fields[#fields + 1] = field end
  proto.fields = fields
  local dissect = technology.codes and dissectPacket or dissectPropertyList
  function proto.dissector(tvb, pinfo, tree)
    pinfo.cols.protocol = technology.title
    dissect(technology, tvb, pinfo, tree:add(proto, tvb()))
  end
  local encapsulations = wtap_encaps or wtap
  DissectorTable.get("wtap_encap"):add(encapsulations["USER" .. technology.linkType - 147], proto)
end

function kestro.register(technologies)
  kestro.preparePlaces(kestro.header)
  kestro.preparePlaces(kestro.subPackets)
  for _, technology in ipairs(technologies) do registerTechnology(technology) end
end

end
