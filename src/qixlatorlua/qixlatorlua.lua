-- Runs first in each new state: sets the state up as one translator.

local json = require("json")
local utils = require("qixlatorluautils")
require("stdint")

qixlatorlua_name = nil
qixlatorlua_xlator = nil
qixlatorlua_settings = {}

-- The error function of every call into the translator.
function qixlatorlua_errHandler(errorIn)
    return errorIn .. "\n" .. debug.traceback()
end

-- The search path for scripts in these directories, which may begin with a variable.
local function makePath(name, directories)
    local templates = {}
    for part in directories:gmatch("[^;]+") do
        local directory = utils.expandPath(name, part):gsub("\\", "/")
        if directory:sub(-1) ~= "/" then
            directory = directory .. "/"
        end
        templates[#templates + 1] = directory .. "?.lua"
    end
    return table.concat(templates, ";")
end

-- name: the name of this translator. registrationInfo: a JSON object with the module that
-- implements it (qixlatorlua_xlator) and optionally settings (qixlatorlua_settings) and directories
-- to search, separated by semicolons (qixlatorlua_path).
function qixlatorlua_setupEnv(name, registrationInfo)
    local info = json.decode(registrationInfo)
    qixlatorlua_name = name
    package.path = info.qixlatorlua_path and makePath(name, info.qixlatorlua_path) or ""
    package.cpath = ""
    qixlatorlua_xlator = require(info.qixlatorlua_xlator)
    if info.qixlatorlua_settings then
        qixlatorlua_settings = info.qixlatorlua_settings
    end
end
