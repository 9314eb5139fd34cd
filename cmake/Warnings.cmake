# The warnings with which all code of this project is compiled.
add_library(tarvik_warnings INTERFACE)
target_compile_options(tarvik_warnings INTERFACE
  -Wall -Wextra -Wpedantic -Wshadow -Wconversion -Wsign-conversion -Wold-style-cast -Wnon-virtual-dtor
  $<$<BOOL:${TARVIK_WARNINGS_AS_ERRORS}>:-Werror>)
