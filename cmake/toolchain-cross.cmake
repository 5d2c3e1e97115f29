# Builds for another machine with Debian's cross compiler and a tree of that machine's packages, and
# runs its programs under qemu. scripts/cross makes the tree and names the machine.
set(CMAKE_TRY_COMPILE_PLATFORM_VARIABLES CROSS_TRIPLET CROSS_ROOT CROSS_QEMU)
set(CMAKE_SYSTEM_NAME Linux)
set(CMAKE_C_COMPILER ${CROSS_TRIPLET}-gcc)
set(CMAKE_CXX_COMPILER ${CROSS_TRIPLET}-g++)
set(CMAKE_SYSROOT ${CROSS_ROOT})
set(CMAKE_FIND_ROOT_PATH ${CROSS_ROOT})
set(CMAKE_FIND_ROOT_PATH_MODE_PROGRAM NEVER) # genrb and icupkg run here
set(CMAKE_FIND_ROOT_PATH_MODE_LIBRARY ONLY)
set(CMAKE_FIND_ROOT_PATH_MODE_INCLUDE ONLY)
set(CMAKE_FIND_ROOT_PATH_MODE_PACKAGE ONLY)
file(GLOB _pkgconfig ${CROSS_ROOT}/usr/lib/*/pkgconfig)
set(ENV{PKG_CONFIG_LIBDIR} ${_pkgconfig})
set(ENV{PKG_CONFIG_SYSROOT_DIR} ${CROSS_ROOT})
set(CMAKE_CROSSCOMPILING_EMULATOR ${CROSS_QEMU} -L ${CROSS_ROOT})
