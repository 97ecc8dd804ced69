# Source positions in the library and its debug data are relative to the repository: no path of the build machine is in
# them.
string(HEX "${SOURCE_DIR}/" path)
foreach(file IN LISTS FILES)
    if(EXISTS "${file}")
        file(READ "${file}" bytes HEX)
        if(bytes MATCHES "${path}")
            message(FATAL_ERROR "${file} contains ${SOURCE_DIR}")
        endif()
    endif()
endforeach()
