#pragma once

#include <tarvik/ltptstr.h>

#include <algorithm>
#include <cstddef>
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
    explicit NameSet(std::vector<StringBase> names) : m_names(std::move(names)) {
        std::sort(m_names.begin(), m_names.end(), ltptstr());
        m_names.erase(std::unique(m_names.begin(), m_names.end()), m_names.end());
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
    std::vector<StringBase> m_names;
};
