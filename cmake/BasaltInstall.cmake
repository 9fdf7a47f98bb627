# Installs headers, library, find_package(basalt) and basalt.pc, as three components: the shared library, the
# development files, and the static archive, which joins the development files of the shared library's package.
include(GNUInstallDirs)
include(CMakePackageConfigHelpers)

install(TARGETS basalt EXPORT basalt-targets
  LIBRARY DESTINATION ${CMAKE_INSTALL_LIBDIR} COMPONENT runtime NAMELINK_COMPONENT development
  ARCHIVE DESTINATION ${CMAKE_INSTALL_LIBDIR} COMPONENT archive
  INCLUDES DESTINATION ${CMAKE_INSTALL_INCLUDEDIR})
install(DIRECTORY ${PROJECT_SOURCE_DIR}/include/basalt DESTINATION ${CMAKE_INSTALL_INCLUDEDIR} COMPONENT development)
install(FILES ${PROJECT_BINARY_DIR}/include/basalt/version.h
  DESTINATION ${CMAKE_INSTALL_INCLUDEDIR}/basalt COMPONENT development)

# A static archive needs the standard library named where it is linked.
if(BUILD_SHARED_LIBS)
  set(pc_static_libs "\nLibs.private: -lstdc++ -lm")
else()
  set(pc_static_libs " -lstdc++ -lm")
endif()

set(config_dir ${CMAKE_INSTALL_LIBDIR}/cmake/basalt)
install(EXPORT basalt-targets NAMESPACE basalt:: DESTINATION ${config_dir} COMPONENT development)
configure_package_config_file(cmake/basalt-config.cmake.in ${PROJECT_BINARY_DIR}/basalt-config.cmake
  INSTALL_DESTINATION ${config_dir})
write_basic_package_version_file(${PROJECT_BINARY_DIR}/basalt-config-version.cmake
  COMPATIBILITY SameMajorVersion)
install(FILES ${PROJECT_BINARY_DIR}/basalt-config.cmake ${PROJECT_BINARY_DIR}/basalt-config-version.cmake
  cmake/BasaltVersionResource.cmake cmake/version_resource.cpp.in
  DESTINATION ${config_dir} COMPONENT development)

# The installed tree may be moved as a whole: basalt.pc has paths relative to itself, as the CMake package has.
set(pc_libdir "${CMAKE_INSTALL_FULL_LIBDIR}")
set(pc_includedir "${CMAKE_INSTALL_FULL_INCLUDEDIR}")
set(pc_prefix "${CMAKE_INSTALL_PREFIX}")
if(NOT IS_ABSOLUTE "${CMAKE_INSTALL_LIBDIR}" AND NOT IS_ABSOLUTE "${CMAKE_INSTALL_INCLUDEDIR}")
  file(RELATIVE_PATH up "${CMAKE_INSTALL_FULL_LIBDIR}/pkgconfig" "${CMAKE_INSTALL_PREFIX}")
  string(REGEX REPLACE "/$" "" up "${up}")
  set(pc_prefix "\${pcfiledir}/${up}")
  set(pc_libdir "\${prefix}/${CMAKE_INSTALL_LIBDIR}")
  set(pc_includedir "\${prefix}/${CMAKE_INSTALL_INCLUDEDIR}")
endif()
configure_file(cmake/basalt.pc.in ${PROJECT_BINARY_DIR}/basalt.pc @ONLY)
install(FILES ${PROJECT_BINARY_DIR}/basalt.pc DESTINATION ${CMAKE_INSTALL_LIBDIR}/pkgconfig COMPONENT development)

if(BASALT_BUILD_DOCS)
  install(DIRECTORY ${PROJECT_BINARY_DIR}/docs/html
    DESTINATION ${CMAKE_INSTALL_DATADIR}/doc/basalt COMPONENT documentation OPTIONAL)
endif()
if(BASALT_IS_TOP_LEVEL)
  include(cmake/BasaltPackages.cmake)
endif()
