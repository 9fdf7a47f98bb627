# The package: headers, library, find_package(basalt) and basalt.pc.
include(GNUInstallDirs)
include(CMakePackageConfigHelpers)

install(TARGETS basalt EXPORT basalt-targets
  LIBRARY DESTINATION ${CMAKE_INSTALL_LIBDIR}
  ARCHIVE DESTINATION ${CMAKE_INSTALL_LIBDIR}
  INCLUDES DESTINATION ${CMAKE_INSTALL_INCLUDEDIR})
install(DIRECTORY ${PROJECT_SOURCE_DIR}/include/basalt DESTINATION ${CMAKE_INSTALL_INCLUDEDIR})
install(FILES ${PROJECT_BINARY_DIR}/include/basalt/version.h DESTINATION ${CMAKE_INSTALL_INCLUDEDIR}/basalt)

set(config_dir ${CMAKE_INSTALL_LIBDIR}/cmake/basalt)
install(EXPORT basalt-targets NAMESPACE basalt:: DESTINATION ${config_dir})
configure_package_config_file(cmake/basalt-config.cmake.in ${PROJECT_BINARY_DIR}/basalt-config.cmake
  INSTALL_DESTINATION ${config_dir})
# Before 1.0 a minor version may change the interface.
write_basic_package_version_file(${PROJECT_BINARY_DIR}/basalt-config-version.cmake
  COMPATIBILITY SameMinorVersion)
install(FILES ${PROJECT_BINARY_DIR}/basalt-config.cmake ${PROJECT_BINARY_DIR}/basalt-config-version.cmake
  DESTINATION ${config_dir})

if(BUILD_SHARED_LIBS)
  set(pc_static_libs "")
else()
  set(pc_static_libs "-lstdc++ -lm")
endif()
configure_file(cmake/basalt.pc.in ${PROJECT_BINARY_DIR}/basalt.pc @ONLY)
install(FILES ${PROJECT_BINARY_DIR}/basalt.pc DESTINATION ${CMAKE_INSTALL_LIBDIR}/pkgconfig)
