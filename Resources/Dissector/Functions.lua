-- SPDX-License-Identifier: MIT
-- A dissector for Wireshark: shows every value that Kestro takes from a baseband's packets.
-- `kestro-cli codes --format=lua` puts the tables of the packets behind these walkers of them.

local kestro = {}

do  -- Functions.lua: values that no rule makes, by the names that the decoders give them. Each gets
    -- the raw values of its field's places, in their order.

-- Numbers that are shown by the field's rule.
kestro.numbers = {}

function kestro.numbers.numberOfDigits(raw)
  return raw[1] * 100 + raw[2] * 10 + raw[3]
end

local function ecno(linear)
  if linear >= kestro.ecnoTable.ceiling then return 0 end
  for _, row in ipairs(kestro.ecnoTable.rows) do
    if linear > row.above then return row.decibels end
  end
  return 0
end

local function firstEnergy(raw, from)
  for i = from, #raw do
    if raw[i] ~= 0 then return ecno(raw[i]) end
  end
  return ecno(0)
end

function kestro.numbers.energyPerChip(raw)
  return firstEnergy(raw, 1)
end

-- A division of whole numbers, whose fraction is dropped towards 0.
local function quotient(dividend, divisor)
  local result = dividend / divisor
  return result < 0 and math.ceil(result) or math.floor(result)
end

function kestro.numbers.receivedCodePower(raw)
  return quotient(raw[1] + 512, 10) - 106 + firstEnergy(raw, 2)
end

-- Texts, each with the number that it shows, if it shows one. `isNumber` says of which functions
-- that may be.
kestro.texts = {}
kestro.isNumber = {writeEnergy = true, writeIdentity = true, energyText = true}

local function inDecibels(ratio)
  local decibels = 10 * math.log(ratio, 10)
  return kestro.printf("%+.2f dB", decibels), decibels
end

function kestro.texts.writeEnergy(raw)
  return inDecibels(raw[1] / 512)
end

function kestro.texts.writeDigits(raw)
  local digits = {}
  for i, digit in ipairs(raw) do digits[i] = string.format("%d", digit) end
  return table.concat(digits)
end

function kestro.texts.writeIdentity(raw)
  local systemType, identity = raw[1], raw[2]
  if systemType == 2 then return string.format("%d", identity), identity end
  if systemType >= 2 ^ 31 then systemType = systemType - 2 ^ 32 end
  return string.format("(unknown system type %d)", systemType)
end

-- From a pilot's accumulated energy and PN offset, and what all pilots share.
function kestro.texts.energyText(raw)
  local sum, pnOffset, length, factor, exponent, reference =
      raw[1], raw[2], raw[3], raw[4], raw[5], raw[6]
  local energy = 2 ^ (2 * exponent - 3) * sum / (9 * length * length * factor) - 1 / length
  if not (energy >= 0.00001) then energy = 0.00001 end
  local text, decibels = inDecibels(energy)
  if pnOffset == reference then text = "(ref pilot) " .. text end
  return text, decibels
end

end
