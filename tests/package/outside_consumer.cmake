# Installs the build, then configures, builds and runs a project that only knows the installed package.
set(work "${BUILD_DIR}/package-test")
set(consumer "${CMAKE_CURRENT_LIST_DIR}/consumer")
file(REMOVE_RECURSE "${work}")

function(run)
    execute_process(COMMAND ${ARGV} COMMAND_ERROR_IS_FATAL ANY)
endfunction()

run("${CMAKE_COMMAND}" --install "${BUILD_DIR}" --prefix "${work}/prefix")
run("${CMAKE_COMMAND}" -S "${consumer}" -B "${work}/build" -G Ninja
    "-DCMAKE_TOOLCHAIN_FILE=${TOOLCHAIN_FILE}" -DCMAKE_BUILD_TYPE=Release
    "-Doru_DIR=${work}/prefix/lib/cmake/oru")
run("${CMAKE_COMMAND}" --build "${work}/build")
run(${EMULATOR} "${work}/build/consumer.exe")
