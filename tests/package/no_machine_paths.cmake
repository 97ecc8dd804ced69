# Source positions in the library are relative to the repository: no path of the build machine is in it,
# and the mapping itself works.
file(READ "${LIBRARY}" bytes HEX)
string(HEX "${SOURCE_DIR}/" path)
if(bytes MATCHES "${path}")
    message(FATAL_ERROR "${LIBRARY} contains ${SOURCE_DIR}")
endif()
string(HEX "oru/oru_ogl/" relative)
if(NOT bytes MATCHES "${relative}")
    message(FATAL_ERROR "${LIBRARY} contains no source position of oru/oru_ogl")
endif()
