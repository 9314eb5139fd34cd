# An application that finds the package by CMake.
include(${CMAKE_CURRENT_LIST_DIR}/Context.cmake)

set(build ${SCRATCH}/cmake-consumer)
run(${CMAKE_COMMAND} -S ${CMAKE_CURRENT_LIST_DIR}/consumer -B ${build} -G ${GENERATOR}
  -DCMAKE_PREFIX_PATH=${TREE} -DCMAKE_BUILD_TYPE=${BUILD_TYPE} -DCMAKE_CXX_COMPILER=${COMPILER}
  -DCMAKE_CXX_FLAGS=${FLAGS} -DEXPECTED_VERSION=${VERSION})
run(${CMAKE_COMMAND} --build ${build})

file(READ ${build}/compile_commands.json commands)
expect_no_source("${commands}" "The compiler's command")
expect_answers(${build}/consumer)
