-- Conversion between the two names of a language: the word of three letters and the directory name.
-- For an unknown name the result is that of the last call with a known name.

local qimxl_utilities = {}

local longNames = {
    eng = "English",
    jpn = "Japanese",
    chs = "ChineseS",
    fra = "French",
    deu = "German",
    kor = "Korean",
    zzz = "Zzzzzzz",
}

local shortNames = {}
for short, long in pairs(longNames) do
    if short ~= "zzz" then
        shortNames[long] = short
    end
end

function qimxl_utilities.convertLangShortToLong(short)
    qimxl_langLong = longNames[short] or qimxl_langLong
    return qimxl_langLong
end

function qimxl_utilities.convertLangLongToShort(long)
    qimxl_langShort = shortNames[long] or qimxl_langShort
    return qimxl_langShort
end

return qimxl_utilities
