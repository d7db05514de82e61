-- The attribute table of a driver that brings none: knows no attribute.

local qimxl_defaultAttrTable = { encoding = "utf-8" }

-- attrid: eight upper-case hexadecimal digits. A table with shortName and enums, or nil.
function qimxl_defaultAttrTable.getAttribute(attrid)
    return nil
end

return qimxl_defaultAttrTable
