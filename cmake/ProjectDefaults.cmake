# The settings for all targets of this project.

set(CMAKE_C_STANDARD 99)
set(CMAKE_C_STANDARD_REQUIRED ON)
set(CMAKE_C_EXTENSIONS OFF)
set(CMAKE_CXX_STANDARD 17)
set(CMAKE_CXX_STANDARD_REQUIRED ON)
set(CMAKE_CXX_EXTENSIONS OFF)

# All code may be linked into a shared library, which exports only the symbols that it lists.
set(CMAKE_POSITION_INDEPENDENT_CODE ON)
set(CMAKE_C_VISIBILITY_PRESET hidden)
set(CMAKE_CXX_VISIBILITY_PRESET hidden)
set(CMAKE_VISIBILITY_INLINES_HIDDEN ON)

set(CMAKE_RUNTIME_OUTPUT_DIRECTORY "${PROJECT_BINARY_DIR}/bin")
set(CMAKE_LIBRARY_OUTPUT_DIRECTORY "${PROJECT_BINARY_DIR}/lib")

find_program(QITRMC_CCACHE ccache)
if(QITRMC_CCACHE)
  # With paths relative to the build folder the presets and copies of the repository share what they
  # compile alike.
  set(CMAKE_C_COMPILER_LAUNCHER env "CCACHE_BASEDIR=${PROJECT_SOURCE_DIR}" "${QITRMC_CCACHE}")
  set(CMAKE_CXX_COMPILER_LAUNCHER ${CMAKE_C_COMPILER_LAUNCHER})
endif()

# On a 32-bit target readdir and stat fail for a file whose inode number or directory offset needs
# 64 bits, unless these types have 64 bits in all of the code.
add_compile_definitions(_FILE_OFFSET_BITS=64 _TIME_BITS=64)

add_compile_options(-Wall -Wextra -Werror)
# File names in error reports are relative to the project, so they are the same on every build
# machine.
file(RELATIVE_PATH source_from_build "${PROJECT_BINARY_DIR}" "${PROJECT_SOURCE_DIR}")
add_compile_options("-fmacro-prefix-map=${PROJECT_SOURCE_DIR}/="
                    "-fmacro-prefix-map=${source_from_build}=")
# Those of debug information too, or the compiler cache would keep it apart for each folder.
add_compile_options("-fdebug-prefix-map=${PROJECT_SOURCE_DIR}/=")

set(QITRMC_SANITIZE "" CACHE STRING "Sanitizers to build with, for example address,undefined")
if(QITRMC_SANITIZE)
  add_compile_options("-fsanitize=${QITRMC_SANITIZE}" -fno-sanitize-recover=all
                      -fno-omit-frame-pointer)
  add_link_options("-fsanitize=${QITRMC_SANITIZE}")
  # The older name of -fsanitize-ignorelist, the only one whose file the compiler cache reads.
  add_compile_options(
    "$<$<CXX_COMPILER_ID:Clang>:-fsanitize-blacklist=${source_from_build}cmake/sanitizer-ignored.txt>")
endif()

# Generated headers, included as those of src/ are.
set(QITRMC_GENERATED "${PROJECT_BINARY_DIR}/generated")
file(MAKE_DIRECTORY "${QITRMC_GENERATED}/qierr")

# qitrmc_library(NAME sources...): one folder of the plug-in as a static library. Its headers are
# included as <folder>/<header>.
function(qitrmc_library name)
  add_library(${name} STATIC ${ARGN})
  target_include_directories(${name} PUBLIC "${PROJECT_SOURCE_DIR}/src" "${QITRMC_GENERATED}")
endfunction()
