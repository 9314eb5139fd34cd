#pragma once

#include <cstdio>
#include <string>

/// How texts are formatted, for every service of the in-memory host that takes a format.
namespace memory_host {

/// A finished text in the format position: "%%" gives "%", any other "%" stands as it is.
inline std::string formatted(const char* text) {
    std::string result;
    for (; *text != '\0'; ++text) {
        result += *text;
        if (text[0] == '%' && text[1] == '%') {
            ++text;
        }
    }
    return result;
}

/// What printf would print.
template <typename First, typename... Others>
std::string formatted(const char* format, First first, Others... others) {
    const int length = std::snprintf(nullptr, 0, format, first, others...);
    std::string result(static_cast<std::size_t>(length), '\0');
    std::snprintf(result.data(), result.size() + 1, format, first, others...);
    return result;
}

} // namespace memory_host
