
do  -- Places.lua: from a packet's bytes to numbers. What lies past its end reads as 0.

local byte, floor, min = string.byte, math.floor, math.min

local function wordOf(bigEndian, a, b, c, d)
  if not bigEndian then
    return (a or 0) + (b or 0) * 0x100 + (c or 0) * 0x10000 + (d or 0) * 0x1000000
  end
  return (a or 0) * 0x1000000 + (b or 0) * 0x10000 + (c or 0) * 0x100 + (d or 0)
end

-- Makes a place ready: `read(data, origins)` is its number, `origins` being the offsets that
-- "record", "packet" and "twin" stand for.
function kestro.preparePlace(place)
  local offset, width, origin = place.offset, place.width, place.origin
  local bigEndian, signed = place.order == "big", place.signed
  local divisor, range = 2 ^ place.firstBit, 2 ^ place.bits
  if bigEndian then divisor = divisor * 2 ^ (8 * (4 - width)) end
  function place.read(data, origins)
    local from = origins[origin] + offset
    local word = wordOf(bigEndian, byte(data, from + 1, from + width))
    local number = floor(word / divisor) % range
    if signed and number >= range / 2 then number = number - range end
    return number
  end
  return place
end

-- The bytes from `first` up to `last`, less those past the end; and whether there are some of these.
local function clipped(packet, first, last)
  local size = packet.size
  return packet.tvb(packet.base + min(first, size), min(last, size) - min(first, size)),
      last > size
end

function kestro.rangeOfPlace(packet, place, origins)
  local first = origins[place.origin] + place.offset
  return clipped(packet, first, first + place.width)
end

-- From the first to the last byte of all places.
function kestro.rangeOfPlaces(packet, places, origins)
  local first, last
  for _, place in ipairs(places) do
    local from = origins[place.origin] + place.offset
    if not first or from < first then first = from end
    if not last or from + place.width > last then last = from + place.width end
  end
  return clipped(packet, first, last)
end

function kestro.rangeOfBytes(packet, first, size)
  return clipped(packet, first, first + size)
end

end
