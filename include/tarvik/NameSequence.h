#pragma once

#include <tarvik/TextHash.h>

#include <cstddef>
#include <string_view>
#include <unordered_set>
#include <utility>
#include <vector>

/// Names in the order in which they were added, repeated ones included, and an index beside them that tells
/// whether a name is among them.
class NameSequence {
public:
    /// Changes nothing when memory runs out.
    void push_back(StringBase name) {
        m_names.push_back(std::move(name));
        try {
            m_index.insert(m_names.back());
        } catch (...) {
            m_names.pop_back();
            throw;
        }
    }

    [[nodiscard]] bool contains(std::string_view name) const { return m_index.find(name) != m_index.end(); }

    [[nodiscard]] bool empty() const noexcept { return m_names.empty(); }
    [[nodiscard]] std::size_t size() const noexcept { return m_names.size(); }
    [[nodiscard]] const StringBase& back() const noexcept { return m_names.back(); }
    [[nodiscard]] auto begin() const noexcept { return m_names.begin(); }
    [[nodiscard]] auto end() const noexcept { return m_names.end(); }

private:
    std::vector<StringBase> m_names;
    std::unordered_set<StringBase, TextHash, TextEqual> m_index;
};
