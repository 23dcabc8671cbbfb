# Headers, library, CMake package and pkg-config file.
include(CMakePackageConfigHelpers)
set(package_dir ${CMAKE_INSTALL_LIBDIR}/cmake/qxcore11e)

install(TARGETS qxcore11e EXPORT qxcore11e-targets
  RUNTIME COMPONENT runtime
  LIBRARY COMPONENT runtime NAMELINK_COMPONENT dev
  ARCHIVE COMPONENT dev
  FILE_SET HEADERS COMPONENT dev
  INCLUDES DESTINATION ${CMAKE_INSTALL_INCLUDEDIR})
install(EXPORT qxcore11e-targets NAMESPACE qxcore11e:: DESTINATION ${package_dir} COMPONENT dev)
configure_package_config_file(cmake/qxcore11e-config.cmake.in ${PROJECT_BINARY_DIR}/qxcore11e-config.cmake
  INSTALL_DESTINATION ${package_dir})
write_basic_package_version_file(${PROJECT_BINARY_DIR}/qxcore11e-config-version.cmake COMPATIBILITY SameMajorVersion)
install(FILES ${PROJECT_BINARY_DIR}/qxcore11e-config.cmake ${PROJECT_BINARY_DIR}/qxcore11e-config-version.cmake
  DESTINATION ${package_dir} COMPONENT dev)

# The prefix is computed from where the .pc file lies, so that the folder can be moved.
cmake_path(RELATIVE_PATH CMAKE_INSTALL_PREFIX BASE_DIRECTORY ${CMAKE_INSTALL_PREFIX}/${CMAKE_INSTALL_LIBDIR}/pkgconfig
  OUTPUT_VARIABLE pc_prefix)
set(pc_defines "")
if(WIN32)
  set(pc_defines "-DUNICODE -D_UNICODE")
endif()
configure_file(cmake/qxcore11e.pc.in ${PROJECT_BINARY_DIR}/qxcore11e.pc @ONLY)
install(FILES ${PROJECT_BINARY_DIR}/qxcore11e.pc DESTINATION ${CMAKE_INSTALL_LIBDIR}/pkgconfig COMPONENT dev)
install(FILES README.md CHANGELOG.md DESTINATION ${CMAKE_INSTALL_DOCDIR} COMPONENT dev)

if(WIN32)
  # The DLL needs the compiler's runtime beside it.
  foreach(dll libgcc_s_dw2-1.dll libstdc++-6.dll)
    execute_process(COMMAND ${CMAKE_CXX_COMPILER} -print-file-name=${dll} OUTPUT_VARIABLE path OUTPUT_STRIP_TRAILING_WHITESPACE)
    install(FILES ${path} DESTINATION ${CMAKE_INSTALL_BINDIR} COMPONENT runtime)
  endforeach()
  find_file(WINPTHREAD_DLL libwinpthread-1.dll PATHS /usr/i686-w64-mingw32/lib /usr/i686-w64-mingw32/bin NO_DEFAULT_PATH)
  find_file(ZLIB_DLL zlib1.dll PATHS /usr/i686-w64-mingw32/lib /usr/i686-w64-mingw32/bin NO_DEFAULT_PATH)
  foreach(path ${WINPTHREAD_DLL} ${ZLIB_DLL})
    install(FILES ${path} DESTINATION ${CMAKE_INSTALL_BINDIR} COMPONENT runtime)
  endforeach()
endif()

# Debuggers: gdb loads the printers by itself where they lie beside the library.
if(WIN32)
  install(FILES tools/debug/qxcore11e.natvis tools/debug/qxcore_printers.py DESTINATION ${CMAKE_INSTALL_DATADIR}/qxcore11e COMPONENT dev)
else()
  install(FILES tools/debug/qxcore_printers.py DESTINATION ${CMAKE_INSTALL_LIBDIR} RENAME libqxcore11e.so.${PROJECT_VERSION}-gdb.py COMPONENT dev)
endif()
