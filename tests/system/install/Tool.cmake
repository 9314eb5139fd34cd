# The moved tool finds its libraries, and by them the database: it does not speak of the demonstration that it carries.
include(${CMAKE_CURRENT_LIST_DIR}/Context.cmake)

execute_process(COMMAND ${TREE}/${BINARIES}/tarvik check KS50 --mode BS --output USB2 --package TQ144 --operation PROGRAM
  ERROR_VARIABLE messages RESULT_VARIABLE status)
foreach(file vim/ftdetect/acd.vim vim/syntax/acd.vim vscode/extension.js vscode/package.json)
  if(NOT EXISTS ${TREE}/share/tarvik/editors/${file})
    message(FATAL_ERROR "the editor file ${file} is not installed")
  endif()
endforeach()
if(NOT status EQUAL 0 OR NOT messages STREQUAL "")
  message(FATAL_ERROR "tarvik ends with ${status} and says: ${messages}")
endif()
