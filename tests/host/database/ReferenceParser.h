#pragma once

#include <string>
#include <string_view>
#include <vector>

/// Reads a database file the plain way: every byte carries its place along, lines are taken apart into copies.
/// Shares nothing with the product, which is checked against it.
class ReferenceParser {
public:
    struct Byte {
        char value;
        unsigned line;
        unsigned column;
    };
    using Bytes = std::vector<Byte>;

    struct Entry {
        std::string key;
        Bytes value;
    };
    struct Section {
        std::string name; ///< empty for the family's own
        std::vector<Entry> entries;
    };

    /// Adds a layer on top.
    void add(std::string_view text);

    std::vector<Section> sections{{}};
    std::vector<unsigned> faultLines; ///< where each faulty line starts, in order

private:
    static std::vector<Bytes> physicalLines(std::string_view text);
    [[nodiscard]] bool addHeader(const std::string& text);
    [[nodiscard]] bool addAssignment(const Bytes& line);

    int m_open = 0; ///< the section that is open, -1 for none
};
