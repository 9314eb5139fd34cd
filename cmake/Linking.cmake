# Programs are linked many times while editing, so by the fastest linker. What ships is linked by the default one.
if(PROJECT_IS_TOP_LEVEL AND CMAKE_BUILD_TYPE STREQUAL "Debug" AND NOT CMAKE_CROSSCOMPILING)
  find_program(TARVIK_LLD ld.lld)
  if(TARVIK_LLD)
    add_link_options(-fuse-ld=lld)
  endif()
endif()

# Shared libraries are linked with no symbol left undefined. (A sanitizer's runtime comes with the program, so a
# sanitized library leaves its symbols open.)
add_library(tarvik_linking INTERFACE)
if(NOT WIN32 AND NOT CMAKE_CXX_FLAGS MATCHES "-fsanitize")
  target_link_options(tarvik_linking INTERFACE -Wl,-z,defs)
endif()

# tarvik_export(LIBRARY MAP): exports what a linker script lists. On Windows the headers say it.
function(tarvik_export library map)
  if(NOT WIN32)
    target_link_options(${library} PRIVATE -Wl,--version-script=${map})
    set_target_properties(${library} PROPERTIES LINK_DEPENDS ${map})
  endif()
endfunction()
