# Debian packages, made by cpack: library, development files, tool, documentation. scripts/debian_packages.sh makes all
# of them, with the static archive, and the source archive.
set(CPACK_PACKAGE_NAME basalt)
set(CPACK_PACKAGE_CONTACT "The authors of basalt")
set(CPACK_PACKAGE_DESCRIPTION_SUMMARY "${PROJECT_DESCRIPTION}")
set(CPACK_PACKAGE_VERSION "${PROJECT_VERSION}")
set(CPACK_PACKAGING_INSTALL_PREFIX /usr)
set(CPACK_GENERATOR DEB)
set(CPACK_STRIP_FILES ON)
set(CPACK_DEB_COMPONENT_INSTALL ON)
set(CPACK_DEBIAN_FILE_NAME DEB-DEFAULT)
set(CPACK_DEBIAN_PACKAGE_RELEASE 1)
set(CPACK_DEBIAN_PACKAGE_PRIORITY optional)

# The run-time package is named after the soname, so that two interfaces can be installed together.
get_target_property(basalt_soversion basalt SOVERSION)
set(CPACK_DEBIAN_RUNTIME_PACKAGE_NAME "libbasalt${basalt_soversion}")
set(CPACK_DEBIAN_RUNTIME_PACKAGE_SECTION libs)
set(CPACK_DEBIAN_RUNTIME_PACKAGE_SHLIBDEPS ON)
set(CPACK_DEBIAN_PACKAGE_GENERATE_SHLIBS ON)
set(CPACK_DEBIAN_PACKAGE_GENERATE_SHLIBS_POLICY ">=")
set(CPACK_COMPONENT_RUNTIME_DESCRIPTION "Runtime library for surveying and machine control
 Survey geometry and geodesy, a sparse grid store, allocators on mapped memory,
 logs, paths, colours and bitmaps.")

set(CPACK_DEBIAN_DEVELOPMENT_PACKAGE_NAME libbasalt-dev)
set(CPACK_DEBIAN_DEVELOPMENT_PACKAGE_SECTION libdevel)
set(CPACK_DEBIAN_DEVELOPMENT_PACKAGE_DEPENDS
  "${CPACK_DEBIAN_RUNTIME_PACKAGE_NAME} (= ${PROJECT_VERSION}-${CPACK_DEBIAN_PACKAGE_RELEASE})")
set(CPACK_COMPONENT_DEVELOPMENT_DESCRIPTION "Headers and archives of basalt
 What a program needs to be built against the basalt runtime library.")

set(CPACK_DEBIAN_TOOLS_PACKAGE_NAME basalt)
set(CPACK_DEBIAN_TOOLS_PACKAGE_SECTION science)
set(CPACK_DEBIAN_TOOLS_PACKAGE_SHLIBDEPS OFF)
set(CPACK_DEBIAN_TOOLS_PACKAGE_DEPENDS
  "${CPACK_DEBIAN_RUNTIME_PACKAGE_NAME} (= ${PROJECT_VERSION}-${CPACK_DEBIAN_PACKAGE_RELEASE})")
set(CPACK_COMPONENT_TOOLS_DESCRIPTION "Geodesy, time and text conversions as filters
 The basalt runtime library's conversions over standard input, line by line.")

set(CPACK_DEBIAN_DOCUMENTATION_PACKAGE_NAME basalt-doc)
set(CPACK_DEBIAN_DOCUMENTATION_PACKAGE_SECTION doc)
set(CPACK_DEBIAN_DOCUMENTATION_PACKAGE_ARCHITECTURE all)
set(CPACK_COMPONENT_DOCUMENTATION_DESCRIPTION "Reference and guides of basalt
 The reference pages and guides of the basalt runtime library, for a browser.")

# Licence, changes, and the examples with the sources they share, where Debian looks for them.
option(BASALT_PACKAGE_DOCS "Install what Debian packages carry as documentation" OFF)
if(BASALT_PACKAGE_DOCS)
  execute_process(COMMAND gzip -9nc ${PROJECT_SOURCE_DIR}/CHANGELOG.md OUTPUT_FILE ${PROJECT_BINARY_DIR}/changelog.gz)
  foreach(component RUNTIME DEVELOPMENT TOOLS DOCUMENTATION)
    string(TOLOWER ${component} name)
    install(FILES ${PROJECT_SOURCE_DIR}/cmake/copyright ${PROJECT_BINARY_DIR}/changelog.gz
      DESTINATION ${CMAKE_INSTALL_DATADIR}/doc/${CPACK_DEBIAN_${component}_PACKAGE_NAME} COMPONENT ${name})
  endforeach()
  install(DIRECTORY ${PROJECT_SOURCE_DIR}/examples ${PROJECT_SOURCE_DIR}/console
    DESTINATION ${CMAKE_INSTALL_DATADIR}/doc/${CPACK_DEBIAN_DOCUMENTATION_PACKAGE_NAME} COMPONENT documentation
    PATTERN "*test*" EXCLUDE PATTERN "*.facts" EXCLUDE)
endif()

include(CPack)
