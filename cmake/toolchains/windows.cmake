# MinGW-w64, and Wine to run what it makes.
set(CMAKE_SYSTEM_NAME Windows)
set(CMAKE_SYSTEM_PROCESSOR x86_64)
set(TRIPLE x86_64-w64-mingw32)
set(COMPILER_SUFFIX -posix)
include(${CMAKE_CURRENT_LIST_DIR}/debian.cmake)
set(CMAKE_RC_COMPILER ${TRIPLE}-windres)
set(CMAKE_CROSSCOMPILING_EMULATOR ${CMAKE_CURRENT_LIST_DIR}/../../scripts/run-under-wine)
