# Installation: the library, its public headers and the packages that find_package(oru) and pkg-config read.
include_guard(GLOBAL)
include(CMakePackageConfigHelpers)

set(config_dir "${CMAKE_INSTALL_LIBDIR}/cmake/oru")

install(TARGETS oru EXPORT oruTargets)
install(FILES ${ORU_RUNTIME_DLLS} DESTINATION "${CMAKE_INSTALL_BINDIR}")

# The import library that Microsoft's linker takes: the same names, which are GNU's (docs/guide/compilers.md).
find_program(ORU_LLVM_DLLTOOL NAMES llvm-dlltool-14 llvm-dlltool)
if(MINGW AND ORU_LLVM_DLLTOOL)
    set(def "${CMAKE_CURRENT_BINARY_DIR}/oru.def")
    set(lib "${CMAKE_CURRENT_BINARY_DIR}/oru.lib")
    target_link_options(oru PRIVATE "LINKER:--output-def=${def}")
    add_custom_command(TARGET oru POST_BUILD
        COMMAND "${ORU_LLVM_DLLTOOL}" -m i386:x86-64 -D oru.dll -d "${def}" -l "${lib}"
        BYPRODUCTS "${def}" "${lib}"
        VERBATIM)
    install(FILES "${lib}" DESTINATION "${CMAKE_INSTALL_LIBDIR}")
endif()

# What Microsoft's SDK lacks of the Khronos registry's headers; the package puts it in sight only there.
foreach(header IN ITEMS GL/glext.h GL/wglext.h KHR/khrplatform.h)
    get_filename_component(folder "${header}" DIRECTORY)
    install(FILES "${ORU_KHRONOS_INCLUDE_DIR}/${header}"
        DESTINATION "${CMAKE_INSTALL_INCLUDEDIR}/oru/khronos/${folder}")
endforeach()
install(EXPORT oruTargets NAMESPACE oru:: DESTINATION "${config_dir}")
install(DIRECTORY "${PROJECT_SOURCE_DIR}/oru" "${PROJECT_BINARY_DIR}/generated/oru"
    DESTINATION "${CMAKE_INSTALL_INCLUDEDIR}"
    FILES_MATCHING PATTERN "*.h" PATTERN "*.inc"
    PATTERN "internal" EXCLUDE
    PATTERN "internalwindow.h" EXCLUDE)
list(TRANSFORM ORU_RUNTIME_DLLS REPLACE ".*/" "" OUTPUT_VARIABLE runtime_dlls)

configure_package_config_file("${PROJECT_SOURCE_DIR}/cmake/oruConfig.cmake.in"
    "${PROJECT_BINARY_DIR}/oruConfig.cmake" INSTALL_DESTINATION "${config_dir}"
    PATH_VARS CMAKE_INSTALL_BINDIR CMAKE_INSTALL_INCLUDEDIR)
# What CONTRIBUTING.md promises between versions.
set(compatibility SameMajorVersion)
if(PROJECT_VERSION_MAJOR EQUAL 0)
    set(compatibility SameMinorVersion)
endif()
write_basic_package_version_file("${PROJECT_BINARY_DIR}/oruConfigVersion.cmake" COMPATIBILITY ${compatibility})
install(FILES "${PROJECT_BINARY_DIR}/oruConfig.cmake" "${PROJECT_BINARY_DIR}/oruConfigVersion.cmake"
    DESTINATION "${config_dir}")

file(RELATIVE_PATH prefix_from_pc "/${CMAKE_INSTALL_LIBDIR}/pkgconfig" "/")
string(REGEX REPLACE "/$" "" prefix_from_pc "${prefix_from_pc}")
configure_file("${PROJECT_SOURCE_DIR}/cmake/oru.pc.in" "${PROJECT_BINARY_DIR}/oru.pc" @ONLY)
install(FILES "${PROJECT_BINARY_DIR}/oru.pc" DESTINATION "${CMAKE_INSTALL_LIBDIR}/pkgconfig")
