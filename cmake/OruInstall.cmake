# Installation: the library, its public headers and the package that find_package(oru) reads.
include_guard(GLOBAL)
include(CMakePackageConfigHelpers)

set(config_dir "${CMAKE_INSTALL_LIBDIR}/cmake/oru")

install(TARGETS oru EXPORT oruTargets)
install(FILES ${ORU_RUNTIME_DLLS} DESTINATION "${CMAKE_INSTALL_BINDIR}")

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
write_basic_package_version_file("${PROJECT_BINARY_DIR}/oruConfigVersion.cmake"
    COMPATIBILITY SameMinorVersion)
install(FILES "${PROJECT_BINARY_DIR}/oruConfig.cmake" "${PROJECT_BINARY_DIR}/oruConfigVersion.cmake"
    DESTINATION "${config_dir}")
