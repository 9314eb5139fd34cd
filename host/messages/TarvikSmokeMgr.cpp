#include "TarvikSmokeMgr.h"

#include "text/Formatting.h"

#include <cstdarg>
#include <string>

// The recorder of smoke tests.

void TarvikSmokeMgr::smokeStatus(const char* piece) { m_text += formatting::unescapePercent(piece).c_str(); }

template <typename Formatted>
void TarvikSmokeMgr::smokeStatus(const char* format, ...) {
    std::va_list arguments;
    va_start(arguments, format);
    const std::string text = formatting::vformat(format, arguments);
    va_end(arguments);
    m_text += StringBase(text.data(), text.size());
}
template TARVIK_HOST_API void TarvikSmokeMgr::smokeStatus<void>(const char* format, ...);
