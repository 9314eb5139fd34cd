include(${CMAKE_CURRENT_LIST_DIR}/TarvikConstraintsManagerTargets.cmake)
