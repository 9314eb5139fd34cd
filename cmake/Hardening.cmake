# What an attacker who got hold of a fault would meet, in all code that is optimised, as what ships is: no address that
# is the same twice, nothing to overwrite in the tables that the loader fills, checked stacks and library calls. (The
# sanitizers replace these checks by stricter ones of their own.)
include(CheckPIESupported)
check_pie_supported(LANGUAGES CXX)

if(NOT CMAKE_CXX_FLAGS MATCHES "-fsanitize")
  set(optimised $<CONFIG:Release,RelWithDebInfo,MinSizeRel>)
  add_compile_options($<${optimised}:-fstack-protector-strong> $<${optimised}:-U_FORTIFY_SOURCE>
                      $<${optimised}:-D_FORTIFY_SOURCE=2>)
  add_link_options($<${optimised}:LINKER:-z,relro,-z,now>)
endif()
