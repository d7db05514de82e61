-- The attribute table for a driver that has none: it contains no attributes.

local qimxl_defaultAttrTable = { encoding = "utf-8" }

-- attrid: eight upper-case hexadecimal digits. Returns a table with shortName and enums, or nil.
function qimxl_defaultAttrTable.getAttribute(attrid)
    return nil
end

return qimxl_defaultAttrTable
