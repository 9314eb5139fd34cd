# Does what Debian requires of the installed files and `cmake --install` does not do. CPack runs it after installing.
set(installed ${CPACK_TEMPORARY_DIRECTORY}/*/usr)
file(GLOB_RECURSE texts ${installed}/share/man/*.[1-9] ${installed}/share/doc/changelog ${installed}/share/doc/*.Debian)
foreach(text ${texts})
  execute_process(COMMAND gzip --best --no-name ${text} COMMAND_ERROR_IS_FATAL ANY)
endforeach()

file(GLOB_RECURSE binaries ${installed}/bin/* ${installed}/lib/*.so.*)
foreach(binary ${binaries})
  if(NOT IS_SYMLINK ${binary})
    execute_process(COMMAND strip --remove-section=.comment --remove-section=.note ${binary} COMMAND_ERROR_IS_FATAL ANY)
  endif()
endforeach()

# The licence is in each package's copyright file.
file(GLOB licences ${installed}/share/doc/*/LICENSE)
if(licences)
  file(REMOVE ${licences})
endif()
