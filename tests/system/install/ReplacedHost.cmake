# Somebody else's host is installed as a CMake package. The manager is built against it and installed elsewhere, with
# nothing of our host layer; an application then finds both by the manager's package.
include(${CMAKE_CURRENT_LIST_DIR}/Context.cmake)

set(hosts ${CMAKE_CURRENT_LIST_DIR}/../hosts)
set(place ${SCRATCH}/replaced-host)
file(REMOVE_RECURSE ${place})

# build(NAME SOURCE OPTIONS...): configures, builds and installs a project.
function(build name source)
  run(${CMAKE_COMMAND} -S ${source} -B ${place}/${name}-build -G ${GENERATOR} -DCMAKE_INSTALL_PREFIX=${place}/${name}
    -DCMAKE_BUILD_TYPE=${BUILD_TYPE} -DCMAKE_CXX_COMPILER=${COMPILER} -DCMAKE_CXX_FLAGS=${FLAGS}
    -DCMAKE_CXX_COMPILER_LAUNCHER=${LAUNCHER} ${ARGN})
  run(${CMAKE_COMMAND} --build ${place}/${name}-build)
endfunction()

build(host ${hosts}/memory)
run(${CMAKE_COMMAND} --install ${place}/host-build)
build(manager ${SOURCE_TREE} -DTARVIK_HOST=TarvikMemoryHost -DCMAKE_PREFIX_PATH=${place}/host)
run(${CMAKE_COMMAND} --install ${place}/manager-build)

file(GLOB_RECURSE files RELATIVE ${place}/manager ${place}/manager/*)
set(host_files ${files})
list(FILTER host_files INCLUDE REGEX "include/tarvik/host/|libTarvikHost|share/tarvik|bin/")
list(FIND files "include/tarvik/ConstraintsManager.h" header)
if(host_files OR header EQUAL -1)
  message(FATAL_ERROR "Installed is: ${files}")
endif()

# Where the host is unknown, so is the manager.
execute_process(COMMAND ${CMAKE_COMMAND} -S ${hosts}/application -B ${place}/lost-build -G ${GENERATOR} -DINSTALLED=ON
  -DCMAKE_CXX_COMPILER=${COMPILER} -DCMAKE_PREFIX_PATH=${place}/manager RESULT_VARIABLE status ERROR_VARIABLE messages
  OUTPUT_QUIET)
if(status EQUAL 0 OR NOT messages MATCHES "TarvikMemoryHost")
  message(FATAL_ERROR "Without the host's package, an application is told: ${messages}")
endif()

set(ENV{CMAKE_PREFIX_PATH} ${place}/host:${place}/manager)
build(application ${hosts}/application -DINSTALLED=ON)
run(${place}/application-build/application)
if(NOT output STREQUAL "answered\n")
  message(FATAL_ERROR "The application prints: ${output}")
endif()
