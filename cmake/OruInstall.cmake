# Installation: the library, its public headers and the package that find_package(oru) reads.
include_guard(GLOBAL)
include(CMakePackageConfigHelpers)

set(config_dir "${CMAKE_INSTALL_LIBDIR}/cmake/oru")

install(TARGETS oru EXPORT oruTargets)
install(EXPORT oruTargets NAMESPACE oru:: DESTINATION "${config_dir}")
install(DIRECTORY "${PROJECT_SOURCE_DIR}/oru" "${PROJECT_BINARY_DIR}/generated/oru"
    DESTINATION "${CMAKE_INSTALL_INCLUDEDIR}"
    FILES_MATCHING PATTERN "*.h" PATTERN "*.inc"
    PATTERN "internal" EXCLUDE
    PATTERN "internalwindow.h" EXCLUDE)

configure_package_config_file("${PROJECT_SOURCE_DIR}/cmake/oruConfig.cmake.in"
    "${PROJECT_BINARY_DIR}/oruConfig.cmake" INSTALL_DESTINATION "${config_dir}")
write_basic_package_version_file("${PROJECT_BINARY_DIR}/oruConfigVersion.cmake"
    COMPATIBILITY SameMinorVersion)
install(FILES "${PROJECT_BINARY_DIR}/oruConfig.cmake" "${PROJECT_BINARY_DIR}/oruConfigVersion.cmake"
    DESTINATION "${config_dir}")
