
do  -- Texts.lua: from raw values to what is shown. A prepared rule has `show(raw)`, which returns the
    -- text and, if that shows a number, the number.

local floor = math.floor

-- Like C's, with a point whatever the locale.
function kestro.printf(format, number)
  local text = string.format(format, number)
  return (text:gsub(",", "."))
end

-- The number's low 32 bits, as the conversion takes them.
local function wrapped(number, conversion)
  number = number % 2 ^ 32
  if conversion == "d" and number >= 2 ^ 31 then number = number - 2 ^ 32 end
  return number
end

-- Prepares a format with one conversion: a function from numbers to texts and to what they show.
local function formatter(format)
  local conversion = format:match("%%[+%d.]*([duxf])")
  if conversion == "f" then
    return function(number) return kestro.printf(format, number), number end
  end
  local known = format:gsub("(%%[+%d.]*)u", "%1d")
  return function(number)
    -- As an integer conversion takes a real number: without its fraction.
    local whole = number < 0 and math.ceil(number) or floor(number)
    local shown = wrapped(whole, conversion)
    return string.format(known, shown), shown
  end
end

local rules = {}

function rules.integer(shown)
  local write, scale, offset = formatter(shown.format), shown.scale, shown.offset
  return function(raw) return write(raw * scale + offset) end
end
rules.scaled = rules.integer

function rules.named(shown)
  local texts, write = {}, shown.format and formatter(shown.format)
  for _, name in ipairs(shown.names) do texts[name.value] = name.text end
  return function(raw)
    local text = texts[raw] or shown.otherName or write(raw)
    return text, raw
  end
end

function rules.hidden()
  return function(raw) return string.format("%d", raw), raw end
end

local function withAbsent(shown, show)
  if not shown.absentValue then return show end
  return function(raw)
    if raw == shown.absentValue then return shown.absentText end
    return show(raw)
  end
end

local function missing(name)
  return function() return "(" .. name .. " is not known here)" end
end

function kestro.prepareRule(shown)
  local make = rules[shown.kind]
  if shown.kind == "computed" then
    shown.show = kestro.texts[shown["function"]] or missing(shown["function"])
  elseif make then
    local show = withAbsent(shown, make(shown))
    local number = shown["function"] and
        (kestro.numbers[shown["function"]] or missing(shown["function"]))
    shown.show = number and function(raw) return show(number(raw)) end or
        function(raw) return show(raw[1]) end
  end
end

-- What kind of field holds the numbers that a rule shows: "int", "uint", "double" or "string".
function kestro.numberKind(shown, place)
  if shown.kind == "computed" then
    return kestro.isNumber[shown["function"]] and "double" or "string"
  elseif shown.kind == "scaled" then
    return "double"
  elseif shown.kind == "integer" then
    return shown.format:find("%%[+%d.]*[ux]") and "uint" or "int"
  elseif shown.kind == "each" then
    return "int"
  end
  return place.signed and "int" or "uint"
end

-- Whether a text may stand where there is no number.
function kestro.mayLackNumber(value)
  local shown = value.shown
  return value.otherwise ~= nil or shown.absentValue ~= nil or shown.kind == "computed"
end

end
