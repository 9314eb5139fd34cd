# An application in C that finds the package by CMake, and the same by pkg-config with one call of the compiler.
include(${CMAKE_CURRENT_LIST_DIR}/Context.cmake)

set(build ${SCRATCH}/c-consumer)
run(${CMAKE_COMMAND} -S ${CMAKE_CURRENT_LIST_DIR}/c-consumer -B ${build} -G ${GENERATOR}
  -DCMAKE_PREFIX_PATH=${TREE} -DCMAKE_BUILD_TYPE=${BUILD_TYPE} -DCMAKE_CXX_COMPILER=${COMPILER}
  -DCMAKE_CXX_FLAGS=${FLAGS})
run(${CMAKE_COMMAND} --build ${build})
file(READ ${build}/compile_commands.json commands)
expect_no_source("${commands}" "The compiler's command")
expect_answers(${build}/consumer)

set(ENV{PKG_CONFIG_PATH} ${TREE}/${LIBRARIES}/pkgconfig)
run(${PKG_CONFIG} --exact-version=${VERSION} tarvik)
run(${PKG_CONFIG} --variable=libdir tarvik)
string(STRIP "${output}" libraries)
run(${PKG_CONFIG} --cflags --libs tarvik)
separate_arguments(arguments UNIX_COMMAND "${output}")
separate_arguments(flags UNIX_COMMAND "${FLAGS}")
run(${COMPILER} -x c -std=c99 -Wall -Wextra -Wpedantic -Werror ${flags} ${CMAKE_CURRENT_LIST_DIR}/c-consumer/main.c
  -x none -o ${build}/pkg-config-consumer ${arguments} -Wl,-rpath,${libraries})
expect_answers(${build}/pkg-config-consumer)
