# The functions that the CMakeLists.txt of each folder use.
include_guard(GLOBAL)
include(GoogleTest)

# oru_add_subdirectories(): adds every folder below the current one that has a CMakeLists.txt.
function(oru_add_subdirectories)
    file(GLOB lists CONFIGURE_DEPENDS RELATIVE "${CMAKE_CURRENT_SOURCE_DIR}" */CMakeLists.txt)
    foreach(list IN LISTS lists)
        get_filename_component(folder "${list}" DIRECTORY)
        add_subdirectory("${folder}")
    endforeach()
endfunction()

# What an installation needs built; tools/package builds it.
add_custom_target(oru_installed)

# oru_install_program(<target>): installs a program, without symbols.
function(oru_install_program target)
    if(MINGW)
        target_link_options(${target} PRIVATE "$<$<CONFIG:Release>:LINKER:--strip-all>")
    endif()
    install(TARGETS ${target})
    add_dependencies(oru_installed ${target})
    oru_list_linked_files(${target})
endfunction()

# oru_list_linked_files(<target>): the linker lists the files it reads in <target>.linked of the build folder, by
# which tools/package knows whose work the file contains.
function(oru_list_linked_files target)
    if(MINGW)
        target_link_options(${target} PRIVATE "LINKER:--dependency-file=${PROJECT_BINARY_DIR}/${target}.linked")
    endif()
endfunction()

# oru_add_test(<name> SOURCES <file>... [LIBRARIES <target>...] [ENVIRONMENT <VAR=value>...]
#              [TIMEOUT <seconds>] [INTERNAL] [VARIANTS_ONLY])
# A GoogleTest program, each of its cases a test of CTest, run with ENVIRONMENT and ended after TIMEOUT
# (60 s unless told). With an ENVIRONMENT its tests are named "<name>/Suite.Name", so that several programs
# can run the same cases, each in its own. INTERNAL links the library's objects instead of the DLL, to
# reach what it does not export. With VARIANTS_ONLY the program runs as oru_add_test_variant says alone.
function(oru_add_test name)
    cmake_parse_arguments(arg "INTERNAL;VARIANTS_ONLY" "TIMEOUT" "SOURCES;LIBRARIES;ENVIRONMENT" ${ARGN})
    if(arg_UNPARSED_ARGUMENTS)
        message(FATAL_ERROR "oru_add_test(${name}): unknown arguments ${arg_UNPARSED_ARGUMENTS}")
    endif()
    if(NOT arg_TIMEOUT)
        set(arg_TIMEOUT 60)
    endif()
    if(ORU_COVERAGE)
        math(EXPR arg_TIMEOUT "5 * ${arg_TIMEOUT}") # counting takes its time
    endif()
    add_executable(${name} ${arg_SOURCES})
    if(arg_INTERNAL)
        target_link_libraries(${name} PRIVATE oru_static)
    else()
        target_link_libraries(${name} PRIVATE oru)
    endif()
    target_link_libraries(${name} PRIVATE ${arg_LIBRARIES} GTest::gmock GTest::gtest_main)
    if(ORU_TESTS_HAVE_LINES)
        oru_count_lines(${name})
    endif()
    list(TRANSFORM arg_SOURCES PREPEND "${CMAKE_CURRENT_SOURCE_DIR}/" OUTPUT_VARIABLE sources)
    set_property(GLOBAL APPEND_STRING PROPERTY ORU_TEST_PROGRAMS "${name}\t${sources}\n")

    set(prefix "")
    if(arg_ENVIRONMENT)
        set(prefix "${name}/")
    endif()
    if(NOT arg_VARIANTS_ONLY)
        oru_discover_tests(${name} "${prefix}" ${name}_TESTS ${arg_TIMEOUT} "${arg_ENVIRONMENT}" "")
    endif()
endfunction()

# oru_add_test_variant(<name> <program> ENVIRONMENT <VAR=value>... [FILTER <expression>])
# Runs the cases of a test program, or those that a filter of GoogleTest's chooses, once more with ENVIRONMENT, as
# "<name>/Suite.Name".
function(oru_add_test_variant name program)
    cmake_parse_arguments(arg "" "FILTER" "ENVIRONMENT" ${ARGN})
    oru_discover_tests(${program} "${name}/" ${name}_TESTS 60 "${arg_ENVIRONMENT}" "${arg_FILTER}")
endfunction()

# Makes each case of a program, all or those of a filter, a test of CTest; `list` is a name for all of them.
function(oru_discover_tests program prefix list timeout environment filter)
    if(filter)
        set(filter TEST_FILTER "${filter}")
    endif()
    gtest_discover_tests(${program} ${filter}
        TEST_PREFIX "${prefix}"
        TEST_LIST ${list}
        DISCOVERY_MODE PRE_TEST
        DISCOVERY_TIMEOUT 60
        NO_PRETTY_TYPES NO_PRETTY_VALUES
        PROPERTIES TIMEOUT ${timeout})
    if(environment)
        # A property that is a list does not survive gtest_discover_tests: set it once the tests are known.
        set(script "${CMAKE_CURRENT_BINARY_DIR}/${list}_environment.cmake")
        file(CONFIGURE OUTPUT "${script}" @ONLY CONTENT
            "set_tests_properties(\${@list@} PROPERTIES ENVIRONMENT [==[@environment@]==])\n")
        set_property(DIRECTORY APPEND PROPERTY TEST_INCLUDE_FILES "${script}")
    endif()
endfunction()

# oru_add_benchmark(<name> SOURCES <file>... [LIBRARIES <target>...] [INTERNAL])
# A Google Benchmark program; tools/bench runs every one. INTERNAL as for a test.
function(oru_add_benchmark name)
    cmake_parse_arguments(arg "INTERNAL" "" "SOURCES;LIBRARIES" ${ARGN})
    add_executable(${name} ${arg_SOURCES})
    if(arg_INTERNAL)
        target_link_libraries(${name} PRIVATE oru_static)
    else()
        target_link_libraries(${name} PRIVATE oru)
    endif()
    target_link_libraries(${name} PRIVATE ${arg_LIBRARIES} benchmark::benchmark_main)
    set_property(GLOBAL APPEND PROPERTY ORU_BENCHMARKS ${name})
endfunction()
