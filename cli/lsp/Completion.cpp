// Completion: finds out which field the cursor is in, by the text before it alone, and what such a field holds.
#include "lsp/Completion.h"

#include "lsp/Statement.h"
#include "model/RecordSplitter.h"
#include "text/Suggest.h"

#include <fmt/format.h>

#include <algorithm>
#include <set>

namespace lsp {

namespace {

using schema::Content;

// Kinds of items.
constexpr int CLASS = 7;
constexpr int PROPERTY = 10;
constexpr int KEYWORD = 14;

constexpr std::string_view BLANKS = " \t";

std::string_view withoutLeadingBlanks(std::string_view text) {
    return text.substr(std::min(text.find_first_not_of(BLANKS), text.size()));
}

std::string_view withoutTrailingBlanks(std::string_view text) {
    return text.substr(0, text.find_last_not_of(BLANKS) + 1);
}

/// The text before the cursor, back to the start of its logical line.
struct Context {
    std::string text;           ///< continuation lines joined
    std::string_view section;   ///< of the device; empty: the family's own keys
    schema::File kind{};        ///< FAMILY in a section
    std::size_t cursor = 0;     ///< the column in bytes, from 0
    std::size_t fieldStart = 0; ///< of the last field in the cursor's line, likewise
};

Context contextOf(const View& view, const Position& position) {
    Context context;
    context.kind = schema::fileOf(view.family.name);
    const auto cursorLine = static_cast<unsigned>(position.line) + 1U;
    for (const AcdLines::Line& line : view.file.lines()) {
        if (line.kind == AcdLines::Kind::HEADER && line.firstLine < cursorLine) {
            context.section = line.name;
            context.kind = schema::File::FAMILY;
        }
    }
    // A line that ends with "\" is continued, but for a comment.
    unsigned first = cursorLine;
    while (first > 1 && view.file.source(first - 1).ends_with('\\') &&
           !withoutLeadingBlanks(view.file.source(first - 1)).starts_with('#')) {
        --first;
    }
    for (unsigned line = first; line < cursorLine; ++line) {
        std::string_view source = withoutLeadingBlanks(view.file.source(line));
        source.remove_suffix(1);
        context.text += withoutTrailingBlanks(source);
    }
    const std::string_view source = view.file.source(cursorLine);
    context.cursor = bytesOf(source, position.character, view.encoding);
    const std::string_view before = source.substr(0, context.cursor);
    context.text += withoutLeadingBlanks(before);
    const std::size_t separator = before.find_last_of("=,:[");
    context.fieldStart = separator == before.npos ? 0 : separator + 1;
    context.fieldStart += std::min(before.substr(context.fieldStart).find_first_not_of(BLANKS),
                                   before.size() - context.fieldStart);
    return context;
}

/// Collects items. Editors filter them again, so too many are cut off with a note that there are more.
class Items {
public:
    Items(const View& view, const Context& context, const Position& position)
        : m_typed(view.file.source(static_cast<unsigned>(position.line) + 1U)
                      .substr(context.fieldStart, context.cursor - context.fieldStart)),
          m_prefix(lowerCase(m_typed)),
          m_range(asJson(Range{positionOf(view.file, static_cast<unsigned>(position.line) + 1U,
                                          context.fieldStart + 1, view.encoding),
                               position})) {}

    [[nodiscard]] const std::string& prefix() const noexcept { return m_prefix; }

    void add(std::string_view text, int kind, std::string_view detail, std::string_view after = {}) {
        constexpr std::size_t MAX_ITEMS = 500;
        if (!lowerCase(text).starts_with(m_prefix) || !m_seen.emplace(text).second) {
            return;
        }
        if (m_items.size() == MAX_ITEMS) {
            m_isIncomplete = true;
            return;
        }
        m_items.push_back({{"label", std::string(text)},
                           {"kind", kind},
                           {"detail", std::string(detail)},
                           {"textEdit", {{"range", m_range}, {"newText", std::string(text).append(after)}}}});
    }

    /// Adds a name that the database has, unless that is what is being typed.
    void addKnown(std::string_view text, int kind, std::string_view detail) {
        if (text != m_typed) {
            add(text, kind, detail);
        }
    }

    template <typename Names>
    void addAll(const Names& names, int kind, std::string_view detail) {
        for (const auto& name : names) {
            add(name, kind, detail);
        }
    }

    [[nodiscard]] Json list() && { return {{"isIncomplete", m_isIncomplete}, {"items", std::move(m_items)}}; }

private:
    std::string_view m_typed; ///< of the field, before the cursor
    std::string m_prefix;     ///< the same in lower case
    Json m_range;
    Json m_items = Json::array();
    std::set<std::string> m_seen;
    bool m_isIncomplete = false;
};

class Completer {
public:
    Completer(const View& view, const Position& position)
        : m_view(view), m_model(view.workspace.model()), m_context(contextOf(view, position)),
          m_items(view, m_context, position) {}

    [[nodiscard]] Json complete() && {
        const std::string_view text = m_context.text;
        if (text.starts_with('[')) {
            addHeaders();
        } else if (const std::size_t equals = text.find('='); equals == text.npos) {
            addKeys();
        } else {
            std::string_view key = text.substr(0, equals);
            const bool isAppended = key.ends_with('+');
            key.remove_suffix(isAppended ? 1 : 0);
            addValues(withoutTrailingBlanks(key), isAppended, withoutLeadingBlanks(text.substr(equals + 1)));
        }
        return std::move(m_items).list();
    }

private:
    /// The devices of the family, and those that have an IDCODE and no section yet.
    void addHeaders() {
        for (const lint::Section& device : m_view.family.devices) {
            m_items.add(device.name.text, CLASS, "device");
        }
        for (const lint::Item& item : m_model.baseKeys().items(schema::IDCODE)) {
            const std::string_view name = item.fields.front().text;
            if (m_model.deviceInAnyCase(std::string(name)) == nullptr) {
                m_items.add(name, CLASS, "device without a section");
            }
        }
    }

    void addKeys() {
        if (m_context.text.starts_with('#')) {
            return;
        }
        const auto add = [this](const std::string& key) {
            m_items.add(key, PROPERTY, schema::formOf(m_context.kind, key), " = ");
        };
        const std::vector<std::string> keys = schema::fixedKeys(m_context.kind);
        std::for_each(keys.begin(), keys.end(), add);
        if (m_context.kind == schema::File::SPI) {
            for (const lint::FlashList& list : m_model.flashFamilies()) {
                add(schema::devicesKey(list.family.text));
            }
            for (const std::string& flash : m_model.flashNames()) {
                add(schema::propertyKey(flash));
            }
        }
    }

    void addValues(std::string_view key, bool isAppended, std::string_view value) {
        schema::Field field;
        AcdLines::Line line{};
        line.kind = isAppended ? AcdLines::Kind::APPEND : AcdLines::Kind::ASSIGNMENT;
        line.name = key;
        field.item = firstItem(m_context.kind, line);
        if (schema::shapeOf(m_context.kind, key) == schema::Shape::RECORDS) {
            field.item += static_cast<std::size_t>(std::count(value.begin(), value.end(), splitter::RECORDS));
            value.remove_prefix(value.rfind(splitter::RECORDS) + 1); // 0 without a separator
            field.field = static_cast<std::size_t>(std::count(value.begin(), value.end(), splitter::FIELDS));
            field.name = value.substr(0, value.find(splitter::FIELDS));
        }
        const Content content = schema::contentOf(m_context.kind, key, field);
        m_items.addAll(schema::wordsOf(content), KEYWORD, "");
        addNames(content, key, field.name);
    }

    void addNames(Content content, std::string_view key, std::string_view record) {
        switch (content) {
        case Content::PROPERTY_NAME:
            return addUsed(key, [this](const lint::Item& item, std::size_t) {
                m_items.addKnown(item.fields.front().text, PROPERTY, "property");
            });
        case Content::TEXT:
            return addUsedValues(key, record, "");
        case Content::PACKAGE_NAME:
            return addPackages(key);
        case Content::FAMILY:
            return addFamilies();
        case Content::DEVICE:
            return addDevices();
        case Content::OWNER:
        case Content::OPTION_OWNER:
            addFamilies();
            return addDevices();
        case Content::FLASH_FAMILY:
            return m_items.addAll(schema::FLASH_CLASSES, KEYWORD, "class of flashes");
        case Content::FLASH:
            return addFlashes();
        case Content::FLASH_OR_DEVICE:
            addFlashes();
            return addDevices();
        case Content::PART:
            return addParts();
        default:
            return;
        }
    }

    /// Calls `use(item, first value)` for the properties that the file's family, or its flashes, have already.
    template <typename Use>
    void addUsed(std::string_view key, Use use) {
        const auto useAll = [&use](const lint::Section& section, std::string_view name,
                                   std::size_t firstValue) {
            for (const lint::Item& item : section.items(name)) {
                use(item, firstValue);
            }
        };
        const bool isOfFlash = m_context.kind == schema::File::SPI && !key.starts_with("PROPERT");
        m_view.family.forEachSection([&](const lint::Section& section) {
            for (const schema::PropertyKey& each : schema::PROPERTY_KEYS) {
                if (!isOfFlash) {
                    useAll(section, each.key, each.firstValue);
                }
            }
        });
        for (const auto& [name, value] : m_model.spiKeys().values) {
            if (isOfFlash && name.ends_with(schema::PROPERTY_SUFFIX)) {
                useAll(m_model.spiKeys(), name, 1);
            }
        }
    }

    void addFamilies() { m_items.addAll(m_model.familyNames(), CLASS, "family"); }
    void addDevices() { m_items.addAll(m_model.deviceNames(), CLASS, "device"); }
    void addFlashes() {
        for (const std::string& flash : m_model.flashNames()) {
            m_items.addKnown(flash, CLASS, "flash");
        }
    }

    /// The values that a property has elsewhere.
    void addUsedValues(std::string_view key, std::string_view property, std::string_view detail) {
        addUsed(key, [&](const lint::Item& item, std::size_t firstValue) {
            for (std::size_t i = firstValue; item.fields.front().text == property && i < item.fields.size();
                 ++i) {
                m_items.addKnown(item.fields[i].text, KEYWORD, detail);
            }
        });
    }

    void addPackages(std::string_view key) {
        if (m_context.kind == schema::File::SPI) {
            addUsedValues(key, schema::PACKAGE, "package");
        }
        std::set<std::string_view> packages;
        for (const lint::Device& device : m_model.devices()) {
            for (const lint::Token& package : m_model.packages(device)) {
                packages.insert(package.text);
            }
        }
        for (const std::string_view package : packages) {
            m_items.addKnown(package, CLASS, "package");
        }
    }

    /// One part after the other: the mode, the device and the package.
    void addParts() {
        const std::string& prefix = m_items.prefix();
        const std::size_t first = prefix.find('_');
        if (first == prefix.npos) {
            for (const std::string& mode : schema::wordsOf(Content::MODE_KEY)) {
                m_items.add(mode + '_', KEYWORD, "mode");
            }
            return;
        }
        const std::string mode = upperCase(prefix.substr(0, first + 1));
        for (const lint::Device& device : m_model.devices()) {
            const std::string start = mode + std::string(device.section->name.text) + '_';
            if (prefix.find('_', first + 1) == prefix.npos) {
                m_items.add(start, CLASS, "device");
            } else if (lowerCase(prefix).starts_with(lowerCase(start))) {
                for (const lint::Token& package : m_model.packages(device)) {
                    m_items.add(start + std::string(package.text), CLASS, "package");
                }
            }
        }
    }

    const View& m_view;
    const lint::Model& m_model;
    Context m_context;
    Items m_items;
};

} // namespace

Json completionOf(const View& view, const Position& position) { return Completer(view, position).complete(); }

} // namespace lsp
