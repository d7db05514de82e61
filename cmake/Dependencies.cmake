# The third-party packages, each behind one target. All of them are installed system packages.

find_package(Threads REQUIRED)
find_package(PkgConfig REQUIRED)
find_package(Boost 1.74 REQUIRED)
pkg_check_modules(utf8proc REQUIRED IMPORTED_TARGET libutf8proc)
pkg_check_modules(microhttpd REQUIRED IMPORTED_TARGET libmicrohttpd)

find_path(RAPIDJSON_INCLUDE_DIR rapidjson/document.h REQUIRED)
add_library(rapidjson INTERFACE)
target_include_directories(rapidjson SYSTEM INTERFACE "${RAPIDJSON_INCLUDE_DIR}")
# The library's own choice aligns to 4 bytes on a 32-bit target, where doubles and 64-bit integers
# need 8.
target_compile_options(rapidjson INTERFACE "-DRAPIDJSON_ALIGN(x)=(((x)+7u)&~7u)")
target_compile_definitions(rapidjson INTERFACE RAPIDJSON_HAS_STDSTRING=1)
