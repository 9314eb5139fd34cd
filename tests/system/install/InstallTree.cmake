# Installs the build tree, each component by itself, and moves what came of it elsewhere.
include(${CMAKE_CURRENT_LIST_DIR}/Context.cmake)

file(REMOVE_RECURSE ${SCRATCH})
foreach(component runtime development tool data database documentation)
  run(${CMAKE_COMMAND} --install ${BUILD_TREE} --prefix ${SCRATCH}/installed --component ${component})
endforeach()
file(RENAME ${SCRATCH}/installed ${TREE})
