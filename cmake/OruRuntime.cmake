# The run-time libraries of GCC. The library and its hosts share one copy: with one in each, the library throws
# with its own and the host catches with the host's, whose std::uncaught_exceptions() is then off by one for
# every exception caught (scope guards do not roll back, streams with unitbuf do not flush).
include_guard(GLOBAL)

option(ORU_STATIC_RUNTIME
    "Link GCC's run-time libraries into each program instead of sharing them (see docs/guide/deploying.md)" OFF)
set(ORU_RUNTIME_DLLS "") # what has to lie beside oru.dll
if(NOT MINGW)
    return()
endif()
if(ORU_STATIC_RUNTIME)
    add_link_options(-static)
    return()
endif()

# Debian's carry debug data, ten times their size. Without the variable strip puts the time of the day into them.
if(CMAKE_CXX_COMPILER_ID STREQUAL "GNU")
    set(ORU_GNU_CXX "${CMAKE_CXX_COMPILER}")
else()
    find_program(ORU_GNU_CXX x86_64-w64-mingw32-g++-posix REQUIRED)
endif()
find_program(ORU_GNU_STRIP NAMES x86_64-w64-mingw32-strip strip REQUIRED)
foreach(dll IN ITEMS libstdc++-6.dll libgcc_s_seh-1.dll libwinpthread-1.dll)
    execute_process(COMMAND "${ORU_GNU_CXX}" "-print-file-name=${dll}"
        OUTPUT_VARIABLE path OUTPUT_STRIP_TRAILING_WHITESPACE COMMAND_ERROR_IS_FATAL ANY)
    set(copy "${CMAKE_RUNTIME_OUTPUT_DIRECTORY}/${dll}")
    if(NOT EXISTS "${copy}" OR "${path}" IS_NEWER_THAN "${copy}")
        file(MAKE_DIRECTORY "${CMAKE_RUNTIME_OUTPUT_DIRECTORY}")
        execute_process(COMMAND "${CMAKE_COMMAND}" -E env SOURCE_DATE_EPOCH=0
            "${ORU_GNU_STRIP}" --strip-all -o "${copy}" "${path}" COMMAND_ERROR_IS_FATAL ANY)
    endif()
    list(APPEND ORU_RUNTIME_DLLS "${copy}")
endforeach()
