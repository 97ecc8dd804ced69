# Packs the build and unpacks it, the debug data over the rest as a person does.
include("${CMAKE_CURRENT_LIST_DIR}/run.cmake")
file(REMOVE_RECURSE "${WORK}/packed" "${WORK}/unpacked")

run("${PYTHON}" -B "${SOURCE_DIR}/tools/lib/package.py" "${BUILD_DIR}" "${WORK}/packed")
file(GLOB sums RELATIVE "${WORK}/packed" "${WORK}/packed/*.sha256")
file(MAKE_DIRECTORY "${WORK}/unpacked")
foreach(sum IN LISTS sums)
    execute_process(COMMAND sha256sum --check --strict "${sum}"
        WORKING_DIRECTORY "${WORK}/packed" COMMAND_ERROR_IS_FATAL ANY)
    string(REPLACE ".sha256" "" zip "${sum}")
    file(ARCHIVE_EXTRACT INPUT "${WORK}/packed/${zip}" DESTINATION "${WORK}/unpacked")
endforeach()
file(GLOB package "${WORK}/unpacked/*")
list(LENGTH package folders)
if(NOT folders EQUAL 1)
    message(FATAL_ERROR "the zip files of a version do not unpack into one folder: ${package}")
endif()
