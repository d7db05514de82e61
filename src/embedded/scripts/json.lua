-- JSON for Lua 5.1: decode and encode texts.
--
--   json.decode(text [, position])  the value at the position (1 by default), and the position after
--                                   it and the white space that follows. A null becomes nil, so an
--                                   object has no member for it and an array has a hole.
--   json.encode(value)              the text of nil, a boolean, a finite number, a string, or a table.
--                                   A table whose keys are 1 to n is an array, also an empty table.
--   json.null                       represents null where nil cannot be stored.
--
-- Invalid text raises an error that names the position. The text is never executed as code.

local json = {}

function json.null()
    return json.null
end

local escapes = {
    ['"'] = '"', ["\\"] = "\\", ["/"] = "/",
    b = "\b", f = "\f", n = "\n", r = "\r", t = "\t",
}
local words = { ["true"] = true, ["false"] = false }

local decodeValue

local function fail(position, what)
    error("json: " .. what .. " at position " .. position, 0)
end

local function skipSpace(text, position)
    return text:find("[^ \t\r\n]", position) or #text + 1
end

local function utf8(point)
    if point < 0x80 then
        return string.char(point)
    elseif point < 0x800 then
        return string.char(0xC0 + math.floor(point / 0x40), 0x80 + point % 0x40)
    elseif point < 0x10000 then
        return string.char(0xE0 + math.floor(point / 0x1000),
            0x80 + math.floor(point / 0x40) % 0x40, 0x80 + point % 0x40)
    end
    return string.char(0xF0 + math.floor(point / 0x40000),
        0x80 + math.floor(point / 0x1000) % 0x40,
        0x80 + math.floor(point / 0x40) % 0x40, 0x80 + point % 0x40)
end

-- The code point of the escape that begins with "\u" at the position, and the position after it.
local function decodeCodePoint(text, position)
    local digits = text:match("^\\u(%x%x%x%x)", position)
    if not digits then
        fail(position, "bad escape")
    end
    local point = tonumber(digits, 16)
    if point < 0xD800 or point > 0xDFFF then
        return point, position + 6
    end
    local low = tonumber(text:match("^\\u(%x%x%x%x)", position + 6) or "0", 16)
    if point > 0xDBFF or low < 0xDC00 or low > 0xDFFF then
        fail(position, "lone surrogate")
    end
    return 0x10000 + (point - 0xD800) * 0x400 + low - 0xDC00, position + 12
end

local function decodeEscape(text, position)
    local plain = escapes[text:sub(position + 1, position + 1)]
    if plain then
        return plain, position + 2
    end
    local point, behind = decodeCodePoint(text, position)
    return utf8(point), behind
end

local function decodeString(text, position)
    local parts = {}
    local start = position + 1
    while true do
        local stop = text:find('[%c"\\]', start) or fail(position, "unfinished string")
        parts[#parts + 1] = text:sub(start, stop - 1)
        local byte = text:sub(stop, stop)
        if byte == '"' then
            return table.concat(parts), stop + 1
        elseif byte == "\\" then
            parts[#parts + 1], start = decodeEscape(text, stop)
        elseif byte == "\127" then
            parts[#parts + 1], start = byte, stop + 1
        else
            fail(stop, "control character in a string")
        end
    end
end

-- The interpreter reads and writes numbers with the decimal separator of the locale.
local function toNumber(text)
    return tonumber(text) or tonumber((text:gsub("%.", ",")))
end

local function decodeNumber(text, position)
    local whole = text:match("^-?[1-9]%d*", position) or text:match("^-?0", position)
        or fail(position, "value expected")
    local number = whole .. (text:match("^%.%d+", position + #whole) or "")
    number = number .. (text:match("^[eE][+-]?%d+", position + #number) or "")
    return toNumber(number), position + #number
end

local function decodeArray(text, position)
    local array, count = {}, 0
    position = skipSpace(text, position + 1)
    if text:sub(position, position) == "]" then
        return array, position + 1
    end
    while true do
        count = count + 1
        array[count], position = decodeValue(text, position)
        local byte = text:sub(position, position)
        if byte == "]" then
            return array, position + 1
        elseif byte ~= "," then
            fail(position, "',' or ']' expected")
        end
        position = position + 1
    end
end

local function decodeMember(text, position, object)
    position = skipSpace(text, position)
    if text:sub(position, position) ~= '"' then
        fail(position, "member name expected")
    end
    local name
    name, position = decodeString(text, position)
    position = skipSpace(text, position)
    if text:sub(position, position) ~= ":" then
        fail(position, "':' expected")
    end
    object[name], position = decodeValue(text, position + 1)
    return position
end

local function decodeObject(text, position)
    local object = {}
    position = skipSpace(text, position + 1)
    if text:sub(position, position) == "}" then
        return object, position + 1
    end
    while true do
        position = decodeMember(text, position, object)
        local byte = text:sub(position, position)
        if byte == "}" then
            return object, position + 1
        elseif byte ~= "," then
            fail(position, "',' or '}' expected")
        end
        position = position + 1
    end
end

local function decodeWord(text, position)
    local word = text:match("^%a+", position)
    if word ~= "null" and words[word] == nil then
        fail(position, "value expected")
    end
    return words[word], position + #word
end

function decodeValue(text, position)
    position = skipSpace(text, position)
    local byte = text:sub(position, position)
    local value
    if byte == "{" then
        value, position = decodeObject(text, position)
    elseif byte == "[" then
        value, position = decodeArray(text, position)
    elseif byte == '"' then
        value, position = decodeString(text, position)
    elseif byte:find("%a") then
        value, position = decodeWord(text, position)
    else
        value, position = decodeNumber(text, position)
    end
    return value, skipSpace(text, position)
end

function json.decode(text, position)
    return decodeValue(text, position or 1)
end

local shortEscapes = {
    ['"'] = '\\"', ["\\"] = "\\\\",
    ["\b"] = "\\b", ["\f"] = "\\f", ["\n"] = "\\n", ["\r"] = "\\r", ["\t"] = "\\t",
}

local function encodeString(text)
    return '"' .. text:gsub('[%c"\\]', function(byte)
        return shortEscapes[byte] or string.format("\\u%04x", byte:byte())
    end) .. '"'
end

local function encodeNumber(number)
    if number ~= number or number == math.huge or number == -math.huge then
        error("json: a number that is not finite has no text", 0)
    end
    return (string.format("%.14g", number):gsub(",", "."))
end

local function isArray(value)
    local count = 0
    for _ in pairs(value) do
        count = count + 1
    end
    return count == #value
end

local function encodeTable(value)
    local parts = {}
    if isArray(value) then
        for index, element in ipairs(value) do
            parts[index] = json.encode(element)
        end
        return "[" .. table.concat(parts, ",") .. "]"
    end
    for name, member in pairs(value) do
        parts[#parts + 1] = encodeString(tostring(name)) .. ":" .. json.encode(member)
    end
    return "{" .. table.concat(parts, ",") .. "}"
end

function json.encode(value)
    local kind = type(value)
    if value == nil or value == json.null then
        return "null"
    elseif kind == "boolean" then
        return tostring(value)
    elseif kind == "number" then
        return encodeNumber(value)
    elseif kind == "string" then
        return encodeString(value)
    elseif kind == "table" then
        return encodeTable(value)
    end
    error("json: a " .. kind .. " has no text", 0)
end

return json
