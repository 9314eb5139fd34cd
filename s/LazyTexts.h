#pragma once

#include <tarvik/ltptstr.h>

#include <algorithm>
#include <cstddef>
#include <iterator>
#include <map>
#include <memory>
#include <string_view>
#include <utility>
#include <vector>

/// A map of texts that the start-up fills, and that is sorted when it is first read. Until then it is a log in a few blocks
/// of memory: a large database has tens of thousands of entries, and most processes never ask for one.
class LazyTexts {
public:
    using Map = std::map<StringBase, StringBase, ltptstr>;

    /// Sets the value of a key, which need not be new. No text has a NUL in it: readers return C strings.
    /// @param owner the first part of the key
    /// @param name the rest of it
    /// @param value any text
    void set(std::string_view owner, std::string_view name, std::string_view value) {
        char* const entry = reserve(owner.size() + name.size() + 1 + value.size() + 1);
        char* end = entry + owner.copy(entry, owner.size());
        end += name.copy(end, name.size());
        *end++ = '\0';
        end += value.copy(end, value.size());
        *end = '\0';
    }

    /// Sorts the log into the map, unless that was done before. If memory runs out, the next call does it again.
    /// @return the map; always the same object
    [[nodiscard]] const Map& get() const {
        auto last = m_map.end();
        for (const Block& block : m_log) {
            for (const char* next = block.bytes.get(); next != block.bytes.get() + block.size;) {
                const StringBase key(next);
                next += key.GetLength() + 1;
                const StringBase value(next);
                next += value.GetLength() + 1;
                // The lists of a database are nearly sorted, so most keys belong right after the one before.
                last = m_map.insert_or_assign(last == m_map.end() ? last : std::next(last), key, value);
            }
        }
        m_log.clear();
        return m_map;
    }

private:
    struct Block {
        std::unique_ptr<char[]> bytes;
        std::size_t capacity;
        std::size_t size;
    };

    static constexpr std::size_t MIN_BLOCK = std::size_t{1} << 10;
    static constexpr std::size_t MAX_BLOCK = std::size_t{1} << 16;

    /// Makes room for an entry, which is in one block as a whole.
    [[nodiscard]] char* reserve(std::size_t size) {
        if (m_log.empty() || m_log.back().capacity - m_log.back().size < size) {
            const std::size_t former = m_log.empty() ? 0 : m_log.back().capacity;
            const std::size_t capacity = std::max(size, std::clamp(2 * former, MIN_BLOCK, MAX_BLOCK));
            // Without values: most of a block may never be used.
            m_log.push_back({std::unique_ptr<char[]>(new char[capacity]), capacity, 0});
        }
        Block& block = m_log.back();
        return block.bytes.get() + std::exchange(block.size, block.size + size);
    }

    mutable Map m_map;
    mutable std::vector<Block> m_log;
};
