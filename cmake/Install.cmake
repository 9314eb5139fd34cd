# What `cmake --install` puts where, by component: runtime, development, tool, data, documentation; and, only when asked
# for by name, database. An installed tree can be moved: everything is found from its own place.
include(GNUInstallDirs)
include(CMakePackageConfigHelpers)

set(package_directory ${CMAKE_INSTALL_LIBDIR}/cmake/TarvikConstraintsManager)
set(libraries TarvikConstraintsManager)

set_target_properties(TarvikConstraintsManager PROPERTIES EXPORT_NAME ConstraintsManager INSTALL_RPATH "$ORIGIN")
target_include_directories(TarvikConstraintsManager PUBLIC $<INSTALL_INTERFACE:${CMAKE_INSTALL_INCLUDEDIR}>)
install(DIRECTORY include/tarvik DESTINATION ${CMAKE_INSTALL_INCLUDEDIR} COMPONENT development
  PATTERN tarvik.h EXCLUDE)

if(TARVIK_HOST)
  # Applications find somebody else's host by its own package.
  if(NOT host_package)
    message(FATAL_ERROR "TARVIK_HOST is the target ${TARVIK_HOST}. To install the manager, "
      "set TARVIK_HOST_PACKAGE to the CMake package in which applications find that target.")
  endif()
  set(find_host "include(CMakeFindDependencyMacro)\nfind_dependency(${host_package})")
  set(host_flags "")
  set(host_libraries "")
else()
  set(host_headers ${CMAKE_INSTALL_INCLUDEDIR}/tarvik/host)
  list(APPEND libraries TarvikHost TarvikC)
  set_target_properties(TarvikHost PROPERTIES EXPORT_NAME Host INSTALL_RPATH "$ORIGIN")
  target_include_directories(TarvikHost PUBLIC
    $<INSTALL_INTERFACE:${host_headers}> $<INSTALL_INTERFACE:${CMAKE_INSTALL_INCLUDEDIR}>)
  install(DIRECTORY host/include/ DESTINATION ${host_headers} COMPONENT development)
  install(FILES include/tarvik/tarvik.h DESTINATION ${CMAKE_INSTALL_INCLUDEDIR}/tarvik COMPONENT development)
  set_target_properties(TarvikC PROPERTIES EXPORT_NAME C INSTALL_RPATH "$ORIGIN")
  target_include_directories(TarvikC PUBLIC $<INSTALL_INTERFACE:${CMAKE_INSTALL_INCLUDEDIR}>)
  set(find_host "")
  set(host_flags " -I\${includedir}/tarvik/host")
  set(host_libraries " -lTarvikHost")
endif()

install(TARGETS ${libraries} EXPORT TarvikConstraintsManagerTargets
  RUNTIME DESTINATION ${CMAKE_INSTALL_BINDIR} COMPONENT runtime
  LIBRARY DESTINATION ${CMAKE_INSTALL_LIBDIR} COMPONENT runtime NAMELINK_COMPONENT development
  ARCHIVE DESTINATION ${CMAKE_INSTALL_LIBDIR} COMPONENT development)
install(EXPORT TarvikConstraintsManagerTargets NAMESPACE Tarvik::
  DESTINATION ${package_directory} COMPONENT development)
configure_file(cmake/TarvikConstraintsManagerConfig.cmake.in TarvikConstraintsManagerConfig.cmake @ONLY)
write_basic_package_version_file(TarvikConstraintsManagerConfigVersion.cmake COMPATIBILITY SameMajorVersion)
install(FILES
  ${CMAKE_CURRENT_BINARY_DIR}/TarvikConstraintsManagerConfig.cmake
  ${CMAKE_CURRENT_BINARY_DIR}/TarvikConstraintsManagerConfigVersion.cmake
  DESTINATION ${package_directory} COMPONENT development)

file(RELATIVE_PATH prefix_from_pkgconfig /${CMAKE_INSTALL_LIBDIR}/pkgconfig /)
configure_file(cmake/tarvik-constraints-manager.pc.in tarvik-constraints-manager.pc @ONLY)
install(FILES ${CMAKE_CURRENT_BINARY_DIR}/tarvik-constraints-manager.pc
  DESTINATION ${CMAKE_INSTALL_LIBDIR}/pkgconfig COMPONENT development)
if(TARGET TarvikC)
  configure_file(cmake/tarvik.pc.in tarvik.pc @ONLY)
  install(FILES ${CMAKE_CURRENT_BINARY_DIR}/tarvik.pc
    DESTINATION ${CMAKE_INSTALL_LIBDIR}/pkgconfig COMPONENT development)
endif()

if(TARGET tarvik)
  install(TARGETS tarvik RUNTIME DESTINATION ${CMAKE_INSTALL_BINDIR} COMPONENT tool)
  install(FILES docs/tarvik.1 DESTINATION ${CMAKE_INSTALL_MANDIR}/man1 COMPONENT tool)
  install(DIRECTORY cli/schema DESTINATION ${CMAKE_INSTALL_DATADIR}/tarvik COMPONENT tool)
  install(DIRECTORY editors DESTINATION ${CMAKE_INSTALL_DATADIR}/tarvik COMPONENT tool)
  # Where each shell looks for completions by itself.
  install(FILES cli/app/completion/tarvik.bash RENAME tarvik
    DESTINATION ${CMAKE_INSTALL_DATADIR}/bash-completion/completions COMPONENT tool)
  install(FILES cli/app/completion/_tarvik
    DESTINATION ${CMAKE_INSTALL_DATADIR}/zsh/site-functions COMPONENT tool)
  install(FILES cli/app/completion/tarvik.fish
    DESTINATION ${CMAKE_INSTALL_DATADIR}/fish/vendor_completions.d COMPONENT tool)
endif()

# Databases are read by our host layer.
if(NOT TARVIK_HOST)
  install(DIRECTORY database/ DESTINATION ${CMAKE_INSTALL_DATADIR}/tarvik/demonstration COMPONENT data)

  # Makes the demonstration the database of the installed library, which never falls back to it by itself.
  file(CREATE_LINK demonstration ${CMAKE_CURRENT_BINARY_DIR}/installed-database SYMBOLIC)
  install(FILES ${CMAKE_CURRENT_BINARY_DIR}/installed-database RENAME database
    DESTINATION ${CMAKE_INSTALL_DATADIR}/tarvik COMPONENT database EXCLUDE_FROM_ALL)
endif()

install(FILES README.md CONTRIBUTING.md CHANGELOG.md LICENSE SECURITY.md
  DESTINATION ${CMAKE_INSTALL_DOCDIR} COMPONENT documentation)
install(DIRECTORY docs DESTINATION ${CMAKE_INSTALL_DOCDIR} COMPONENT documentation
  PATTERN Doxyfile EXCLUDE PATTERN "*.1" EXCLUDE)
install(DIRECTORY examples DESTINATION ${CMAKE_INSTALL_DOCDIR} COMPONENT documentation)
