# With BUILD_SHARED_LIBS=OFF static libraries are installed, and a program that is linked with them needs no others of
# ours. It looks for its database from its own place.
include(${CMAKE_CURRENT_LIST_DIR}/Context.cmake)

set(build ${SCRATCH}/static-build)
set(tree ${SCRATCH}/static)
file(REMOVE_RECURSE ${tree})
run(${CMAKE_COMMAND} -S ${SOURCE_TREE} -B ${build} -G ${GENERATOR} -DBUILD_SHARED_LIBS=OFF -DTARVIK_BUILD_TOOL=OFF
  -DCMAKE_BUILD_TYPE=${BUILD_TYPE} -DCMAKE_CXX_COMPILER=${COMPILER} -DCMAKE_CXX_COMPILER_LAUNCHER=${LAUNCHER}
  -DCMAKE_CXX_FLAGS=${FLAGS} -DCMAKE_INSTALL_PREFIX=${tree} -DCMAKE_INSTALL_LIBDIR=${LIBRARIES})
run(${CMAKE_COMMAND} --build ${build})
run(${CMAKE_COMMAND} --install ${build})
run(${CMAKE_COMMAND} --install ${build} --component database)
file(GLOB_RECURSE shared ${tree}/${LIBRARIES}/*.so*)
if(shared)
  message(FATAL_ERROR "Shared libraries are installed: ${shared}")
endif()

set(consumer ${SCRATCH}/static-consumer)
run(${CMAKE_COMMAND} -S ${CMAKE_CURRENT_LIST_DIR}/consumer -B ${consumer} -G ${GENERATOR}
  -DCMAKE_PREFIX_PATH=${tree} -DCMAKE_BUILD_TYPE=${BUILD_TYPE} -DCMAKE_CXX_COMPILER=${COMPILER}
  -DCMAKE_CXX_FLAGS=${FLAGS} -DEXPECTED_VERSION=${VERSION})
run(${CMAKE_COMMAND} --build ${consumer})
file(COPY ${consumer}/consumer DESTINATION ${tree}/bin)
expect_answers(${tree}/bin/consumer)

set(ENV{PKG_CONFIG_PATH} ${tree}/${LIBRARIES}/pkgconfig)
run(${PKG_CONFIG} --cflags --libs --static tarvik-constraints-manager)
separate_arguments(arguments UNIX_COMMAND "${output}")
separate_arguments(flags UNIX_COMMAND "${FLAGS}")
run(${COMPILER} -std=c++17 ${flags} ${CMAKE_CURRENT_LIST_DIR}/consumer/main.cpp -o ${tree}/bin/by-pkg-config ${arguments})
expect_answers(${tree}/bin/by-pkg-config)
