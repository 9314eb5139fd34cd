// What an editor shows of the text under the cursor: the value that is in force, the meaning of a word, a finding.
#include "lsp/Hover.h"

#include "lsp/Names.h"
#include "lsp/Statement.h"
#include "model/Vocabulary.h"
#include "text/Suggest.h"

#include "database/FileNames.h"

#include <fmt/format.h>
#include <fmt/ranges.h>

#include <algorithm>

namespace lsp {

namespace {

/// Text that Markdown shows as it is.
std::string code(std::string_view text) {
    constexpr std::size_t MAX_LENGTH = 400;
    std::string shown(text.substr(0, MAX_LENGTH));
    std::replace(shown.begin(), shown.end(), '`', '\'');
    return fmt::format("`{}{}`", shown, text.size() > MAX_LENGTH ? "..." : "");
}

class Hover {
public:
    Hover(const View& view, const Position& position)
        : m_view(view), m_position(position), m_place(view.placeOf(position)) {}

    [[nodiscard]] Json show() {
        addFindings();
        addLine();
        addName();
        if (m_paragraphs.empty()) {
            return {};
        }
        Json hover{{"contents",
                    {{"kind", "markdown"}, {"value", fmt::format("{}", fmt::join(m_paragraphs, "\n\n"))}}}};
        if (m_range) {
            hover["range"] = asJson(*m_range);
        }
        return hover;
    }

private:
    [[nodiscard]] bool isAt(const lint::Token& token) const {
        return m_place.touches(token.location, token.text.size());
    }

    /// Where a text is: the file, and its layer if there are several.
    [[nodiscard]] std::string placeOf(const lint::SourceLocation& location) const {
        const std::string& path = location.file->path();
        const bool hasLayers = m_view.workspace.directories().size() > 1;
        return fmt::format("{}:{}{}", acd::fileNameOf(path), location.line,
                           hasLayers ? fmt::format(" in {}", acd::directoryOf(path)) : std::string());
    }

    void addFindings() {
        for (const lint::Finding& finding : m_view.workspace.findingsIn(m_view.file)) {
            if (m_place.touches(finding.location, finding.length)) {
                const lint::Rule& rule = *finding.rule;
                m_paragraphs.push_back(fmt::format("**{}** ({}, `{}`): {}\n\n{}", rule.code,
                                                   nameOf(rule.severity), rule.slug, finding.text,
                                                   rule.explanation()));
            }
        }
    }

    void addLine() {
        const lint::Section* section = &m_view.family.own;
        forEachLine(m_view.file, [&](const AcdLines::Line& line, schema::File kind) {
            if (!isStatement(line)) {
                section = sectionOf(line.name);
                return;
            }
            if (m_place.line < line.firstLine || m_place.line > line.lastLine || section == nullptr) {
                return;
            }
            if (isAt(lsp::nameOf(m_view.file, line))) {
                m_range = m_view.rangeOf(lsp::nameOf(m_view.file, line));
                addKey(*section, line.name, kind);
            }
            const Statement statement(m_view.file, line, kind);
            for (const Field& field : statement.fields()) {
                if (isAt(field.token) && !field.token.text.empty()) {
                    addWord(field);
                    addProperty(*section, line.name, field.record);
                }
            }
        });
    }

    [[nodiscard]] const lint::Section* sectionOf(std::string_view name) const {
        const auto& devices = m_view.family.devices;
        const auto found = std::find_if(devices.begin(), devices.end(), [name](const lint::Section& device) {
            return sameWithoutCase(device.name.text, name);
        });
        return found == devices.end() ? nullptr : &*found;
    }

    void addKey(const lint::Section& section, std::string_view key, schema::File kind) {
        const std::string_view form = schema::formOf(kind, key);
        m_paragraphs.push_back(form.empty() ? fmt::format("`{}` is not read here", key)
                                            : fmt::format("`{} = {}`", key, form));
        const lint::Value* const value = section.find(key);
        if (value == nullptr) {
            return;
        }
        m_paragraphs.push_back(
            fmt::format("In force: {}, set last in {}", code(value->text()), placeOf(value->key.location)));
        for (const lint::Token& replaced : value->replaced()) {
            m_paragraphs.push_back(
                fmt::format("replaces {} of {}", code(replaced.text), placeOf(replaced.location)));
        }
        const lint::Value* const own = m_view.family.own.find(key);
        const bool isHidden = &section != &m_view.family.own && own != nullptr &&
                              std::none_of(schema::PROPERTY_KEYS.begin(), schema::PROPERTY_KEYS.end(),
                                           [key](const auto& each) { return each.key == key; });
        if (isHidden) {
            m_paragraphs.push_back(
                fmt::format("hides {} of the family, {}", code(own->text()), placeOf(own->key.location)));
        }
    }

    void addWord(const Field& field) {
        const std::string text(field.token.text);
        const auto describe = [&](vocabulary::Kind kind, const char* noun) {
            if (const std::optional<int> value = vocabulary::find(kind, text)) {
                const vocabulary::Word& word = vocabulary::words(kind).at(static_cast<std::size_t>(*value));
                m_range = m_view.rangeOf(field.token);
                m_paragraphs.push_back(
                    fmt::format("{} `{}`{}", noun, word.key, word.name.empty() ? "" : ": " + word.name));
            }
        };
        switch (field.content) {
        case schema::Content::OPERATION_NAME:
            return describe(vocabulary::Kind::OPERATION, "operation");
        case schema::Content::OPTION_NAME:
            return describe(vocabulary::Kind::OPTION, "option");
        case schema::Content::TABLE_MODE:
        case schema::Content::MODE_KEY:
            return describe(vocabulary::Kind::MODE, "mode");
        case schema::Content::TABLE_OUTPUT:
        case schema::Content::MODE_OUTPUT:
            return describe(vocabulary::Kind::OUTPUT, "output");
        case schema::Content::OUTPUT_LABEL:
        case schema::Content::FAMILY_LABEL:
            m_paragraphs.emplace_back("a label, which is skipped");
            return;
        case schema::Content::PROPERTY_NAME:
            if (text.starts_with(schema::OPTIONS_PREFIX)) {
                m_paragraphs.push_back(fmt::format("the options of the operation {}",
                                                   code(text.substr(schema::OPTIONS_PREFIX.size()))));
            }
            return describe(vocabulary::Kind::OPERATION, "the modes that offer the operation");
        case schema::Content::COUNT:
            m_paragraphs.push_back(fmt::format("the number of values of {}", field.record));
            return;
        default:
            return;
        }
    }

    /// A property of a device or family: the record that is in force there, and those that it hides.
    void addProperty(const lint::Section& section, std::string_view key, std::string_view property) {
        const auto isKey = [key](const schema::PropertyKey& each) { return each.key == key; };
        if (std::none_of(schema::PROPERTY_KEYS.begin(), schema::PROPERTY_KEYS.end(), isKey)) {
            return;
        }
        std::vector<std::string> records; // the one in force first
        const auto add = [&](const lint::Section& owner) {
            std::for_each(
                schema::PROPERTY_KEYS.rbegin(), schema::PROPERTY_KEYS.rend(), [&](const auto& each) {
                    const std::vector<lint::Item>& items = owner.items(each.key);
                    const auto last = std::find_if(items.rbegin(), items.rend(), [&](const lint::Item& item) {
                        return item.fields.front().text == property;
                    });
                    if (last != items.rend()) {
                        records.push_back(
                            fmt::format("{} of {}, {}", code(last->whole.text),
                                        &owner == &m_view.family.own ? "the family" : owner.name.text,
                                        placeOf(last->whole.location)));
                    }
                });
        };
        add(section);
        if (&section != &m_view.family.own) {
            add(m_view.family.own);
        }
        for (const std::string& record : records) {
            m_paragraphs.push_back((&record == &records.front() ? "In force: " : "hides ") + record);
        }
    }

    void addName() {
        const std::optional<FoundName> found = nameAt(m_view, m_position);
        if (!found) {
            return;
        }
        m_range = found->range;
        const lint::Model& model = m_view.workspace.model();
        const std::string& text = found->name.text;
        switch (found->name.kind) {
        case NameKind::DEVICE:
            if (const lint::Device* const device = model.deviceInAnyCase(text)) {
                addDevice(*device);
            }
            return;
        case NameKind::FAMILY:
            for (const auto& family : model.families()) {
                if (sameWithoutCase(family->name, text)) {
                    m_paragraphs.push_back(
                        fmt::format("family **{}**: {} devices", family->name, family->devices.size()));
                }
            }
            return;
        case NameKind::FLASH:
            for (const lint::FlashList& list : model.flashFamilies()) {
                if (sameWithoutCase(list.family.text, text)) {
                    m_paragraphs.push_back(
                        fmt::format("family of flashes **{}**: {}", text, list.devices.size()));
                }
                for (const lint::Token& flash : list.devices) {
                    if (sameWithoutCase(flash.text, text)) {
                        m_paragraphs.push_back(fmt::format("flash **{}** of {}, {}", flash.text,
                                                           list.family.text, placeOf(flash.location)));
                    }
                }
            }
            return;
        case NameKind::PACKAGE:
            m_paragraphs.push_back(fmt::format("package **{}**", text));
            return;
        }
    }

    void addDevice(const lint::Device& device) {
        const lint::Model& model = m_view.workspace.model();
        std::string text = fmt::format("device **{}** of family {}, {}", device.section->name.text,
                                       device.family->name, placeOf(device.section->name.location));
        std::vector<std::string_view> packages;
        for (const lint::Token& package : model.packages(device)) {
            packages.push_back(package.text);
        }
        if (!packages.empty()) {
            text += fmt::format("; packages {}", fmt::join(packages, ", "));
        }
        for (const lint::Item& item : model.baseKeys().items(schema::IDCODE)) {
            if (item.fields.size() > 1 && item.fields.front().text == device.section->name.text) {
                text += fmt::format("; IDCODE `{}`", item.fields[1].text);
            }
        }
        m_paragraphs.push_back(text);
    }

    const View& m_view;
    Position m_position;
    Place m_place;
    std::vector<std::string> m_paragraphs;
    std::optional<Range> m_range;
};

// Kinds of symbols.
constexpr int FILE = 1;
constexpr int CLASS = 5;
constexpr int PROPERTY = 7;

} // namespace

Json hoverOf(const View& view, const Position& position) { return Hover(view, position).show(); }

Json symbolsOf(const View& view) {
    Json all = Json::array();
    const auto lineEnd = [&view](unsigned line) {
        return positionOf(view.file, line, view.file.source(line).size() + 1, view.encoding);
    };
    forEachLine(view.file, [&](const AcdLines::Line& line, schema::File /*any*/) {
        const Range whole{{line.firstLine - 1U, 0}, lineEnd(line.lastLine)};
        Json symbol{{"name", std::string(line.name)},
                    {"kind", isStatement(line) ? PROPERTY : CLASS},
                    {"range", asJson(whole)},
                    {"selectionRange", asJson(view.rangeOf(nameOf(view.file, line)))}};
        const bool isInSection = isStatement(line) && !all.empty() && all.back().at("kind") == CLASS;
        if (!isStatement(line)) {
            symbol["children"] = Json::array();
        }
        if (isInSection) {
            all.back()["range"]["end"] = asJson(whole.end);
            all.back()["children"].push_back(std::move(symbol));
        } else {
            all.push_back(std::move(symbol));
        }
    });
    return all;
}

Json symbolsOf(const View& anyFile, const std::string& query) {
    constexpr std::size_t MAX_SYMBOLS = 1000;
    Json all = Json::array();
    const std::string wanted = lowerCase(query);
    const auto add = [&](std::string_view name, int kind, const lint::Token& place) {
        if (all.size() < MAX_SYMBOLS && lowerCase(name).find(wanted) != std::string::npos) {
            all.push_back(
                {{"name", std::string(name)}, {"kind", kind}, {"location", anyFile.locationOf(place)}});
        }
    };
    for (const auto& family : anyFile.workspace.model().families()) {
        add(family->name, FILE, {{}, {&family->files.front(), 1, 1}});
        for (const lint::Section& device : family->devices) {
            add(device.name.text, CLASS, device.name);
        }
    }
    return all;
}

} // namespace lsp
