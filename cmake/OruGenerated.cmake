# Runs catalogue/generate.py: its .cpp files are sources of the library, made anew when any file of
# catalogue/ changes.
include_guard(GLOBAL)

set(generator "${PROJECT_SOURCE_DIR}/catalogue/generate.py")
set(generated_dir "${PROJECT_BINARY_DIR}/generated")
if(NOT EXISTS "${generator}")
    add_custom_target(oru_generated)
    return()
endif()

file(GLOB_RECURSE inputs CONFIGURE_DEPENDS "${PROJECT_SOURCE_DIR}/catalogue/*")
list(FILTER inputs EXCLUDE REGEX "__pycache__")
set_property(DIRECTORY APPEND PROPERTY CMAKE_CONFIGURE_DEPENDS ${inputs})

set(generate "${Python3_EXECUTABLE}" -B "${generator}" --output "${generated_dir}")
execute_process(
    COMMAND "${Python3_EXECUTABLE}" -B "${generator}" --list
    OUTPUT_VARIABLE outputs OUTPUT_STRIP_TRAILING_WHITESPACE
    COMMAND_ERROR_IS_FATAL ANY)
string(REPLACE "\n" ";" outputs "${outputs}")
list(TRANSFORM outputs PREPEND "${generated_dir}/" REGEX "^[^/]")

# The generator leaves unchanged files untouched, so a stamp tells that it ran.
set(stamp "${generated_dir}/generated.stamp")
add_custom_command(
    OUTPUT "${stamp}"
    BYPRODUCTS ${outputs}
    COMMAND ${generate}
    COMMAND "${CMAKE_COMMAND}" -E touch "${stamp}"
    DEPENDS ${inputs}
    COMMENT "Generating from catalogue/"
    VERBATIM)
add_custom_target(oru_generated DEPENDS "${stamp}")

set(sources ${outputs})
list(FILTER sources INCLUDE REGEX "\\.cpp$")
target_sources(oru PRIVATE ${sources})
add_dependencies(oru oru_generated)
