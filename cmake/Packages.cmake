# The Debian packages, one for each group of installed components. `scripts/check-packages` builds and tries them.
set(library_package libtarvik-constraints-manager${PROJECT_VERSION_MAJOR})
set(development_package libtarvik-constraints-manager-dev)
set(tools_package tarvik-tools)
set(database_package tarvik-database)
set(python_package python3-tarvik)

set(library_components runtime)
set(development_components development documentation)
set(tools_components tool)
set(database_components data database)
set(python_components python)

set(CPACK_GENERATOR DEB)
set(CPACK_VERBATIM_VARIABLES ON)
set(CPACK_PACKAGE_NAME tarvik)
set(CPACK_PACKAGE_CONTACT "Tarvik Developers <developers@tarvik.invalid>")
set(CPACK_PACKAGE_DESCRIPTION_SUMMARY "") # each package has its own
set(CPACK_STRIP_FILES ON)
set(CPACK_DEB_COMPONENT_INSTALL ON)
set(CPACK_COMPONENTS_GROUPING ONE_PER_GROUP)
set(CPACK_DEBIAN_FILE_NAME DEB-DEFAULT)
set(CPACK_DEBIAN_PACKAGE_RELEASE 1)
set(CPACK_DEBIAN_PACKAGE_CONTROL_STRICT_PERMISSION ON)
set(CPACK_PRE_BUILD_SCRIPTS ${PROJECT_SOURCE_DIR}/cmake/debian/BeforePackaging.cmake)
set(CPACK_POST_BUILD_SCRIPTS ${PROJECT_SOURCE_DIR}/cmake/debian/AfterPackaging.cmake)
set(this_version "(= ${PROJECT_VERSION}-${CPACK_DEBIAN_PACKAGE_RELEASE})")

set(CPACK_DEBIAN_LIBRARY_PACKAGE_SECTION libs)
set(CPACK_DEBIAN_LIBRARY_PACKAGE_SHLIBDEPS ON)
set(CPACK_DEBIAN_PACKAGE_SHLIBDEPS_PRIVATE_DIRS # the manager needs the host layer, which is in the same package
  ${PROJECT_BINARY_DIR}/host ${PROJECT_BINARY_DIR}/s)
set(CPACK_DEBIAN_PACKAGE_GENERATE_SHLIBS ON)
set(CPACK_DEBIAN_PACKAGE_GENERATE_SHLIBS_POLICY ">=")
set(CPACK_DEBIAN_LIBRARY_PACKAGE_RECOMMENDS ${database_package})
set(CPACK_DEBIAN_LIBRARY_DESCRIPTION "what a device-programming application may offer
A library that tells a device-programming application what it may offer its
user for a device: an FPGA, a CPLD, a configuration PROM, an SPI or BPI flash.
It answers from text files which operations, options and properties there are,
and whether an operation may run in a mode through a cable.

This package holds the shared libraries: the manager, its host layer, and the
interface for C.")

set(CPACK_DEBIAN_DEVELOPMENT_PACKAGE_SECTION libdevel)
set(CPACK_DEBIAN_DEVELOPMENT_PACKAGE_DEPENDS "${library_package} ${this_version}")
set(CPACK_DEBIAN_DEVELOPMENT_PACKAGE_SUGGESTS ${tools_package})
set(CPACK_DEBIAN_DEVELOPMENT_DESCRIPTION "device-programming constraints - development files
A library that tells a device-programming application what it may offer its
user for a device.

This package holds what applications are built with: headers, a CMake package,
a pkg-config file, guides and an example.")

set(CPACK_DEBIAN_TOOLS_PACKAGE_SECTION devel)
set(CPACK_DEBIAN_TOOLS_PACKAGE_SHLIBDEPS ON)
set(CPACK_DEBIAN_TOOLS_PACKAGE_RECOMMENDS ${database_package})
# A trigger keeps the index of the installed database current.
set(CPACK_DEBIAN_TOOLS_PACKAGE_CONTROL_EXTRA
  ${PROJECT_SOURCE_DIR}/cmake/debian/tools/postinst
  ${PROJECT_SOURCE_DIR}/cmake/debian/tools/postrm
  ${PROJECT_SOURCE_DIR}/cmake/debian/tools/triggers)
set(CPACK_DEBIAN_TOOLS_DESCRIPTION "device-programming constraints - command-line tool
The command tarvik asks a device database what a device-programming
application may offer for a device, explains each answer by the record that
gives it, and checks and compares databases for those who write them.")

set(CPACK_DEBIAN_DATABASE_PACKAGE_SECTION misc)
set(CPACK_DEBIAN_DATABASE_PACKAGE_ARCHITECTURE all)
set(CPACK_DEBIAN_DATABASE_PACKAGE_ENHANCES "${library_package}, ${tools_package}")
set(CPACK_DEBIAN_DATABASE_DESCRIPTION "device-programming constraints - demonstration database
Text files that describe a dozen families of invented devices, and show by
example how a device database is written. While this package is installed
they are the database that libtarvik-constraints-manager finds by itself.")

set(CPACK_DEBIAN_PYTHON_PACKAGE_SECTION python)
set(CPACK_DEBIAN_PYTHON_PACKAGE_ARCHITECTURE all)
set(CPACK_DEBIAN_PYTHON_PACKAGE_DEPENDS "python3 (>= 3.9), ${library_package} ${this_version}")
set(CPACK_DEBIAN_PYTHON_PACKAGE_RECOMMENDS ${database_package})
set(CPACK_DEBIAN_PYTHON_DESCRIPTION "device-programming constraints - Python 3 package
The module tarvik asks a device database what a device-programming application
can offer its user for a device: which operations, programming options and
properties there are, and whether an operation can run in a mode.

This package holds the module, with type hints.")

include(CPackComponent)
set(CPACK_COMPONENTS_ALL)
foreach(group library development tools database python)
  set(package ${${group}_package})
  string(TOUPPER ${group} upper_group)
  set(CPACK_DEBIAN_${upper_group}_PACKAGE_NAME ${package})

  # Notes that every package carries.
  set(notes DESTINATION ${CMAKE_INSTALL_DATADIR}/doc/${package} COMPONENT ${group}-notes EXCLUDE_FROM_ALL)
  install(FILES cmake/debian/copyright ${notes})
  install(FILES cmake/debian/changelog RENAME changelog.Debian ${notes})
  install(FILES CHANGELOG.md RENAME changelog ${notes})
  install(FILES cmake/debian/${group}.lintian-overrides RENAME ${package}
    DESTINATION ${CMAKE_INSTALL_DATADIR}/lintian/overrides COMPONENT ${group}-notes EXCLUDE_FROM_ALL)

  cpack_add_component_group(${group})
  foreach(component ${${group}_components} ${group}-notes)
    cpack_add_component(${component} GROUP ${group})
    list(APPEND CPACK_COMPONENTS_ALL ${component})
  endforeach()
endforeach()
include(CPack)
