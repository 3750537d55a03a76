# A port to be used as an overlay from a checkout of this repository; see ../README.md.
get_filename_component(SOURCE_PATH "${CURRENT_PORT_DIR}/../../.." ABSOLUTE)

vcpkg_check_features(OUT_FEATURE_OPTIONS FEATURE_OPTIONS
    FEATURES
        models   ZOR_WITH_MODELS
        pictures ZOR_WITH_PICTURES
        pages    ZOR_WITH_PAGES
        exchange ZOR_WITH_EXCHANGE
)

vcpkg_find_acquire_program(PKGCONFIG)
vcpkg_cmake_configure(
    SOURCE_PATH "${SOURCE_PATH}"
    OPTIONS
        ${FEATURE_OPTIONS}
        "-DPKG_CONFIG_EXECUTABLE=${PKGCONFIG}"
        -DZOR_BUILD_TESTS=OFF
        -DZOR_BUILD_BENCH=OFF
        -DZOR_WITH_PYTHON=OFF
)
vcpkg_cmake_install()
vcpkg_copy_tools(TOOL_NAMES lyra AUTO_CLEAN)
vcpkg_cmake_config_fixup(PACKAGE_NAME ZORLyra CONFIG_PATH lib/cmake/ZORLyra)
vcpkg_fixup_pkgconfig()

file(REMOVE_RECURSE "${CURRENT_PACKAGES_DIR}/debug/include" "${CURRENT_PACKAGES_DIR}/debug/share")
vcpkg_install_copyright(FILE_LIST "${SOURCE_PATH}/packaging/debian/copyright")
