# What the scripts here share.

# run(<command>...): ends the test when the command fails.
function(run)
    execute_process(COMMAND ${ARGV} COMMAND_ERROR_IS_FATAL ANY)
endfunction()

file(GLOB package "${WORK}/unpacked/*") # the one folder in the zip

# What a project outside gets for its first configuration.
set(configure "${CMAKE_COMMAND}" -G Ninja -DCMAKE_BUILD_TYPE=Release "-DCMAKE_CXX_COMPILER_LAUNCHER=${CCACHE}")
