# The zip for Windows: it runs from any folder, with the compiler's libraries beside the programs.
install(FILES ${TARVIK_RUNTIME_LIBRARIES} DESTINATION ${CMAKE_INSTALL_BINDIR} COMPONENT runtime)

set(CPACK_GENERATOR ZIP)
set(CPACK_VERBATIM_VARIABLES ON)
set(CPACK_PACKAGE_NAME tarvik)
set(CPACK_PACKAGE_FILE_NAME tarvik-${PROJECT_VERSION}-windows-x86_64)
set(CPACK_STRIP_FILES ON)
include(CPack)
