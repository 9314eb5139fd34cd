# A project that contains this one, by add_subdirectory or by FetchContent (WAY), builds and installs what is its own; the
# library's install rules and example take part only when they are asked for.
include(${CMAKE_CURRENT_LIST_DIR}/Context.cmake)

set(build ${SCRATCH}/parent-${WAY})
file(REMOVE_RECURSE ${build})
set(configure ${CMAKE_COMMAND} -S ${CMAKE_CURRENT_LIST_DIR}/parent -B ${build} -G ${GENERATOR} -DWAY=${WAY}
  -DTARVIK_SOURCE_TREE=${SOURCE_TREE} -DCMAKE_CXX_COMPILER=${COMPILER} -DCMAKE_CXX_COMPILER_LAUNCHER=${LAUNCHER}
  -DCMAKE_INSTALL_PREFIX=${build}/installed)
run(${configure})
run(${CMAKE_COMMAND} --build ${build})
set(ENV{TARVIK_DATABASE} ${SOURCE_TREE}/database)
expect_answers(${build}/parent)

# installed_files(RESULT): what the project installs.
function(installed_files result)
  file(REMOVE_RECURSE ${build}/installed)
  run(${CMAKE_COMMAND} --install ${build})
  file(GLOB_RECURSE files RELATIVE ${build}/installed ${build}/installed/*)
  set(${result} ${files} PARENT_SCOPE)
endfunction()

installed_files(files)
if(NOT files STREQUAL "bin/parent")
  message(FATAL_ERROR "The parent installs ${files}")
endif()
file(GLOB_RECURSE programs ${build}/host-application ${build}/tarvik/cli/*)
if(programs)
  message(FATAL_ERROR "The parent builds ${programs}")
endif()

run(${configure} -DTARVIK_INSTALL=ON -DTARVIK_BUILD_EXAMPLES=ON)
run(${CMAKE_COMMAND} --build ${build})
installed_files(files)
foreach(file bin/parent include/tarvik/ConstraintsManager.h)
  if(NOT file IN_LIST files)
    message(FATAL_ERROR "When asked to, the parent does not install ${file}, but ${files}")
  endif()
endforeach()
file(GLOB_RECURSE programs ${build}/host-application)
if(NOT programs)
  message(FATAL_ERROR "When asked to, the parent does not build the example")
endif()
