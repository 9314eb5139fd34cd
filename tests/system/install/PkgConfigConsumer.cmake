# An application that finds the library by pkg-config, with one call of the compiler.
include(${CMAKE_CURRENT_LIST_DIR}/Context.cmake)

set(ENV{PKG_CONFIG_PATH} ${TREE}/${LIBRARIES}/pkgconfig)
run(${PKG_CONFIG} --exact-version=${VERSION} tarvik-constraints-manager)
run(${PKG_CONFIG} --variable=libdir tarvik-constraints-manager)
string(STRIP "${output}" libraries)
run(${PKG_CONFIG} --cflags --libs tarvik-constraints-manager)
separate_arguments(arguments UNIX_COMMAND "${output}")
separate_arguments(flags UNIX_COMMAND "${FLAGS}")

set(build ${SCRATCH}/pkg-config-consumer)
file(MAKE_DIRECTORY ${build})
run(${COMPILER} -std=c++17 -Wall -Wextra -Wpedantic -Werror ${flags} ${CMAKE_CURRENT_LIST_DIR}/consumer/main.cpp
  -MD -MF ${build}/main.d -o ${build}/consumer ${arguments} -Wl,-rpath,${libraries})

file(READ ${build}/main.d headers)
expect_no_source("${headers}" "The consumer")
expect_answers(${build}/consumer)
