// The compact form of all answers, which the page's script turns into what is looked at.
#include "report/PageData.h"

#include "model/Multiboot.h"
#include "model/Vocabulary.h"
#include "query/ManagerQueries.h"
#include "report/HtmlEscape.h"

#include <fmt/format.h>

#include <iterator>

namespace report {

namespace {

void appendItem(std::string& list, std::string_view item) {
    if (!list.empty()) {
        list += ',';
    }
    list += item;
}

void appendNumber(std::string& list, std::size_t number) {
    const fmt::format_int digits(number);
    appendItem(list, {digits.data(), digits.size()});
}

std::string jsonList(const std::vector<std::string>& texts, std::size_t count) {
    std::string list;
    for (std::size_t i = 0; i < count; ++i) {
        appendItem(list, jsonString(texts.at(i)));
    }
    return '[' + list + ']';
}

std::string jsonList(const std::vector<std::string>& texts) { return jsonList(texts, texts.size()); }

std::string rowsJson(const std::vector<DeviceTable::Row>& rows, bool withBsdl) {
    std::string list;
    for (const DeviceTable::Row& row : rows) {
        std::string fields = jsonString(row.key);
        for (const DeviceTable::Outputs outputs : row.outputs) {
            appendNumber(fields, outputs);
        }
        if (withBsdl) {
            appendNumber(fields, row.bsdl);
        }
        appendItem(list, '[' + fields + ']');
    }
    return '[' + list + ']';
}

std::string tablesJson(const DeviceDetails& details) {
    return fmt::format(R"({{"modes":{},"operations":{},"options":{}}})", jsonList(details.modes),
                       rowsJson(details.operations->rows, true), rowsJson(details.options->rows, false));
}

std::string nameOf(const std::string& type, const std::string& width, const std::string& position) {
    return fmt::format("{} {} {}", type, width, position);
}

/// What stands for texts and rows in one family's data.
template <typename Chunk>
class Encoder {
public:
    explicit Encoder(Chunk& chunk) : m_chunk(chunk) {}

    void append(std::string& list, const catalogue::Origin& origin) {
        appendNumber(list, m_chunk.files.ofText(origin.file));
        appendNumber(list, origin.line);
        appendNumber(list, origin.column);
    }

    [[nodiscard]] std::string properties(const Properties& properties) {
        if (properties.empty()) {
            return "0";
        }
        std::string list;
        std::string shared;
        for (const Property& property : properties) {
            const std::string one = '[' + row(property) + ']';
            if (property.from == "device") {
                appendItem(list, one);
            } else {
                appendNumber(shared, m_chunk.rows.ofJson(one));
            }
        }
        appendNumber(list, m_chunk.sets.ofJson('[' + shared + ']'));
        return '[' + list + ']';
    }

private:
    [[nodiscard]] std::string row(const Property& property) {
        std::string fields;
        appendNumber(fields, m_chunk.words.ofText(property.key));
        appendNumber(fields, m_chunk.words.ofText(property.from));
        append(fields, property.origin);
        for (const std::string& value : property.values) {
            appendItem(fields, jsonString(value));
        }
        return fields;
    }

    Chunk& m_chunk;
};

} // namespace

std::size_t Dictionary::ofText(std::string_view text) {
    const auto known = m_positions.find(text);
    return known != m_positions.end() ? known->second : add(text, jsonString(text));
}

std::size_t Dictionary::ofJson(std::string_view json) {
    const auto known = m_positions.find(json);
    return known != m_positions.end() ? known->second : add(json, json);
}

std::size_t Dictionary::add(std::string_view key, std::string_view json) {
    appendItem(m_list, json);
    return m_positions.emplace(key, m_positions.size()).first->second;
}

PageData::Chunk& PageData::chunk(const std::string& family) {
    const auto [known, isNew] = m_familyPositions.try_emplace(family, m_chunks.size());
    if (isNew) {
        m_chunks.emplace_back();
        m_familyNames.push_back(family);
    }
    appendNumber(m_families, known->second);
    return m_chunks[known->second];
}

void PageData::add(const DeviceDetails& details) {
    Chunk& own = chunk(details.family);
    appendItem(m_names, jsonString(details.name));
    const auto [table, isNew] =
        m_tablePositions.try_emplace({details.operations, details.options, details.modes});
    if (isNew) {
        table->second = m_tables.ofJson(tablesJson(details));
    }
    appendNumber(m_tableOf, table->second);
    appendItem(m_idcodes, jsonString(details.idcode ? details.idcode->value : ""));
    if (const std::string reason = details.whyIncomplete(); !reason.empty()) {
        appendItem(m_faults, fmt::format("\"{}\":{}", m_count, jsonString(reason)));
    }
    for (const DeviceDetails::Arrangement& one : details.multiboot) {
        appendNumber(m_multiboot[nameOf(one.type, one.width, one.position)], m_count);
    }
    Encoder encoder(own);
    std::string idcodeOrigin;
    if (details.idcode) {
        encoder.append(idcodeOrigin, details.idcode->origin);
    }
    std::string fields = details.idcode ? '[' + idcodeOrigin + ']' : "0";
    appendItem(fields, encoder.properties(details.shownProperties()));
    appendItem(fields, encoder.properties(details.flashProperties));
    appendItem(own.devices, '[' + fields + ']');
    ++m_count;
}

std::string PageData::index() const {
    std::string arrangements;
    multiboot::forEachArrangement([&](const std::string& type, const std::string& width, bool lead) {
        const std::string arrangement = nameOf(type, width, lead ? "lead" : "chain");
        if (const auto found = m_multiboot.find(arrangement); found != m_multiboot.end()) {
            appendItem(arrangements, fmt::format("[{},[{}]]", jsonString(arrangement), found->second));
        }
    });
    return fmt::format(R"({{"modes":{},"outputs":{},"letters":{},"spi":{},"families":{},"tables":{},)"
                       R"("names":[{}],"family":[{}],"table":[{}],"idcode":[{}],"faults":{{{}}},)"
                       R"("multiboot":[{}]}})",
                       jsonList(vocabulary::modes(), DeviceTable::MODES),
                       jsonList(vocabulary::outputs(), DeviceTable::OUTPUTS), jsonString(outputLetters()),
                       jsonString(questions::SPI_MODE_RULE), jsonList(m_familyNames), m_tables.list(),
                       m_names, m_families, m_tableOf, m_idcodes, m_faults, arrangements);
}

void PageData::appendTo(std::string& html) const {
    html += R"(<script type="application/json" id="index">)" + index() + "</script>\n";
    for (std::size_t family = 0; family < m_chunks.size(); ++family) {
        const Chunk& chunk = m_chunks[family];
        fmt::format_to(std::back_inserter(html),
                       R"(<script type="application/json" id="family-{}">{{"files":{},"words":{},)"
                       R"("rows":{},"sets":{},"devices":[{}]}}</script>)"
                       "\n",
                       family, chunk.files.list(), chunk.words.list(), chunk.rows.list(), chunk.sets.list(),
                       chunk.devices);
    }
}

} // namespace report
