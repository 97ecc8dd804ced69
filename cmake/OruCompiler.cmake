# Compiler and linker settings of everything built here: language, warnings, reproducible output.
include_guard(GLOBAL)

set(CMAKE_CXX_STANDARD 17)
set(CMAKE_CXX_STANDARD_REQUIRED ON)
set(CMAKE_CXX_EXTENSIONS OFF)
set(CMAKE_EXPORT_COMPILE_COMMANDS ON)

# One folder for programs and the library: a Windows program finds a DLL beside itself. Inside another project
# that project decides.
if(PROJECT_IS_TOP_LEVEL OR NOT CMAKE_RUNTIME_OUTPUT_DIRECTORY)
    set(CMAKE_RUNTIME_OUTPUT_DIRECTORY "${PROJECT_BINARY_DIR}/bin")
endif()

# Windows headers: no min and max macros, nothing rarely used, the wide functions.
add_compile_definitions(NOMINMAX WIN32_LEAN_AND_MEAN UNICODE _UNICODE _WIN32_WINNT=0x0A00)

if(MSVC)
    add_compile_options(/W4 /permissive- /utf-8 /bigobj /Zc:__cplusplus)
    add_compile_options(/wd4324) # padding that an alignas asks for
    add_compile_definitions(_CRT_SECURE_NO_WARNINGS) # std::getenv
    if(ORU_WARNINGS_AS_ERRORS)
        add_compile_options(/WX)
    endif()
    add_link_options(/Brepro)
    return()
endif()

add_compile_options(
    -Wall -Wextra -Wpedantic -Wshadow -Wconversion -Wsign-conversion -Wcast-qual -Wextra-semi
    -Wnon-virtual-dtor -Wold-style-cast -Woverloaded-virtual -Wundef)
if(CMAKE_CXX_COMPILER_ID STREQUAL "Clang")
    # A check that is a negated text marks a branch that nothing reaches.
    add_compile_options(-Wno-string-conversion)
endif()
if(ORU_WARNINGS_AS_ERRORS)
    add_compile_options(-Werror)
endif()

# Source positions in messages, and so the bytes of the library, are relative to the repository and the
# build folder, whatever their place. ccache turns paths into relative ones, hence the last two mappings. The
# compiler tries the mappings from the last to the first.
file(RELATIVE_PATH source_from_build "${PROJECT_BINARY_DIR}" "${PROJECT_SOURCE_DIR}")
file(RELATIVE_PATH deps_from_build "${PROJECT_BINARY_DIR}" "${PROJECT_SOURCE_DIR}/build/deps")
add_compile_options(
    "-ffile-prefix-map=${PROJECT_SOURCE_DIR}/="
    "-ffile-prefix-map=${PROJECT_BINARY_DIR}=." # the folder of the compilation, in debug data
    "-ffile-prefix-map=${PROJECT_BINARY_DIR}/="
    "-ffile-prefix-map=${source_from_build}="
    "-ffile-prefix-map=${deps_from_build}=build/deps")
if(CMAKE_CXX_COMPILER_ID STREQUAL "GNU")
    add_compile_options(-fno-canonical-system-headers) # else links are followed to where the mappings do not reach
endif()

add_link_options(-Wl,--no-insert-timestamp)

find_program(ORU_CCACHE ccache)
if(ORU_CCACHE AND CMAKE_HOST_UNIX)
    set(CMAKE_CXX_COMPILER_LAUNCHER
        env "CCACHE_BASEDIR=${PROJECT_SOURCE_DIR}" CCACHE_NOHASHDIR=1 "${ORU_CCACHE}")
endif()
