# Finds the third-party libraries. Cross-building, they stand in the private prefix that tools/setup
# fills; on a Windows machine its package manager provides them.
include_guard(GLOBAL)

find_package(Threads REQUIRED) # which the package of TBB does not look for itself
find_package(TBB CONFIG REQUIRED COMPONENTS tbb)
find_package(Python3 REQUIRED COMPONENTS Interpreter)

# oru_find_headers(<target> <file>): a header-only package as a target, found by one of its files.
function(oru_find_headers target file)
    string(MAKE_C_IDENTIFIER "ORU_${target}_INCLUDE_DIR" variable)
    find_path(${variable} "${file}" REQUIRED)
    add_library(${target} INTERFACE IMPORTED GLOBAL)
    target_include_directories(${target} SYSTEM INTERFACE "${${variable}}")
endfunction()

# Boost.Format composes the class names of the library's windows, which hosts see.
oru_find_headers(deps::boost boost/format.hpp)
oru_find_headers(deps::opencl CL/cl.h)

# The registry's headers stand beside MinGW's gl.h; Microsoft's SDK has only gl.h.
find_path(ORU_KHRONOS_INCLUDE_DIR KHR/khrplatform.h)
if(NOT ORU_KHRONOS_INCLUDE_DIR OR NOT EXISTS "${ORU_KHRONOS_INCLUDE_DIR}/GL/glext.h")
    message(FATAL_ERROR "GL/glext.h, GL/wglext.h and KHR/khrplatform.h of the Khronos registry were not found. "
        "Install them (vcpkg: opengl-registry) or set ORU_KHRONOS_INCLUDE_DIR to their folder.")
endif()
if(MSVC)
    include_directories(SYSTEM "${ORU_KHRONOS_INCLUDE_DIR}")
endif()

if(ORU_BUILD_TESTS)
    find_package(GTest CONFIG REQUIRED)
endif()
if(ORU_BUILD_BENCHMARKS)
    find_package(benchmark CONFIG REQUIRED)
    oru_find_headers(deps::openclhpp CL/opencl.hpp)
endif()
if(ORU_BUILD_APPS)
    set(ZLIB_USE_STATIC_LIBS ON)
    find_package(PNG REQUIRED)
    find_package(JPEG REQUIRED)
    oru_find_headers(deps::lcms2 lcms2.h)
    find_library(ORU_LCMS2_LIBRARY NAMES lcms2 REQUIRED)
    target_link_libraries(deps::lcms2 INTERFACE "${ORU_LCMS2_LIBRARY}")
    find_package(TIFF REQUIRED)
    oru_find_headers(deps::cli11 CLI/CLI.hpp)
    oru_find_headers(deps::json nlohmann/json.hpp)
endif()
