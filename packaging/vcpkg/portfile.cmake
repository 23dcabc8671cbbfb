# An overlay port that builds the tree it lies in: vcpkg install qxcore11e --overlay-ports=packaging/vcpkg
get_filename_component(SOURCE_PATH "${CMAKE_CURRENT_LIST_DIR}/../.." ABSOLUTE)

vcpkg_check_features(OUT_FEATURE_OPTIONS feature_options FEATURES tools QXCORE_TOOLS)
vcpkg_cmake_configure(
  SOURCE_PATH "${SOURCE_PATH}"
  OPTIONS -DQXCORE_TESTS=OFF -DQXCORE_WERROR=OFF ${feature_options})
vcpkg_cmake_install()
vcpkg_cmake_config_fixup(PACKAGE_NAME qxcore11e CONFIG_PATH lib/cmake/qxcore11e)
vcpkg_fixup_pkgconfig()
if("tools" IN_LIST FEATURES)
  vcpkg_copy_tools(TOOL_NAMES qxtool qxworkbench AUTO_CLEAN)
endif()
file(REMOVE_RECURSE "${CURRENT_PACKAGES_DIR}/debug/include" "${CURRENT_PACKAGES_DIR}/debug/share")
file(INSTALL "${CMAKE_CURRENT_LIST_DIR}/usage" DESTINATION "${CURRENT_PACKAGES_DIR}/share/${PORT}")
# The tree states no licence; vcpkg wants a file of that name.
file(WRITE "${CURRENT_PACKAGES_DIR}/share/${PORT}/copyright" "The source tree states no licence.\n")
