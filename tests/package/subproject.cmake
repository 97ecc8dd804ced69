# The same sources inside a host's build.
include("${CMAKE_CURRENT_LIST_DIR}/run.cmake")
file(REMOVE_RECURSE "${WORK}/sub")
run(${configure} -S "${CMAKE_CURRENT_LIST_DIR}/subproject" -B "${WORK}/sub"
    "-DCMAKE_TOOLCHAIN_FILE=${TOOLCHAIN_FILE}" "-DORU_SOURCE_DIR=${SOURCE_DIR}")
run("${CMAKE_COMMAND}" --build "${WORK}/sub" --target host)
