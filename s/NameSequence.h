#pragma once

#include "TextHash.h"

#include <StringBase.h>

#include <cstddef>
#include <string_view>
#include <unordered_set>
#include <utility>
#include <vector>

/// Names in the order in which they were added, repeated ones included, with an index for membership.
class NameSequence {
public:
    /// Adds a name at the end. Changes nothing if memory runs out.
    /// @param name to be added, whether it is among them or not
    void push_back(StringBase name) {
        m_names.push_back(std::move(name));
        try {
            m_index.insert(m_names.back());
        } catch (...) {
            m_names.pop_back();
            throw;
        }
    }

    /// @param name compared byte by byte
    /// @return whether it is among them; takes the same time however many there are
    [[nodiscard]] bool contains(std::string_view name) const { return m_index.find(name) != m_index.end(); }

    /// @return whether there are none
    [[nodiscard]] bool empty() const noexcept { return m_names.empty(); }
    /// @return how many there are, repeated ones included
    [[nodiscard]] std::size_t size() const noexcept { return m_names.size(); }
    /// @return the last name, of at least one
    [[nodiscard]] const StringBase& back() const noexcept { return m_names.back(); }
    /// @return the first name
    [[nodiscard]] auto begin() const noexcept { return m_names.begin(); }
    /// @return the end
    [[nodiscard]] auto end() const noexcept { return m_names.end(); }

private:
    std::vector<StringBase> m_names;
    std::unordered_set<StringBase, TextHash, TextEqual> m_index;
};
