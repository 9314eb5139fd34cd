# CPack adds scripts that call ldconfig to a library's package. A trigger does so already, once for all packages of a run,
# and without scripts a package can be installed into any root folder.
foreach(package ${CPACK_PACKAGE_FILES})
  set(folder ${CPACK_TEMPORARY_DIRECTORY}/unpacked)
  file(REMOVE_RECURSE ${folder})
  execute_process(COMMAND dpkg-deb --raw-extract ${package} ${folder} COMMAND_ERROR_IS_FATAL ANY)
  set(script "")
  if(EXISTS ${folder}/DEBIAN/postinst)
    file(READ ${folder}/DEBIAN/postinst script)
  endif()
  if(script MATCHES "ldconfig")
    file(REMOVE ${folder}/DEBIAN/postinst ${folder}/DEBIAN/postrm)
    file(WRITE ${folder}/DEBIAN/triggers "activate-noawait ldconfig\n")
    file(CHMOD ${folder}/DEBIAN/triggers PERMISSIONS OWNER_READ OWNER_WRITE GROUP_READ WORLD_READ)
    execute_process(COMMAND dpkg-deb --root-owner-group --build ${folder} ${package} OUTPUT_QUIET
      COMMAND_ERROR_IS_FATAL ANY)
  endif()
endforeach()
