# Installs the build, then configures, builds and runs a project that only knows the installed package.
set(work "${BUILD_DIR}/package-test")
set(consumer "${CMAKE_CURRENT_LIST_DIR}/consumer")
file(REMOVE_RECURSE "${work}")

function(run)
    execute_process(COMMAND ${ARGV} COMMAND_ERROR_IS_FATAL ANY)
endfunction()

run("${CMAKE_COMMAND}" --install "${BUILD_DIR}" --prefix "${work}/prefix")
set(configure "${CMAKE_COMMAND}" -S "${consumer}" -G Ninja -DCMAKE_BUILD_TYPE=Release
    "-DCMAKE_TOOLCHAIN_FILE=${CMAKE_CURRENT_LIST_DIR}/plain_toolchain.cmake"
    "-Doru_DIR=${work}/prefix/lib/cmake/oru")

# Where OpenCL's headers are the build machine's own, they are not for the host, and a sentence says so.
execute_process(COMMAND ${configure} -B "${work}/without" -DWITH=ocl
    RESULT_VARIABLE result OUTPUT_QUIET ERROR_VARIABLE error)
string(REGEX REPLACE "[ \n]+" " " error "${error}")
if(result EQUAL 0 OR NOT error MATCHES "the OpenCL layer needs CL/cl.h")
    message(FATAL_ERROR "missing OpenCL headers are not named: ${error}")
endif()

run(${configure} -B "${work}/build" -DWITH=ocl "-DORU_OPENCL_INCLUDE_DIR=${OPENCL_INCLUDE_DIR}")
run("${CMAKE_COMMAND}" --build "${work}/build")
run(${EMULATOR} "${work}/build/consumer.exe")

# The same sources inside a host's build.
run("${CMAKE_COMMAND}" -S "${CMAKE_CURRENT_LIST_DIR}/subproject" -B "${work}/sub" -G Ninja
    "-DCMAKE_TOOLCHAIN_FILE=${TOOLCHAIN_FILE}" "-DORU_SOURCE_DIR=${SOURCE_DIR}")
run("${CMAKE_COMMAND}" --build "${work}/sub" --target host)
