# What Debian asks of the installed files and `cmake --install` does not do. Run by CPack on what it has installed.
file(GLOB_RECURSE manual_pages ${CPACK_TEMPORARY_DIRECTORY}/*/usr/share/man/*.[1-9])
foreach(page ${manual_pages})
  execute_process(COMMAND gzip --best --no-name ${page} COMMAND_ERROR_IS_FATAL ANY)
endforeach()

file(GLOB_RECURSE binaries ${CPACK_TEMPORARY_DIRECTORY}/*/usr/bin/* ${CPACK_TEMPORARY_DIRECTORY}/*/usr/lib/*.so.*)
foreach(binary ${binaries})
  if(NOT IS_SYMLINK ${binary})
    execute_process(COMMAND strip --remove-section=.comment --remove-section=.note ${binary} COMMAND_ERROR_IS_FATAL ANY)
  endif()
endforeach()
