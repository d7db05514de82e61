# The 32-bit ARM of the controller, as Debian's armel. scripts/cross-armel makes what is named here.

set(CMAKE_SYSTEM_NAME Linux)
set(CMAKE_SYSTEM_PROCESSOR arm)
set(CMAKE_LIBRARY_ARCHITECTURE arm-linux-gnueabi)

get_filename_component(cross "${CMAKE_CURRENT_LIST_DIR}/../build/cross-armel" ABSOLUTE)
set(CMAKE_SYSROOT "${cross}/sysroot")
set(CMAKE_C_COMPILER "${cross}/bin/arm-linux-gnueabi-gcc")
set(CMAKE_CXX_COMPILER "${cross}/bin/arm-linux-gnueabi-g++")
set(CMAKE_CROSSCOMPILING_EMULATOR "${cross}/bin/qemu-armel")

set(CMAKE_FIND_ROOT_PATH_MODE_PROGRAM NEVER)
set(CMAKE_FIND_ROOT_PATH_MODE_LIBRARY ONLY)
set(CMAKE_FIND_ROOT_PATH_MODE_INCLUDE ONLY)
set(CMAKE_FIND_ROOT_PATH_MODE_PACKAGE ONLY)
set(ENV{PKG_CONFIG_SYSROOT_DIR} "${CMAKE_SYSROOT}")
set(ENV{PKG_CONFIG_LIBDIR}
    "${CMAKE_SYSROOT}/usr/lib/arm-linux-gnueabi/pkgconfig:${CMAKE_SYSROOT}/usr/share/pkgconfig")

# The compiler notes that GCC 7 changed how some C++ arguments are passed. All that this project's
# C++ code is linked with is built by the same compiler or called through C.
set(CMAKE_CXX_FLAGS_INIT -Wno-psabi)
# 64-bit atomics are functions of a library here.
set(CMAKE_C_STANDARD_LIBRARIES_INIT "-Wl,--as-needed -latomic")
set(CMAKE_CXX_STANDARD_LIBRARIES_INIT "-Wl,--as-needed -latomic")
