# What `cmake --install` puts where, by component: runtime, development, tool, data, documentation; and, only when asked
# for by name, database.
include(CMakePackageConfigHelpers)

set(package_directory ${CMAKE_INSTALL_LIBDIR}/cmake/TarvikConstraintsManager)
set(host_headers ${CMAKE_INSTALL_INCLUDEDIR}/tarvik/host)

# An installed tree can be moved: everything is found from its own place.
file(RELATIVE_PATH libraries_from_tool /${CMAKE_INSTALL_BINDIR} /${CMAKE_INSTALL_LIBDIR})
set_target_properties(TarvikHost TarvikConstraintsManager PROPERTIES INSTALL_RPATH "$ORIGIN")
set_target_properties(TarvikHost PROPERTIES EXPORT_NAME Host)
set_target_properties(TarvikConstraintsManager PROPERTIES EXPORT_NAME ConstraintsManager)
target_include_directories(TarvikHost PUBLIC $<INSTALL_INTERFACE:${host_headers}>)
target_include_directories(TarvikConstraintsManager PUBLIC $<INSTALL_INTERFACE:${CMAKE_INSTALL_INCLUDEDIR}>)

install(TARGETS TarvikHost TarvikConstraintsManager
  EXPORT TarvikConstraintsManagerTargets
  LIBRARY DESTINATION ${CMAKE_INSTALL_LIBDIR} COMPONENT runtime NAMELINK_COMPONENT development)
install(DIRECTORY include/tarvik DESTINATION ${CMAKE_INSTALL_INCLUDEDIR} COMPONENT development)
install(DIRECTORY host/include/ DESTINATION ${host_headers} COMPONENT development)

install(EXPORT TarvikConstraintsManagerTargets NAMESPACE Tarvik::
  DESTINATION ${package_directory} COMPONENT development)
write_basic_package_version_file(TarvikConstraintsManagerConfigVersion.cmake COMPATIBILITY SameMajorVersion)
install(FILES
  cmake/TarvikConstraintsManagerConfig.cmake
  ${CMAKE_CURRENT_BINARY_DIR}/TarvikConstraintsManagerConfigVersion.cmake
  DESTINATION ${package_directory} COMPONENT development)

file(RELATIVE_PATH prefix_from_pkgconfig /${CMAKE_INSTALL_LIBDIR}/pkgconfig /)
configure_file(cmake/tarvik-constraints-manager.pc.in tarvik-constraints-manager.pc @ONLY)
install(FILES ${CMAKE_CURRENT_BINARY_DIR}/tarvik-constraints-manager.pc
  DESTINATION ${CMAKE_INSTALL_LIBDIR}/pkgconfig COMPONENT development)

if(TARGET tarvik)
  set_target_properties(tarvik PROPERTIES INSTALL_RPATH "$ORIGIN/${libraries_from_tool}")
  install(TARGETS tarvik RUNTIME DESTINATION ${CMAKE_INSTALL_BINDIR} COMPONENT tool)
  install(FILES docs/tarvik.1 DESTINATION ${CMAKE_INSTALL_MANDIR}/man1 COMPONENT tool)
  install(DIRECTORY cli/schema DESTINATION ${CMAKE_INSTALL_DATADIR}/tarvik COMPONENT tool)
  # Where each shell looks for completions by itself.
  install(FILES cli/app/completion/tarvik.bash RENAME tarvik
    DESTINATION ${CMAKE_INSTALL_DATADIR}/bash-completion/completions COMPONENT tool)
  install(FILES cli/app/completion/_tarvik
    DESTINATION ${CMAKE_INSTALL_DATADIR}/zsh/site-functions COMPONENT tool)
  install(FILES cli/app/completion/tarvik.fish
    DESTINATION ${CMAKE_INSTALL_DATADIR}/fish/vendor_completions.d COMPONENT tool)
endif()
install(DIRECTORY database/ DESTINATION ${CMAKE_INSTALL_DATADIR}/tarvik/demonstration COMPONENT data)

# Makes the demonstration the database of the installed library, which never falls back to it by itself.
file(CREATE_LINK demonstration ${CMAKE_CURRENT_BINARY_DIR}/installed-database SYMBOLIC)
install(FILES ${CMAKE_CURRENT_BINARY_DIR}/installed-database RENAME database
  DESTINATION ${CMAKE_INSTALL_DATADIR}/tarvik COMPONENT database EXCLUDE_FROM_ALL)

install(FILES README.md CONTRIBUTING.md CHANGELOG.md DESTINATION ${CMAKE_INSTALL_DOCDIR} COMPONENT documentation)
install(DIRECTORY docs DESTINATION ${CMAKE_INSTALL_DOCDIR} COMPONENT documentation
  PATTERN Doxyfile EXCLUDE PATTERN "*.1" EXCLUDE)
install(DIRECTORY examples DESTINATION ${CMAKE_INSTALL_DOCDIR} COMPONENT documentation)
