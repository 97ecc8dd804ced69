# The unpacked package without find_package: pkg-config, the macros that its headers leave behind, the examples, and
# the import library for Microsoft's linker.
include("${CMAKE_CURRENT_LIST_DIR}/run.cmake")
set(work "${WORK}/other")
file(REMOVE_RECURSE "${work}")
file(MAKE_DIRECTORY "${work}")
file(GLOB dlls "${package}/bin/*.dll")
file(COPY ${dlls} DESTINATION "${work}")
set(gcc x86_64-w64-mingw32-g++-posix -std=c++17)

foreach(question IN ITEMS "--modversion" "--cflags;--libs")
    execute_process(COMMAND "${CMAKE_COMMAND}" -E env "PKG_CONFIG_LIBDIR=${package}/lib/pkgconfig"
            pkg-config ${question} oru
        OUTPUT_VARIABLE answer OUTPUT_STRIP_TRAILING_WHITESPACE COMMAND_ERROR_IS_FATAL ANY)
    list(APPEND answers "${answer}")
endforeach()
list(POP_FRONT answers version)
separate_arguments(flags UNIX_COMMAND "${answers}")
run(${gcc} "-DPACKAGE_VERSION=\"${version}\"" "${CMAKE_CURRENT_LIST_DIR}/consumer/main.cpp"
    -o "${work}/pkgconfig.exe" ${flags})
run(${EMULATOR} "${work}/pkgconfig.exe")

run("${PYTHON}" -B "${CMAKE_CURRENT_LIST_DIR}/macros.py" "${package}/include"
    ${gcc} "-I${package}/include" -isystem "${OPENCL_INCLUDE_DIR}")

run(${configure} -S "${package}/examples" -B "${work}/examples" "-Doru_DIR=${package}/lib/cmake/oru"
    "-DCMAKE_TOOLCHAIN_FILE=${TOOLCHAIN_FILE}" # which knows where libpng, libjpeg and libtiff are
    "-DORU_OPENCL_INCLUDE_DIR=${OPENCL_INCLUDE_DIR}")
run("${CMAKE_COMMAND}" --build "${work}/examples")
run(${EMULATOR} "${work}/examples/bin/hello_offscreen.exe" "${work}/hello.png")
run(${EMULATOR} "${work}/examples/bin/saxpy.exe")

run(clang++ --target=x86_64-pc-windows-msvc -std=c++17 "-I${package}/include"
    -c "${CMAKE_CURRENT_LIST_DIR}/msvc_host.cpp" -o "${work}/msvc_host.obj")
run(lld-link-14 /nologo /nodefaultlib /entry:Start /subsystem:console "/out:${work}/msvc_host.exe"
    "${work}/msvc_host.obj" "${package}/lib/oru.lib")
run(${EMULATOR} "${work}/msvc_host.exe")
