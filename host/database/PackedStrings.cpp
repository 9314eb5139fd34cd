#include "database/PackedStrings.h"

#include <AcdText.h>

#include <utility>

// Names in one block, as the scan of files makes them and as the index of a directory contains them.

namespace acd {

std::optional<PackedStrings> PackedStrings::from(std::shared_ptr<const char[]> owner,
                                                 std::string_view bytes) noexcept {
    for (std::string_view rest = bytes; !rest.empty();) {
        if (rest.size() < sizeof(Length)) {
            return std::nullopt;
        }
        const std::size_t length = loadLittleEndian<Length>(rest.data());
        if (length == 0 || length > rest.size() - sizeof(Length)) {
            return std::nullopt;
        }
        rest.remove_prefix(sizeof(Length) + length);
    }
    return PackedStrings(std::move(owner), bytes);
}

bool PackedStrings::containsIgnoreCase(std::string_view name) const noexcept {
    for (std::string_view rest = m_bytes; !rest.empty();) {
        const std::string_view each = takeName(rest);
        // Most names differ in their length or their last byte.
        if (each.size() == name.size() && AcdText::toLower(each.back()) == AcdText::toLower(name.back()) &&
            AcdText::equalsIgnoreCase(each, name)) {
            return true;
        }
    }
    return false;
}

std::size_t PackedStrings::count() const noexcept {
    std::size_t count = 0;
    forEach([&count](std::string_view) { ++count; });
    return count;
}

void StringPacker::add(std::string_view name) {
    appendLittleEndian(m_bytes, static_cast<PackedStrings::Length>(name.size()));
    m_bytes += name;
}

PackedStrings StringPacker::pack() const {
    std::shared_ptr<char[]> bytes(new char[m_bytes.size()]);
    m_bytes.copy(bytes.get(), m_bytes.size());
    const std::string_view packed(bytes.get(), m_bytes.size());
    return {std::move(bytes), packed};
}

} // namespace acd
