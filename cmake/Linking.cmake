# Programs are linked many times while editing, so by the fastest linker. What ships is linked by the default one.
if(PROJECT_IS_TOP_LEVEL AND CMAKE_BUILD_TYPE STREQUAL "Debug")
  find_program(TARVIK_LLD ld.lld)
  if(TARVIK_LLD)
    add_link_options(-fuse-ld=lld)
  endif()
endif()

# Shared libraries are linked with no symbol left undefined. (A sanitizer's runtime comes with the program, so a
# sanitized library leaves its symbols open.)
add_library(tarvik_linking INTERFACE)
if(NOT CMAKE_CXX_FLAGS MATCHES "-fsanitize")
  target_link_options(tarvik_linking INTERFACE -Wl,-z,defs)
endif()
