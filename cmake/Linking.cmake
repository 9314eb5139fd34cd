# Shared libraries are linked with no symbol left undefined. (A sanitizer's runtime comes with the program, so a
# sanitized library leaves its symbols open.)
add_library(tarvik_linking INTERFACE)
if(NOT CMAKE_CXX_FLAGS MATCHES "-fsanitize")
  target_link_options(tarvik_linking INTERFACE -Wl,-z,defs)
endif()
