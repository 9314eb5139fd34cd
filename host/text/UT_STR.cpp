#include "UT_STR.h"

#include "text/NullToEmpty.h"

#include <AcdText.h>

#include <algorithm>
#include <cstdint>
#include <cstring>

// Operations on NUL-terminated texts.

namespace {

bool isBlank(char byte) noexcept { return byte == ' ' || (byte >= '\t' && byte <= '\r'); }

bool isDigit(char byte) noexcept { return byte >= '0' && byte <= '9'; }

} // namespace

int UT_STR::Compare(const char* left, const char* right) noexcept {
    return std::strcmp(nullToEmpty(left), nullToEmpty(right));
}

int UT_STR::ICompare(const char* left, const char* right) noexcept {
    // Vocabularies are searched with it: most texts differ at once, long before their ends would be found.
    left = nullToEmpty(left);
    right = nullToEmpty(right);
    while (*left != '\0' && AcdText::toLower(*left) == AcdText::toLower(*right)) {
        ++left;
        ++right;
    }
    return static_cast<unsigned char>(AcdText::toLower(*left)) -
           static_cast<unsigned char>(AcdText::toLower(*right));
}

long UT_STR::AToL(const char* text) noexcept {
    if (text == nullptr) {
        return 0;
    }
    while (isBlank(*text)) {
        ++text;
    }
    const bool isNegative = *text == '-';
    if (*text == '-' || *text == '+') {
        ++text;
    }
    // What a negative number can hold at most: there it saturates.
    constexpr std::int64_t LIMIT = std::int64_t{1} << 31;
    std::int64_t number = 0;
    for (; isDigit(*text); ++text) {
        number = std::min(number * 10 + (*text - '0'), LIMIT);
    }
    return static_cast<long>(isNegative ? -number : std::min(number, LIMIT - 1));
}

StringBase UT_STR::Upper(const char* text) {
    StringBase result(text);
    result.MakeUpper();
    return result;
}
