# Debug data in a file of its own, beside what it belongs to.
include_guard(GLOBAL)

set(ORU_SPLIT_DEBUG_DATA OFF)
if(MINGW AND CMAKE_CXX_COMPILER_ID STREQUAL "GNU" AND CMAKE_BUILD_TYPE STREQUAL "Release" AND NOT
        ORU_COVERAGE)
    find_program(ORU_GNU_OBJCOPY NAMES x86_64-w64-mingw32-objcopy objcopy REQUIRED)
    set(ORU_SPLIT_DEBUG_DATA ON)
endif()

# oru_split_debug_data(<target>): a release has the debug data of <target> in FILE.debug, where gdb finds it by the
# link in FILE. The compiler makes the same code with and without it.
function(oru_split_debug_data target)
    if(NOT ORU_SPLIT_DEBUG_DATA)
        return()
    endif()
    target_compile_options(${target} PRIVATE -g)
    set(file "$<TARGET_FILE:${target}>")
    # Without the variable the time of the day gets into the file.
    set(objcopy "${CMAKE_COMMAND}" -E env SOURCE_DATE_EPOCH=0 "${ORU_GNU_OBJCOPY}")
    add_custom_command(TARGET ${target} POST_BUILD
        COMMAND ${objcopy} --only-keep-debug "${file}" "${file}.debug"
        COMMAND ${objcopy} --strip-all "--add-gnu-debuglink=${file}.debug" "${file}"
        BYPRODUCTS "${CMAKE_RUNTIME_OUTPUT_DIRECTORY}/${target}.dll.debug"
        VERBATIM)
endfunction()
