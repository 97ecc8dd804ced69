# Cross-builds for 64-bit Windows with Debian's mingw-w64 (POSIX threads), running programs under Wine.
set(CMAKE_SYSTEM_NAME Windows)
set(CMAKE_SYSTEM_PROCESSOR x86_64)

set(CMAKE_C_COMPILER x86_64-w64-mingw32-gcc-posix)
set(CMAKE_CXX_COMPILER x86_64-w64-mingw32-g++-posix)
set(CMAKE_RC_COMPILER x86_64-w64-mingw32-windres)

# The private prefix holds what tools/setup cross-built, and links to header-only packages, so that the
# build machine's own include folder never comes into sight.
get_filename_component(ORU_DEPS_DIR "${CMAKE_CURRENT_LIST_DIR}/../build/deps" ABSOLUTE)
set(CMAKE_FIND_ROOT_PATH "${ORU_DEPS_DIR}" /usr/x86_64-w64-mingw32)
set(CMAKE_FIND_ROOT_PATH_MODE_PROGRAM NEVER)
set(CMAKE_FIND_ROOT_PATH_MODE_LIBRARY ONLY)
set(CMAKE_FIND_ROOT_PATH_MODE_INCLUDE ONLY)
set(CMAKE_FIND_ROOT_PATH_MODE_PACKAGE ONLY)

# The release configuration of this toolchain: no debug data, whose paths would differ from machine to
# machine, and no assertions of third parties. The library's own checks do not depend on NDEBUG.
set(CMAKE_CXX_FLAGS_RELEASE "-O2 -g0 -DNDEBUG" CACHE STRING "Flags of the release configuration")
set(CMAKE_C_FLAGS_RELEASE "-O2 -g0 -DNDEBUG" CACHE STRING "Flags of the release configuration")

get_filename_component(ORU_WINE_RUN "${CMAKE_CURRENT_LIST_DIR}/../tools/wine-run" ABSOLUTE)
set(CMAKE_CROSSCOMPILING_EMULATOR "${ORU_WINE_RUN}")
