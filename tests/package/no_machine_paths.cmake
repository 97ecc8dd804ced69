# Source positions in the library are relative to the repository: no path of the build machine is in it.
file(READ "${LIBRARY}" bytes HEX)
string(HEX "${SOURCE_DIR}/" path)
if(bytes MATCHES "${path}")
    message(FATAL_ERROR "${LIBRARY} contains ${SOURCE_DIR}")
endif()
