// Takes databases apart with the tests' own reader, and writes them again by chance.
#include "DatabaseRewriter.h"

#include "reference/ReferenceReader.h"

#include <algorithm>
#include <deque>
#include <set>
#include <string>
#include <utility>

namespace {

using reference::Files;
using reference::RandomSource;
using reference::Words;

/// One line that sets a key, or adds to it.
struct Statement {
    std::string key;
    std::string text;
    bool appends;
};

/// What is said of one key of one section, which keeps its order.
struct Queue {
    std::size_t section; ///< 0: the family's own
    std::deque<Statement> statements;
};

bool isBlank(char byte) { return byte == ' ' || byte == '\t'; }

/// Writes the file of one layer.
class LayerWriter {
public:
    LayerWriter(RandomSource& pick, const std::vector<std::string>& sections, bool isBottom)
        : m_pick(pick), m_sections(sections), m_isBottom(isBottom),
          m_lineEnd(pick.chance(30) ? "\r\n" : "\n") {
        if (pick.chance(10)) {
            m_text = "\xEF\xBB\xBF";
        }
    }

    [[nodiscard]] std::string write(std::vector<Queue> queues) {
        // The family's own keys can't be set behind a header.
        const auto sections = std::partition(queues.begin(), queues.end(),
                                             [](const Queue& queue) { return queue.section == 0; });
        writeAll({queues.begin(), sections});
        // The bottom layer settles how devices are spelt, and in which order they come.
        for (std::size_t section = 1; m_isBottom && section < m_sections.size(); ++section) {
            line('[' + m_sections[section] + ']');
            m_open = section;
        }
        writeAll({sections, queues.end()});
        return m_text;
    }

private:
    void writeAll(std::vector<Queue> queues) {
        while (!queues.empty()) {
            const auto at = queues.begin() + m_pick.below(static_cast<int>(queues.size()));
            if (at->section != m_open) {
                line('[' + inAnyCase(m_sections[at->section]) + ']');
                m_open = at->section;
            }
            write(at->statements.front());
            at->statements.pop_front();
            if (at->statements.empty()) {
                queues.erase(at);
            }
        }
    }

    void write(const Statement& statement) {
        if (m_pick.chance(15)) {
            line(m_pick.from(Words{"# a comment", "", " \t", "  #[KS50]", "# it goes on \\"}));
        }
        const std::string equals = statement.appends ? "+=" : "=";
        std::string text = m_pick.from(Words{"", "", " ", "\t"}) + statement.key +
                           m_pick.from(Words{"", " ", "   "}) + equals + m_pick.from(Words{"", " ", "\t "});
        const std::string& value = statement.text;
        const std::size_t cut =
            m_pick.chance(30) ? static_cast<std::size_t>(m_pick.below(static_cast<int>(value.size()) + 1))
                              : value.size();
        if (cut < value.size() && cut > 0 && !isBlank(value[cut - 1]) && !isBlank(value[cut])) {
            line(text + value.substr(0, cut) + m_pick.from(Words{"\\", " \\", "\t\\"}));
            line(m_pick.from(Words{"", "    ", "\t"}) + value.substr(cut));
        } else {
            line(text + value + m_pick.from(Words{"", "", " ", " \t"}));
        }
    }

    [[nodiscard]] std::string inAnyCase(const std::string& name) {
        switch (m_pick.below(3)) {
        case 0:
            return reference::lower(name);
        case 1:
            return reference::upper(name);
        default:
            return name;
        }
    }

    void line(const std::string& text) { m_text += text + m_lineEnd; }

    RandomSource& m_pick;
    const std::vector<std::string>& m_sections;
    bool m_isBottom;
    std::string m_lineEnd;
    std::size_t m_open = 0;
    std::string m_text;
};

/// Spreads what one file says over layers.
class FileRewriter {
public:
    FileRewriter(RandomSource& pick, std::size_t layers) : m_pick(pick), m_layers(layers) {}

    /// @return the texts of the layers, the bottom one first; empty where the layer has no such file
    [[nodiscard]] std::vector<std::string> rewrite(const std::string& text) {
        const reference::ParsedFile file = reference::parse(text);
        addAll(0, file.own);
        for (const reference::Section& section : file.sections) {
            m_sections.push_back(section.name);
            addAll(m_sections.size() - 1, section.keys);
        }
        std::vector<std::string> texts;
        for (std::size_t layer = 0; layer < m_layers.size(); ++layer) {
            const bool isBottom = layer == 0;
            texts.push_back(isBottom || !m_layers[layer].empty()
                                ? LayerWriter(m_pick, m_sections, isBottom).write(std::move(m_layers[layer]))
                                : "");
        }
        return texts;
    }

private:
    void addAll(std::size_t section, const reference::Keys& keys) {
        for (const auto& [key, value] : keys) {
            add(section, key, reordered(key, value));
        }
    }

    /// Says one value in one or several layers: a part in each, and now and then another value that is replaced.
    void add(std::size_t section, const std::string& key, const std::string& value) {
        std::size_t layer = static_cast<std::size_t>(m_pick.below(static_cast<int>(m_layers.size())));
        std::vector<Queue> queues(m_layers.size(), Queue{section, {}});
        if (m_pick.chance(20)) {
            queues[static_cast<std::size_t>(m_pick.below(static_cast<int>(layer) + 1))].statements.push_back(
                {key, "replaced", m_pick.chance(50)});
        }
        bool appends = false;
        for (std::string rest = value;; appends = true) {
            const std::size_t length = m_pick.chance(60) ? rest.size() : cutAt(rest);
            queues[layer].statements.push_back({key, rest.substr(0, length), appends});
            rest.erase(0, length);
            if (rest.empty()) {
                break;
            }
            layer += static_cast<std::size_t>(m_pick.below(static_cast<int>(m_layers.size() - layer)));
        }
        for (std::size_t i = 0; i < queues.size(); ++i) {
            if (!queues[i].statements.empty()) {
                m_layers[i].push_back(std::move(queues[i]));
            }
        }
    }

    /// Where a value may be cut: blanks at the ends of its parts would be lost.
    [[nodiscard]] std::size_t cutAt(const std::string& text) {
        if (text.empty()) {
            return 0;
        }
        const auto cut = static_cast<std::size_t>(m_pick.below(static_cast<int>(text.size())) + 1);
        const bool isSafe = cut < text.size() && !isBlank(text[cut - 1]) && !isBlank(text[cut]);
        return isSafe ? cut : text.size();
    }

    /// The value with its items in another order, where that means nothing.
    [[nodiscard]] std::string reordered(const std::string& key, const std::string& value) {
        static const std::set<std::string> lists{"DEVICE_SUPPORTED", "PROGRAM_OPTION_PACKAGE",
                                                 "NOT_SUPPORTED_PART_IN_MODE"};
        static const std::set<std::string> tables{"OPERATION", "BSDL_OPERATION", "PROGRAM_OPTION"};
        if (value.empty() || (lists.count(key) == 0 && tables.count(key) == 0)) {
            return value;
        }
        const char separator = lists.count(key) != 0 ? ',' : ':';
        std::vector<std::string> items = reference::split(value, separator);
        for (std::size_t i = items.size(); i > 1; --i) {
            std::swap(items[i - 1], items[static_cast<std::size_t>(m_pick.below(static_cast<int>(i)))]);
        }
        std::string joined;
        for (const std::string& item : items) {
            joined += (&item == &items.front() ? "" : std::string(1, separator)) + item;
        }
        return joined;
    }

    RandomSource& m_pick;
    std::vector<std::string> m_sections{""};
    std::vector<std::vector<Queue>> m_layers;
};

} // namespace

std::vector<Files> rewritten(RandomSource& pick, const Files& files) {
    const auto count = static_cast<std::size_t>(1 + pick.below(3));
    std::vector<Files> layers(count);
    std::set<std::string> seen;
    for (const auto& [name, text] : files) {
        // Of two files whose names differ in case alone the first one counts.
        if (!seen.insert(reference::lower(name)).second) {
            continue;
        }
        const std::vector<std::string> texts = FileRewriter(pick, count).rewrite(text);
        for (std::size_t layer = 0; layer < count; ++layer) {
            if (!texts[layer].empty() || layer == 0) {
                layers[count - 1 - layer][name] = texts[layer];
            }
        }
    }
    return layers;
}
