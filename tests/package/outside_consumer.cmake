# Configures, builds and runs a project that only knows the unpacked package.
include("${CMAKE_CURRENT_LIST_DIR}/run.cmake")
set(work "${WORK}/${COMPILER}")
file(REMOVE_RECURSE "${work}")
list(APPEND configure -S "${CMAKE_CURRENT_LIST_DIR}/consumer" "-DCMAKE_TOOLCHAIN_FILE=${TOOLCHAIN_FILE}"
    "-Doru_DIR=${package}/lib/cmake/oru" -DWITH=ocl)

if(COMPILER STREQUAL "gcc")
    # Where OpenCL's headers are the build machine's own, they are not for the host, and a sentence says so.
    execute_process(COMMAND ${configure} -B "${work}/without"
        RESULT_VARIABLE result OUTPUT_QUIET ERROR_VARIABLE error)
    string(REGEX REPLACE "[ \n]+" " " error "${error}")
    if(result EQUAL 0 OR NOT error MATCHES "the OpenCL layer needs CL/cl.h")
        message(FATAL_ERROR "missing OpenCL headers are not named: ${error}")
    endif()
endif()

run(${configure} -B "${work}/build" "-DORU_OPENCL_INCLUDE_DIR=${OPENCL_INCLUDE_DIR}")
run("${CMAKE_COMMAND}" --build "${work}/build")
run(${EMULATOR} "${work}/build/consumer.exe")
