# The same target as toolchain-mingw64.cmake, compiled by clang and linked by the GNU compiler.
include("${CMAKE_CURRENT_LIST_DIR}/toolchain-mingw64.cmake")

set(CMAKE_C_COMPILER clang)
set(CMAKE_CXX_COMPILER clang++)

file(GLOB ORU_MINGW_CXX_DIRS /usr/lib/gcc/x86_64-w64-mingw32/*-posix/include/c++)
list(GET ORU_MINGW_CXX_DIRS -1 ORU_MINGW_CXX_DIR)
# The GNU run-time library's thread-local variables are emulated ones.
string(JOIN " " CMAKE_CXX_FLAGS_INIT
    "--target=x86_64-w64-mingw32 -femulated-tls -nostdinc++ -nostdlibinc"
    "-isystem ${ORU_MINGW_CXX_DIR}"
    "-isystem ${ORU_MINGW_CXX_DIR}/x86_64-w64-mingw32"
    "-isystem ${ORU_MINGW_CXX_DIR}/backward"
    "-isystem /usr/x86_64-w64-mingw32/include")
set(CMAKE_TRY_COMPILE_TARGET_TYPE STATIC_LIBRARY)
set(CMAKE_USER_MAKE_RULES_OVERRIDE "${CMAKE_CURRENT_LIST_DIR}/OruLinkWithGnu.cmake")
