#include <StringBase.h>
#include <UT_STR.h>

#include <algorithm>
#include <string_view>

// The texts of the in-memory host.

namespace {

std::string_view view(const char* text) {
    return text == nullptr ? std::string_view() : std::string_view(text);
}

} // namespace

int StringBase::ICompare(const StringBase& other) const noexcept {
    return UT_STR::ICompare(c_str(), other.c_str());
}

std::uint32_t StringBase::CRC32(const char* bytes, std::size_t length, std::uint32_t former) noexcept {
    std::uint32_t checksum = ~former;
    for (std::size_t index = 0; index < length; ++index) {
        checksum ^= static_cast<unsigned char>(bytes[index]);
        for (int bit = 0; bit < 8; ++bit) {
            checksum = checksum >> 1 ^ ((checksum & 1U) != 0 ? 0xEDB88320U : 0U);
        }
    }
    return ~checksum;
}

int UT_STR::Compare(const char* left, const char* right) noexcept { return view(left).compare(view(right)); }

int UT_STR::ICompare(const char* left, const char* right) noexcept {
    const std::string_view first = view(left);
    const std::string_view second = view(right);
    for (std::size_t index = 0; index < std::min(first.size(), second.size()); ++index) {
        const auto one = static_cast<unsigned char>(StringBase::lower(first[index]));
        const auto two = static_cast<unsigned char>(StringBase::lower(second[index]));
        if (one != two) {
            return one < two ? -1 : 1;
        }
    }
    return first.size() == second.size() ? 0 : first.size() < second.size() ? -1 : 1;
}

long UT_STR::AToL(const char* text) noexcept {
    constexpr long long MOST = 2147483648;
    std::string_view rest = view(text);
    rest.remove_prefix(std::min(rest.find_first_not_of(" \t"), rest.size()));
    const bool negative = !rest.empty() && rest.front() == '-';
    if (!rest.empty() && (rest.front() == '-' || rest.front() == '+')) {
        rest.remove_prefix(1);
    }
    long long number = 0;
    while (!rest.empty() && rest.front() >= '0' && rest.front() <= '9') {
        number = std::min(number * 10 + (rest.front() - '0'), MOST);
        rest.remove_prefix(1);
    }
    return static_cast<long>(negative ? -number : std::min(number, MOST - 1));
}

StringBase UT_STR::Upper(const char* text) {
    StringBase upper(text);
    upper.MakeUpper();
    return upper;
}
