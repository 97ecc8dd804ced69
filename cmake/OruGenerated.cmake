# Runs the generator of catalogue/.
include_guard(GLOBAL)

# oru_generate(<name> <catalogue> <output> <sources>): the target <name> makes what the generator in the
# folder <catalogue> makes, below the folder <output>, anew when a file of <catalogue> changes. The variable
# <sources> gets its .cpp files, by which the list of a build follows the tables.
function(oru_generate name catalogue output sources)
    file(GLOB inputs CONFIGURE_DEPENDS "${catalogue}/*.py" "${catalogue}/*.tsv")
    set_property(DIRECTORY APPEND PROPERTY CMAKE_CONFIGURE_DEPENDS ${inputs})

    set(generator "${Python3_EXECUTABLE}" -B "${catalogue}/generate.py")
    execute_process(
        COMMAND ${generator} --list
        OUTPUT_VARIABLE outputs OUTPUT_STRIP_TRAILING_WHITESPACE
        COMMAND_ERROR_IS_FATAL ANY)
    string(REPLACE "\n" ";" outputs "${outputs}")
    list(TRANSFORM outputs PREPEND "${output}/")

    # The generator leaves unchanged files untouched, so a stamp tells that it ran.
    set(stamp "${output}/generated.stamp")
    add_custom_command(
        OUTPUT "${stamp}"
        BYPRODUCTS ${outputs}
        COMMAND ${generator} --output "${output}"
        COMMAND "${CMAKE_COMMAND}" -E touch "${stamp}"
        DEPENDS ${inputs}
        COMMENT "Generating ${name}"
        VERBATIM)
    add_custom_target(${name} DEPENDS "${stamp}")

    list(FILTER outputs INCLUDE REGEX "\\.cpp$")
    set(${sources} ${outputs} PARENT_SCOPE)
endfunction()
