-- The translator: finds the description of a code, and formats the details of a status as text.

local cjson = require("cjson")
local utils = require("qixlatorluautils")
local utilities = require("qimxl_utilities")

local mxlator = {}

-- Both are indexed by their number + 1.
mxlator.ThreeLetterLngStrings = { "eng", "fra", "deu", "jpn", "kor", "chs" }
mxlator.Ades = { "none", "qv", "qvi", "qstudio" }

local unsupportedFormat = -52029

-- The usage tags whose value is the number of an attribute.
local attributeUsages = {
    kUsageTypeAttributeId = true,
    kUsageTypeAttributeIdentifier = true,
    kUsageTypeAffectedAttribute = true,
    kUsageTypeConflictingAttr = true,
    kUsageTypeConflictingProperty = true,
    kUsageTypeUnspecifiedProperty = true,
}

-- The module with this name, or nil if it cannot be loaded. A failing require is slow, since it
-- collects the names of all places where it has searched; without a search path it always fails.
local function find(name)
    local module = package.loaded[name]
    if module then
        return module
    end
    if package.preload[name] or package.path ~= "" then
        local success, loaded = pcall(require, name)
        return success and loaded or nil
    end
    return nil
end

-- The module for a language, or else for English.
local function findFor(word, prefix, suffix)
    return find(prefix .. word .. suffix)
        or word ~= "eng" and find(prefix .. "eng" .. suffix) or nil
end

---- Descriptions of codes -------------------------------------------------------------------------

local function fromErrorTable(code, word)
    local errors = findFor(word, "errors_", "")
    if not errors then
        return nil
    end
    assert(errors.encoding == "utf-8", "Unsupported encoding")
    return errors.getString(code)
end

-- Runs one search of explanation files. If it fails, as for a missing directory, the result is nil.
local function search(find, lang, ...)
    local success, text = pcall(find, ...)
    if success and text then
        return utils.mbsToUtf8(lang, text)
    end
    return nil
end

local function fromDriverFiles(code, lang, languageDir, pathsep)
    local settings = qixlatorlua_settings
    if not (settings.MIErrorsDir and settings.driverName) then
        return nil
    end
    local directory = utils.expandPath(qixlatorlua_name, settings.MIErrorsDir)
        .. pathsep .. settings.driverName .. pathsep
    local text = search(utils.findErrorDescriptionFromDir, lang, directory .. languageDir, code)
    if not text and languageDir ~= "English" then
        text = search(utils.findErrorDescriptionFromDir, 0, directory .. "English", code)
    end
    return text
end

local function fromSharedFiles(code, lang, directory)
    local find = utils.findErrorDescriptionFromErrorsDir
    return search(find, lang, directory, code, lang) or search(find, 0, directory, code, 0)
end

-- The description of a code in the language with this number, or else in English. ade is not used.
function mxlator.getStaticDesc(code, lang, ade)
    local pathsep = package.config:sub(1, 1)
    local word = mxlator.ThreeLetterLngStrings[lang + 1] or "zzz"
    local languageDir = utilities.convertLangShortToLong(word)
    local standardErrDir =
        utils.expandPath(qixlatorlua_name, qixlatorlua_settings.qiSharedErrorsDir)
    code = qimxl_unmapErrorCode(code)
    return fromErrorTable(code, word)
        or fromDriverFiles(code, lang, languageDir, pathsep)
        or fromSharedFiles(code, lang, standardErrDir)
        or "Error description not found"
end

---- Details of a status ---------------------------------------------------------------------------

local defaultAttributes = "qimxl_defaultAttrTable"

-- The attribute table of the driver, or else the default one. Nil if it cannot be loaded.
local function findAttributes(word, ade)
    local driver = qixlatorlua_settings.driverName
    if not driver then
        return find(defaultAttributes)
    end
    local prefix = driver .. "_attributes_"
    local adeName = ade ~= 0 and mxlator.Ades[ade + 1]
    return adeName and findFor(word, prefix, "_" .. adeName)
        or findFor(word, prefix, "")
        or find(defaultAttributes)
end

-- Up to this number, every whole number is exactly a number of the interpreter.
local largestExact = 2 ^ 53

-- A JSON value as text. For anything but a string or a number this is its JSON text, since tostring
-- would give an address.
local function textOf(value)
    local kind = type(value)
    if kind == "string" then
        return value
    elseif kind == "number" and value % 1 == 0 and math.abs(value) <= largestExact then
        return string.format("%.0f", value)
    elseif kind == "number" then
        -- The interpreter writes the decimal separator of the locale.
        return (tostring(value):gsub(",", "."))
    end
    return cjson.encode(value)
end

local function term(terms, key)
    if not terms then
        return key
    end
    assert(terms.encoding == "utf-8", "Unsupported encoding")
    return terms.getString(key) or key
end

-- The attribute with this number, or nil if num is not a number. An unknown one has it as its name.
local function attribute(attributes, num)
    local number = tonumber(num)
    -- The remainder limits the number to eight digits; formatting a larger one would be undefined.
    -- The interpreter accepts "nan" and "inf" as numbers; their remainder is not a number.
    local remainder = number and number % 4294967296
    if not remainder or remainder ~= remainder then
        return nil
    end
    local attrid = string.format("%08X", remainder)
    return attributes and attributes.getAttribute(attrid)
        or { shortName = "0x" .. attrid, enums = {} }
end

local function plainText(entry, value, attributes)
    if attributeUsages[entry.usage] then
        local found = attribute(attributes, value)
        return found and found.shortName or textOf(value)
    end
    return textOf(value)
end

local function enumText(entry, value, attributes)
    local found = attribute(attributes, entry.value_type.id)
    return found and found.enums[textOf(value)] or textOf(value)
end

-- The value of a usage entry as a text or an array of texts. Nil if there is no value, if its type
-- is unknown, and for an empty array, which would be encoded as an object.
local function usageValue(entry, attributes)
    if entry.value == nil then
        return nil
    end
    local toText = plainText
    if type(entry.value_type) == "table" then
        if entry.value_type.type ~= "enum" then
            return nil
        end
        toText = enumText
    end
    if type(entry.value) ~= "table" then
        return toText(entry, entry.value, attributes)
    end
    local texts = {}
    for index, element in ipairs(entry.value) do
        texts[index] = toText(entry, element, attributes)
    end
    return next(texts) and texts
end

-- The item for one entry, or nil if the entry is not shown.
local function itemOf(entry, terms, attributes)
    if type(entry) ~= "table" then
        return nil
    elseif entry.type == "usage" then
        return { type = "usage", key = term(terms, entry.usage),
            value = usageValue(entry, attributes) }
    elseif entry.type == "elaboration" or entry.type == "header" then
        return { type = entry.type, value = term(terms, entry.usage) }
    elseif entry.type == "empty" then
        return { type = "empty" }
    end
    return nil
end

local function dynamicItems(errorContext, terms, attributes)
    local items = {}
    local info = errorContext.translator_info
    local entries = type(info) == "table" and info.ordered_data
    if type(entries) == "table" then
        for _, entry in pairs(entries) do
            items[#items + 1] = itemOf(entry, terms, attributes)
        end
    end
    return items
end

local function addDebugItem(items, key, value)
    if value ~= nil then
        items[#items + 1] = { type = "usage", key = key, value = textOf(value) }
    end
end

-- Removes from the status what is shown elsewhere; the rest becomes one item.
local function debugItems(errorContext, internalError)
    local items = {}
    addDebugItem(items, "Component", errorContext.component)
    addDebugItem(items, "File", errorContext.file)
    addDebugItem(items, "Line", errorContext.line)
    addDebugItem(items, "internal_error_string", internalError)
    errorContext.translator_info = nil
    errorContext.component = nil
    errorContext.file = nil
    errorContext.line = nil
    addDebugItem(items, "rest_of_input_json", cjson.encode(errorContext))
    return items
end

-- The details of a status's JSON text in format json1, or a negative code. lang and ade are hints.
function mxlator.getDynamicDesc(errjson, lang, ade, format)
    if format ~= "json1" then
        return unsupportedFormat
    end
    local errorContext = cjson.decode(errjson)
    local word = mxlator.ThreeLetterLngStrings[lang + 1] or "zzz"
    local attributes = findAttributes(word, ade)
    local internalError
    if not attributes then
        internalError = "Cannot load " .. defaultAttributes .. "\n"
    end
    local terms = findFor(word, "commonTerms_", "")
    local dynamicArray = dynamicItems(errorContext, terms, attributes)
    local debugArray = debugItems(errorContext, internalError)
    return cjson.encode({ dynamic = dynamicArray, debug = debugArray })
end

return mxlator
