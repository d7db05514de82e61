# The third-party libraries, one target for each. All of them are installed system packages.

find_package(Python3 REQUIRED COMPONENTS Interpreter)
find_package(Threads REQUIRED)
find_package(PkgConfig REQUIRED)
find_package(Boost 1.74 REQUIRED)
find_package(CLI11 REQUIRED)
pkg_check_modules(utf8proc REQUIRED IMPORTED_TARGET libutf8proc)
pkg_check_modules(microhttpd REQUIRED IMPORTED_TARGET libmicrohttpd)
pkg_check_modules(prometheus REQUIRED IMPORTED_TARGET prometheus-cpp-core)

find_path(RAPIDJSON_INCLUDE_DIR rapidjson/document.h REQUIRED)
add_library(rapidjson INTERFACE)
target_include_directories(rapidjson SYSTEM INTERFACE "${RAPIDJSON_INCLUDE_DIR}")
# By default the library aligns to 4 bytes on a 32-bit target, but doubles and 64-bit integers need
# 8. The mask has the type std::size_t, since a narrower one would truncate the size.
target_compile_options(rapidjson INTERFACE
                       "-DRAPIDJSON_ALIGN(x)=(((x)+std::size_t(7))&~std::size_t(7))")
target_compile_definitions(rapidjson INTERFACE RAPIDJSON_HAS_STDSTRING=1)

# The Lua 5.1 interpreter with its JSON and file system modules. The modules do not declare their
# dependency on the interpreter's library, so the order is modules first.
pkg_check_modules(lua REQUIRED IMPORTED_TARGET lua5.1)
find_library(LUA_CJSON_LIBRARY lua5.1-cjson REQUIRED)
find_library(LUA_FILESYSTEM_LIBRARY lua5.1-filesystem REQUIRED)
add_library(lua_modules INTERFACE)
target_link_libraries(lua_modules INTERFACE "${LUA_CJSON_LIBRARY}" "${LUA_FILESYSTEM_LIBRARY}"
                      PkgConfig::lua)
# The utility script of the JSON module, which becomes an embedded file.
find_file(LUA_CJSON_UTIL util.lua PATHS /usr/share/lua/5.1/cjson REQUIRED)
