# Compiles for Microsoft's binary interface with clang-cl, as far as that goes without Microsoft's headers and libraries:
# LLVM's standard library stands for Microsoft's, MinGW's headers of the system for the Windows SDK's. What is compiled
# so cannot run; tools/check links it to see that only names of the run-time libraries are missing.
set(CMAKE_SYSTEM_NAME Windows)
set(CMAKE_SYSTEM_PROCESSOR AMD64)

set(CMAKE_CXX_COMPILER clang-cl-14)
set(CMAKE_CXX_COMPILER_TARGET x86_64-pc-windows-msvc)
set(CMAKE_LINKER lld-link-14)
set(CMAKE_AR llvm-lib-14)
set(CMAKE_RC_COMPILER llvm-rc-14)
set(CMAKE_MT CMAKE_MT-NOTFOUND)
set(CMAKE_TRY_COMPILE_TARGET_TYPE STATIC_LIBRARY)
set(CMAKE_CXX_COMPILER_WORKS TRUE)

set(ORU_SYSTEM_INCLUDE /usr/x86_64-w64-mingw32/include)
foreach(name IN ITEMS movsb movsw movsd movsq stosb stosw stosd stosq)
    list(APPEND defined "-D__INTRINSIC_DEFINED___${name}")
endforeach()
list(JOIN defined " " defined)
string(JOIN " " CMAKE_CXX_FLAGS_INIT
    "-fmsc-version=1933 /EHsc"
    "/imsvc ${CMAKE_CURRENT_LIST_DIR}/msvc"
    "/imsvc /usr/lib/llvm-14/include/c++/v1"
    "/imsvc ${ORU_SYSTEM_INCLUDE}"
    # MinGW's headers know a compiler by these only, and declare strchr and its kin once for both kinds of text.
    "-D__GNUC__=12 -D__GNUC_MINOR__=2 -D_UCRT -D_CONST_RETURN="
    "-D_LIBCPP_STRING_H_HAS_CONST_OVERLOADS -D_LIBCPP_WCHAR_H_HAS_CONST_OVERLOADS"
    # The compiler's own <intrin.h> has these already.
    "-DUSE_NO_MINGW_SETJMP_TWO_ARGS ${defined}"
    # What LLVM's library expects of Microsoft's and MinGW's lacks.
    "-D_LIBCPP_NO_VCRUNTIME -D_strtof_l=_strtod_l -D_strtold_l=_strtod_l")
set(CMAKE_RC_FLAGS_INIT "/I ${ORU_SYSTEM_INCLUDE}")

# As from a package manager: the registry's headers without the rest of the system's.
set(ORU_KHRONOS_INCLUDE_DIR "${CMAKE_BINARY_DIR}/khronos")
foreach(header IN ITEMS GL/glext.h GL/wglext.h KHR/khrplatform.h)
    configure_file("${ORU_SYSTEM_INCLUDE}/${header}" "${ORU_KHRONOS_INCLUDE_DIR}/${header}" COPYONLY)
endforeach()

get_filename_component(ORU_DEPS_DIR "${CMAKE_CURRENT_LIST_DIR}/../build/deps" ABSOLUTE)
set(CMAKE_FIND_ROOT_PATH "${ORU_DEPS_DIR}" /usr/x86_64-w64-mingw32)
set(CMAKE_FIND_ROOT_PATH_MODE_PROGRAM NEVER)
set(CMAKE_FIND_ROOT_PATH_MODE_LIBRARY ONLY)
set(CMAKE_FIND_ROOT_PATH_MODE_INCLUDE ONLY)
set(CMAKE_FIND_ROOT_PATH_MODE_PACKAGE ONLY)
