#include "text/Formatting.h"

#include <array>
#include <cstddef>
#include <cstdio>

// Formatting, apart from the classes that offer it: texts, messages and the recorder all format alike.

std::string formatting::unescapePercent(const char* text) {
    std::string result;
    if (text == nullptr) {
        return result;
    }
    for (const char* position = text; *position != '\0'; ++position) {
        result += *position;
        if (position[0] == '%' && position[1] == '%') {
            ++position;
        }
    }
    return result;
}

std::string formatting::vformat(const char* format, std::va_list arguments) {
    if (format == nullptr) {
        return {};
    }
    std::va_list measured;
    va_copy(measured, arguments);
    // Most texts are short: one pass into the stack, a second one only for those that are not.
    std::array<char, 256> buffer;
    const int result = std::vsnprintf(buffer.data(), buffer.size(), format, measured);
    va_end(measured);
    if (result < 0) {
        return format;
    }
    const auto length = static_cast<std::size_t>(result);
    if (length < buffer.size()) {
        return {buffer.data(), length};
    }
    std::string text(length, '\0');
    std::vsnprintf(text.data(), length + 1, format, arguments);
    return text;
}
