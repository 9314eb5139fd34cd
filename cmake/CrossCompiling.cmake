# Where other systems find what Debian has for this one only: libraries of headers alone, and GoogleTest as source.
#
# The headers are linked into the build tree, since /usr/include itself has those of this system's C library.
set(headers ${PROJECT_BINARY_DIR}/headers)
file(MAKE_DIRECTORY ${headers})
foreach(folder CLI fmt nlohmann)
  file(CREATE_LINK /usr/include/${folder} ${headers}/${folder} SYMBOLIC)
endforeach()

# tarvik_provide(PACKAGE TEXT): what find_package(PACKAGE) does.
function(tarvik_provide package text)
  string(TOLOWER ${package} lower)
  file(WRITE ${CMAKE_FIND_PACKAGE_REDIRECTS_DIR}/${lower}-config.cmake "include_guard(GLOBAL)\n${text}")
endfunction()
tarvik_provide(CLI11 "add_library(CLI11::CLI11 INTERFACE IMPORTED GLOBAL)
target_include_directories(CLI11::CLI11 INTERFACE ${headers})\n")
tarvik_provide(nlohmann_json "add_library(nlohmann_json::nlohmann_json INTERFACE IMPORTED GLOBAL)
target_include_directories(nlohmann_json::nlohmann_json INTERFACE ${headers})\n")
tarvik_provide(fmt "")

# fmt is compiled once: as headers alone it would double the time of the tool's compilation.
file(CONFIGURE OUTPUT ${PROJECT_BINARY_DIR}/fmt.cpp CONTENT [[
#include <fmt/format-inl.h>
FMT_BEGIN_NAMESPACE
namespace detail {
template dragonbox::decimal_fp<float> dragonbox::to_decimal(float) noexcept;
template dragonbox::decimal_fp<double> dragonbox::to_decimal(double) noexcept;
template locale_ref::locale_ref(const std::locale&);
template std::locale locale_ref::get<std::locale>() const;
template thousands_sep_result<char> thousands_sep_impl(locale_ref);
template char decimal_point_impl(locale_ref);
template void buffer<char>::append(const char*, const char*);
template void vformat_to(buffer<char>&, string_view, basic_format_args<buffer_context<char>>, locale_ref);
} // namespace detail
FMT_END_NAMESPACE
]])
add_library(tarvik_fmt STATIC EXCLUDE_FROM_ALL ${PROJECT_BINARY_DIR}/fmt.cpp)
target_include_directories(tarvik_fmt SYSTEM PUBLIC ${headers})
add_library(fmt::fmt ALIAS tarvik_fmt)

tarvik_provide(GTest "set(INSTALL_GTEST OFF)
add_subdirectory(/usr/src/googletest ${PROJECT_BINARY_DIR}/googletest EXCLUDE_FROM_ALL)\n")

# Programs of Windows find libraries beside themselves, those of the compiler too.
if(WIN32)
  set(CMAKE_RUNTIME_OUTPUT_DIRECTORY ${PROJECT_BINARY_DIR}/bin)
  set(TARVIK_RUNTIME_LIBRARIES)
  foreach(library libstdc++-6.dll libgcc_s_seh-1.dll libwinpthread-1.dll)
    execute_process(COMMAND ${CMAKE_CXX_COMPILER} -print-file-name=${library}
      OUTPUT_VARIABLE file OUTPUT_STRIP_TRAILING_WHITESPACE COMMAND_ERROR_IS_FATAL ANY)
    if(NOT IS_ABSOLUTE ${file})
      message(FATAL_ERROR "${CMAKE_CXX_COMPILER} has no ${library}")
    endif()
    list(APPEND TARVIK_RUNTIME_LIBRARIES ${file})
  endforeach()
  file(COPY ${TARVIK_RUNTIME_LIBRARIES} DESTINATION ${CMAKE_RUNTIME_OUTPUT_DIRECTORY})
endif()
