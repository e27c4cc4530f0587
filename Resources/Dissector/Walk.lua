
do  -- Walk.lua: a packet's readings, as the decoders walk them. A packet is a table: `data`, its bytes
    -- as a string, `size`, `tvb` and `base`, where Wireshark has them, and `brief`, for the columns.

local function holds(condition, data, origins)
  if not condition then return true end
  local number = condition.place.read(data, origins)
  return number >= condition.lowest and number <= condition.highest
end

-- --- Items ----------------------------------------------------------------------------------------

local pastEnd = " (past the end)"

-- The item of a section, made when its first value is.
local function sectionItem(packet, section)
  local item = packet.sections[section]
  if not item then
    item = packet.tree:add(packet.tvb(packet.base, packet.size), section)
    packet.sections[section] = item
  end
  return item
end

local function addItem(packet, tree, field, range, text, number, mark)
  local label = field.title .. ": " .. text .. mark
  if number == nil then return tree:add(field.text or field.number, range, text, label) end
  if field.kind == "string" then return tree:add(field.number, range, text, label) end
  return tree:add(field.number, range, number, label)
end

-- A further place of a value: what it holds, below the value's item.
local function addPlaces(packet, item, value, raw, origins)
  for i = 2, #value.places do
    local range, isPast = kestro.rangeOfPlace(packet, value.places[i], origins)
    item:add(range, string.format("Place %d: %d%s", i, raw[i], isPast and pastEnd or ""))
  end
end

local function numbersAt(places, data, origins)
  local raw = {}
  for i = 1, #places do raw[i] = places[i].read(data, origins) end
  return raw
end

-- An array: the first number's item has the text of all, the others are below it.
local function addEach(packet, tree, value, raw, origins)
  local range, isPast = kestro.rangeOfPlaces(packet, value.places, origins)
  local field = value.field
  local item = addItem(packet, tree, field, range, table.concat(raw, ", "), raw[1],
                       isPast and pastEnd or "")
  for i = 2, #raw do
    local place, isPlacePast = kestro.rangeOfPlace(packet, value.places[i], origins)
    item:add(field.number, place, raw[i],
             string.format("Place %d: %d%s", i, raw[i], isPlacePast and pastEnd or ""))
  end
end

local function addShown(packet, tree, value, raw, origins, text, number)
  local range, isPast = kestro.rangeOfPlaces(packet, value.places, origins)
  local item = addItem(packet, tree, value.field, range, text, number, isPast and pastEnd or "")
  if #value.places > 1 then addPlaces(packet, item, value, raw, origins) end
end

-- A value at a position; `tree` is absent for one that is no record's. What is not shown, because its
-- condition fails or an earlier packet has it, has no item.
local function addValue(packet, tree, value, origins)
  if not value.field then return end
  local data = packet.data
  local raw = numbersAt(value.places, data, origins)
  local text, number
  if not holds(value.when, data, origins) then
    if not value.otherwise then return end
    text = value.otherwise
  elseif value.shown.kind == "each" then
    return addEach(packet, tree or sectionItem(packet, value.section), value, raw, origins)
  else
    text, number = value.shown.show(raw)
  end
  addShown(packet, tree or sectionItem(packet, value.section), value, raw, origins, text, number)
  if not tree then kestro.noteBrief(packet, value, text) end
end

-- --- Records --------------------------------------------------------------------------------------

local packetOrigins = {record = 0, packet = 0, twin = 0}

local function recordCount(table, data, origins)
  return table.count.read(data, origins) + (table.countAddend or 0)
end

local function addCount(packet, part, count)
  addValue(packet, nil, part.countValue, packetOrigins)
  kestro.noteCount(packet, part, count)
end

local function addRecord(packet, part, index, size, origins)
  local range = kestro.rangeOfBytes(packet, origins.record, size)
  local item = sectionItem(packet, part.section):add(range, part.list .. " " .. index)
  for _, value in ipairs(part.fields) do addValue(packet, item, value, origins) end
end

-- The index from which on a record is an error.
local function recordBound(part, data)
  if not part.boundsCount then return math.huge end
  return part.boundsCount.read(data, packetOrigins) + part.countAddend
end

local function walkTable(packet, part)
  local data = packet.data
  local count, bound = recordCount(part, data, packetOrigins), recordBound(part, data)
  addCount(packet, part, count)
  if part.keepsNone then return end
  local counted = part.counted.read(data, packetOrigins)
  local origins = {record = part.base + part.perCount * counted,
                   packet = 0,
                   twin = part.twinBase + part.twinPerCount * counted}
  for index = 0, math.min(count, bound) - 1 do
    if holds(part.keep, data, origins) then addRecord(packet, part, index, part.stride, origins) end
    origins.record = origins.record + part.stride
    origins.twin = origins.twin + part.twinStride
  end
end

local function walkSizedRecords(packet, part)
  local data, start = packet.data, packet.subPackets[part.subPacket]
  local shared = {record = start, packet = start, twin = start}
  local values = part.valueCount.read(data, shared)
  local size = part.fixedSize + part.sizePerValue * values
  local stride = math.ceil(size / part.alignment) * part.alignment
  for index = 0, part.count.read(data, shared) - 1 do
    local record = start + stride * index
    local origins = {record = record, packet = start, twin = record + part.shiftPerValue * values}
    addRecord(packet, part, index, stride, origins)
  end
end

-- --- Requirements ---------------------------------------------------------------------------------

local function endOfRecords(extent, data)
  local counted = extent.counted.read(data, packetOrigins)
  return extent.base + extent.perCount * counted +
      extent.stride * recordCount(extent, data, packetOrigins)
end

-- Where the first sub-packet with this identifier begins; nil when one before it reaches too far.
local function findSubPacket(packet, identifier)
  local layout, start = kestro.subPackets, kestro.subPackets.first
  for _ = 1, layout.count.read(packet.data, packetOrigins) do
    local origins = {record = start, packet = 0, twin = 0}
    local next = start + layout.size.read(packet.data, origins)
    if next >= packet.size + layout.overrun then return nil end
    if layout.identifier.read(packet.data, origins) == identifier then return start end
    start = next
  end
end

local meets = {}
function meets.minimumLength(packet, requirement) return packet.size >= requirement.length end
function meets.exactLength(packet, requirement) return packet.size == requirement.length end
function meets.holdsRecords(packet, requirement)
  return packet.size >= endOfRecords(requirement, packet.data)
end
function meets.endsWithRecords(packet, requirement)
  return packet.size == endOfRecords(requirement, packet.data)
end
function meets.number(packet, requirement)
  return holds(requirement.condition, packet.data, packetOrigins)
end
function meets.subPackets(packet, requirement)
  for _, identifier in ipairs(requirement.identifiers) do
    packet.subPackets[identifier] = findSubPacket(packet, identifier)
    if not packet.subPackets[identifier] then return false end
  end
  return true
end

local function isTaken(packet, reading)
  for _, requirement in ipairs(reading.requirements) do
    if not meets[requirement.kind](packet, requirement) then return false end
  end
  return true
end

-- --- Readings -------------------------------------------------------------------------------------

local walkers = {table = walkTable, sizedRecords = walkSizedRecords}

function walkers.value(packet, part)
  local subPackets = packet.subPackets
  local origins = packetOrigins
  if part.subPacket then
    origins = {record = subPackets[part.subPacket], packet = 0,
               twin = part.twinSubPacket and subPackets[part.twinSubPacket] or 0}
  end
  addValue(packet, nil, part, origins)
end

local function walkTaker(packet, readings)
  for _, reading in ipairs(readings) do
    if packet.size >= reading.minimumLength then
      if not isTaken(packet, reading) then return false end
      for _, part in ipairs(reading.parts) do walkers[part.part](packet, part) end
      return #reading.parts > 0
    end
  end
  return false
end

-- Shows what all takers read; whether that is anything.
function kestro.walk(packet, takers)
  packet.sections, packet.subPackets = {}, {}
  local isRead = false
  for _, readings in ipairs(takers) do
    if walkTaker(packet, readings) then isRead = true end
  end
  return isRead
end

-- --- Preparation ----------------------------------------------------------------------------------

-- Calls `visit` with every table inside a value that has this member.
local function forEachWith(member, value, visit)
  if type(value) ~= "table" then return end
  if rawget(value, member) ~= nil then visit(value) end
  for _, inner in pairs(value) do forEachWith(member, inner, visit) end
end

local function prepareValue(wanted, word, value)
  kestro.prepareRule(value.shown)
  if #value.places > 0 and (value.shown.show or value.shown.kind == "each") then
    kestro.wantField(wanted, word, value)
  end
end

-- The value that shows a table's count: with another number where one is added to it.
local function countValue(part)
  local shown = {kind = "hidden"}
  if part.countAddend > 0 then
    shown = {kind = "integer", format = "%d", scale = 1, offset = part.countAddend}
  end
  return {section = part.section, key = "count", places = {part.count}, shown = shown}
end

local function preparePart(wanted, word, part)
  if part.part == "value" then return prepareValue(wanted, word, part) end
  if part.part == "table" then
    part.countValue = countValue(part)
    prepareValue(wanted, word, part.countValue)
  end
  for _, field in ipairs(part.fields) do
    field.section = part.section
    prepareValue(wanted, word, field)
  end
end

-- Makes the places of a value ready, however deep they lie in it.
function kestro.preparePlaces(value)
  forEachWith("firstBit", value, kestro.preparePlace)
end

-- Makes the takers of a code ready; `wanted` gets their fields.
function kestro.prepare(wanted, word, takers)
  kestro.preparePlaces(takers)
  for _, readings in ipairs(takers) do
    for _, reading in ipairs(readings) do
      for _, part in ipairs(reading.parts) do preparePart(wanted, word, part) end
    end
  end
end

end
