# The package that -DTARVIK_HOST=TarvikMemoryHost finds: it builds the host along, rather than having it
# installed.
add_subdirectory(${CMAKE_CURRENT_LIST_DIR} tarvik_memory_host)
add_library(Tarvik::Host ALIAS tarvik_memory_host)
