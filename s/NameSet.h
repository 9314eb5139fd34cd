#pragma once

#include "StringViews.h"

#include <tarvik/ltptstr.h>

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <string_view>
#include <utility>
#include <vector>

/// An ordered set of names that is filled once and then only read: a sorted vector, so that the position of a name,
/// which numbers the blocks of the permission tables, is a subtraction.
class NameSet {
public:
    /// No names.
    NameSet() = default;

    /// Sorts names.
    /// @param names in any order; repeated ones are stored once
    explicit NameSet(std::vector<StringBase> names) {
        std::vector<Ranked> order;
        order.reserve(names.size());
        for (StringBase& name : names) {
            order.push_back({prefixOf(view(name)), &name});
        }
        std::sort(order.begin(), order.end());
        m_names.reserve(names.size());
        for (const Ranked& each : order) {
            if (m_names.empty() || m_names.back() != *each.name) {
                m_names.push_back(std::move(*each.name));
            }
        }
    }

    /// @return how many names there are
    [[nodiscard]] std::size_t size() const noexcept { return m_names.size(); }

    /// The name at a position.
    /// @param position 0 to `size()` - 1
    /// @return the name; lives as long as this set
    [[nodiscard]] const StringBase& operator[](std::size_t position) const noexcept {
        return m_names[position];
    }

    /// @return where the names start, in byte order
    [[nodiscard]] auto begin() const noexcept { return m_names.begin(); }
    /// @return where they end
    [[nodiscard]] auto end() const noexcept { return m_names.end(); }

    /// The position of a name in byte order.
    /// @param name any text
    /// @return 0 to `size()` - 1; `size()` when it is not a member
    [[nodiscard]] std::size_t position(std::string_view name) const noexcept {
        const auto found = std::lower_bound(m_names.begin(), m_names.end(), name, ltptstr());
        const bool member = found != m_names.end() && ltptstr::view(*found) == name;
        return member ? static_cast<std::size_t>(found - m_names.begin()) : size();
    }

    /// Is a name a member?
    /// @param name any text
    /// @return whether it is
    [[nodiscard]] bool contains(std::string_view name) const noexcept { return position(name) != size(); }

private:
    /// A name with its first bytes as a number of the same order: most comparisons need no more, and sorting moves little.
    struct Ranked {
        std::uint64_t prefix;
        StringBase* name;

        bool operator<(const Ranked& other) const noexcept {
            return prefix != other.prefix ? prefix < other.prefix : ltptstr()(*name, *other.name);
        }
    };

    [[nodiscard]] static std::uint64_t prefixOf(std::string_view name) noexcept {
        std::uint64_t prefix = 0;
        for (std::size_t byte = 0; byte != sizeof prefix; ++byte) {
            prefix = prefix << 8 | (byte < name.size() ? static_cast<unsigned char>(name[byte]) : 0U);
        }
        return prefix;
    }

    std::vector<StringBase> m_names;
};
