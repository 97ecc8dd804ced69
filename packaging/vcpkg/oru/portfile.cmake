# Builds the checkout that this file lies in:
#
#     vcpkg install oru --overlay-ports=packaging/vcpkg
#
# Not exercised by this repository's tests, which have no vcpkg. A port for a registry takes a release instead:
# vcpkg_from_github with the tag and its hash.
get_filename_component(SOURCE_PATH "${CMAKE_CURRENT_LIST_DIR}/../../.." ABSOLUTE)

vcpkg_find_acquire_program(PYTHON3)
vcpkg_cmake_configure(
    SOURCE_PATH "${SOURCE_PATH}"
    OPTIONS
        "-DPython3_EXECUTABLE=${PYTHON3}"
        -DORU_BUILD_TESTS=OFF
        -DORU_BUILD_BENCHMARKS=OFF
        -DORU_BUILD_APPS=OFF
        -DORU_WARNINGS_AS_ERRORS=OFF)
vcpkg_cmake_install()
vcpkg_cmake_config_fixup(CONFIG_PATH lib/cmake/oru)
vcpkg_fixup_pkgconfig()
vcpkg_copy_pdbs()

file(REMOVE_RECURSE "${CURRENT_PACKAGES_DIR}/debug/include")
vcpkg_install_copyright(FILE_LIST "${SOURCE_PATH}/LICENSE")
