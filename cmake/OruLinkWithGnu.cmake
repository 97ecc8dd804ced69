# Rules that link objects of another compiler with the GNU compiler for the target (see
# toolchain-mingw64-clang.cmake): clang of Debian does not find the target's run-time libraries.
foreach(rule IN ITEMS CMAKE_CXX_CREATE_SHARED_LIBRARY CMAKE_CXX_CREATE_SHARED_MODULE
        CMAKE_CXX_LINK_EXECUTABLE)
    string(REPLACE "<CMAKE_CXX_COMPILER>" "x86_64-w64-mingw32-g++-posix" ${rule} "${${rule}}")
    string(REPLACE "<FLAGS>" "" ${rule} "${${rule}}")
    string(REPLACE "<LANGUAGE_COMPILE_FLAGS>" "" ${rule} "${${rule}}")
endforeach()
