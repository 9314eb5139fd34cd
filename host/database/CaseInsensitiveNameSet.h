#pragma once

#include <cstddef>
#include <cstdint>
#include <string_view>
#include <vector>

namespace acd {

/// A set of names without regard to ASCII case. Each has an ordinal, in order of arrival, and the spelling
/// with which it came first. The table holds views: the texts must outlive it.
class CaseInsensitiveNameSet {
public:
    /// The ordinal of a name that is not in the table.
    static constexpr std::uint32_t NONE = 0xFFFFFFFF;

    /// The ordinal of `name`, which is added when it is new. Changes nothing when memory runs out.
    std::uint32_t add(std::string_view name);

    [[nodiscard]] std::uint32_t find(std::string_view name) const noexcept;

    [[nodiscard]] std::string_view operator[](std::uint32_t ordinal) const noexcept {
        return m_names[ordinal];
    }
    [[nodiscard]] std::uint32_t size() const noexcept { return static_cast<std::uint32_t>(m_names.size()); }

private:
    struct Slot {
        std::uint32_t hash;
        std::uint32_t ordinal; ///< `NONE` while the slot is free
    };

    [[nodiscard]] std::size_t slotOf(std::uint32_t hash, std::string_view name) const noexcept;
    void grow();

    std::vector<std::string_view> m_names;
    std::vector<Slot> m_slots; ///< open addressing; the size is a power of two
};

} // namespace acd
