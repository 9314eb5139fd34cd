# Hardening flags for optimised builds: position-independent programs, RELRO, stack protector, _FORTIFY_SOURCE. (The
# sanitizers replace these checks by stricter ones of their own.)
if(PROJECT_IS_TOP_LEVEL)
  include(CheckPIESupported)
  check_pie_supported(LANGUAGES CXX)
endif()

if(NOT WIN32 AND NOT CMAKE_CXX_FLAGS MATCHES "-fsanitize")
  set(optimised $<CONFIG:Release,RelWithDebInfo,MinSizeRel>)
  add_compile_options($<${optimised}:-fstack-protector-strong> $<${optimised}:-U_FORTIFY_SOURCE>
                      $<${optimised}:-D_FORTIFY_SOURCE=2>)
  add_link_options($<${optimised}:LINKER:-z,relro,-z,now>)
endif()
