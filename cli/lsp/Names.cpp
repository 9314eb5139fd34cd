// The one index of names: which fields, headers and keys hold the name of a family, a device, a flash or a package.
#include "lsp/Names.h"

#include "edit/Names.h"
#include "lint/Fix.h"
#include "lsp/Statement.h"
#include "term/ExitCode.h"
#include "text/Suggest.h"

#include "database/FileNames.h"

#include <AcdText.h>

#include <fmt/format.h>

#include <algorithm>

namespace lsp {

namespace {

using schema::Content;

bool containsIgnoringCase(std::string_view text, std::string_view part) {
    return std::search(text.begin(), text.end(), part.begin(), part.end(), [](char left, char right) {
               return AcdText::toLower(left) == AcdText::toLower(right);
           }) != text.end();
}

/// Collects the names in the fields of statements.
class Collector {
public:
    Collector(const lint::Model& model, const std::function<void(const NameUse&)>& use)
        : m_model(model), m_use(use) {}

    void addField(const Field& field) const {
        const lint::Token& token = field.token;
        switch (field.content) {
        case Content::FAMILY:
            return add(NameKind::FAMILY, token);
        case Content::DEVICE:
            return add(NameKind::DEVICE, token);
        case Content::OWNER:
        case Content::FLASH_OR_DEVICE:
            return add(kindOf(token.text), token);
        case Content::FLASH_FAMILY:
        case Content::FLASH:
            return add(NameKind::FLASH, token, true);
        case Content::PACKAGE_NAME:
            return add(NameKind::PACKAGE, token, true);
        case Content::OPTION_OWNER:
            return addOptionOwner(token);
        case Content::PART:
            return addPart(token);
        default:
            return;
        }
    }

    /// The name in front of "_DEVICES" or "_PROPERTY".
    void addKey(const lint::Token& key) const {
        for (const std::string_view suffix : {schema::DEVICES_SUFFIX, schema::PROPERTY_SUFFIX}) {
            if (key.text.ends_with(suffix)) {
                add(NameKind::FLASH, lint::partOf(key, 0, key.text.size() - suffix.size()));
            }
        }
    }

    void add(NameKind kind, const lint::Token& token, bool isDefinition = false) const {
        if (!token.text.empty()) {
            m_use({kind, token, isDefinition});
        }
    }

private:
    [[nodiscard]] NameKind kindOf(std::string_view text) const {
        const std::string name(text);
        return m_model.isFamilyInAnyCase(name)  ? NameKind::FAMILY
               : m_model.isFlashInAnyCase(name) ? NameKind::FLASH
                                                : NameKind::DEVICE;
    }

    void addOptionOwner(const lint::Token& token) const {
        if (m_model.isFamilyInAnyCase(std::string(token.text))) {
            return add(NameKind::FAMILY, token);
        }
        // The longest device that the name begins with; the rest is a package.
        for (std::size_t length = token.text.size(); length > 0; --length) {
            if (m_model.device(token.text.substr(0, length)) != nullptr) {
                add(NameKind::DEVICE, lint::partOf(token, 0, length));
                return add(NameKind::PACKAGE, lint::partOf(token, length, token.text.size() - length));
            }
        }
        add(NameKind::DEVICE, token);
    }

    void addPart(const lint::Token& token) const {
        const std::size_t first = token.text.find('_');
        const std::size_t second = first == token.text.npos ? first : token.text.find('_', first + 1);
        if (second != token.text.npos) {
            const lint::Token name = lint::partOf(token, first + 1, second - first - 1);
            add(kindOf(name.text), name);
            add(NameKind::PACKAGE, lint::partOf(token, second + 1, token.text.size() - second - 1));
        }
    }

    const lint::Model& m_model;
    const std::function<void(const NameUse&)>& m_use;
};

bool isSame(const NameUse& use, const Name& name) {
    return use.kind == name.kind && sameWithoutCase(use.token.text, name.text);
}

void forEachUse(const View& view, const Name& name, const std::function<void(const NameUse&)>& use) {
    const lint::Model& model = view.workspace.model();
    for (const AcdLines* file : model.files()) {
        forEachName(model, *file, name.text, [&](const NameUse& found) {
            if (isSame(found, name)) {
                use(found);
            }
        });
    }
}

/// No line defines a family, so its definition is the start of its files.
std::vector<lint::Token> filesOf(const View& view, const Name& family) {
    std::vector<lint::Token> starts;
    for (const AcdLines* file : view.workspace.model().files()) {
        if (sameWithoutCase(file->family(), family.text)) {
            starts.push_back({{}, {file, 1, 1}});
        }
    }
    return starts;
}

/// The rules of `tarvik rename`.
void requireUsable(const View& view, const Name& name, const std::string& newName) {
    if (name.kind == NameKind::PACKAGE) {
        throw RequestError(ErrorCode::REQUEST_FAILED,
                           "packages cannot be renamed: devices share their names");
    }
    try {
        edit::requireChangeable(name.text);
        edit::requireNewName(view.workspace.model(), newName, name.kind == NameKind::FAMILY, name.text);
    } catch (const CommandError& refused) {
        throw RequestError(ErrorCode::REQUEST_FAILED, refused.what());
    }
}

} // namespace

void forEachName(const lint::Model& model, const AcdLines& file, std::string_view containing,
                 const std::function<void(const NameUse&)>& use) {
    const Collector collector(model, use);
    forEachLine(file, [&](const AcdLines::Line& line, schema::File kind) {
        if (!containsIgnoringCase(line.name, containing) && !containsIgnoringCase(line.value, containing)) {
            return;
        }
        if (!isStatement(line)) {
            collector.add(NameKind::DEVICE, nameOf(file, line), true);
            return;
        }
        if (kind == schema::File::SPI) {
            collector.addKey(nameOf(file, line));
        }
        const Statement statement(file, line, kind);
        for (const Field& field : statement.fields()) {
            collector.addField(field);
        }
    });
}

std::optional<FoundName> nameAt(const View& view, const Position& position) {
    std::optional<FoundName> found;
    const Place place = view.placeOf(position);
    forEachName(view.workspace.model(), view.file, {}, [&](const NameUse& use) {
        if (place.touches(use.token.location, use.token.text.size())) {
            found = {{use.kind, std::string(use.token.text)}, view.rangeOf(use.token)};
        }
    });
    return found;
}

Json definitionsOf(const View& view, const Name& name) {
    Json all = Json::array();
    if (name.kind == NameKind::FAMILY) {
        for (const lint::Token& start : filesOf(view, name)) {
            all.push_back(view.locationOf(start));
        }
        return all;
    }
    forEachUse(view, name, [&](const NameUse& use) {
        if (use.isDefinition) {
            all.push_back(view.locationOf(use.token));
        }
    });
    return all;
}

Json referencesOf(const View& view, const Name& name, bool withDefinitions) {
    Json all = Json::array();
    if (withDefinitions && name.kind == NameKind::FAMILY) {
        all = definitionsOf(view, name);
    }
    forEachUse(view, name, [&](const NameUse& use) {
        if (withDefinitions || !use.isDefinition) {
            all.push_back(view.locationOf(use.token));
        }
    });
    return all;
}

Json renamingOf(const View& view, const Name& name, const std::string& newName, bool canRenameFiles) {
    requireUsable(view, name, newName);
    if (name.kind == NameKind::FAMILY && !canRenameFiles) {
        throw RequestError(ErrorCode::REQUEST_FAILED, "this editor cannot rename the files of a family");
    }
    std::map<std::string, Json> edits; // by path
    forEachUse(view, name, [&](const NameUse& use) {
        if (!lint::replacing(use.token, newName)) {
            throw RequestError(ErrorCode::REQUEST_FAILED,
                               fmt::format("{}:{}: the name is continued in the next line",
                                           use.token.location.file->path(), use.token.location.line));
        }
        Json& list = edits.try_emplace(use.token.location.file->path(), Json::array()).first->second;
        list.push_back({{"range", asJson(view.rangeOf(use.token))}, {"newText", newName}});
    });
    if (name.kind != NameKind::FAMILY) {
        Json changes = Json::object();
        for (auto& [path, list] : edits) {
            changes[view.uri(path)] = std::move(list);
        }
        return {{"changes", changes}};
    }
    Json changes = Json::array();
    for (auto& [path, list] : edits) {
        const auto document = view.documents.find(path);
        const Json version = document == view.documents.end() ? Json() : document->second.version;
        changes.push_back(
            {{"textDocument", {{"uri", view.uri(path)}, {"version", version}}}, {"edits", list}});
    }
    for (const lint::Token& file : filesOf(view, name)) {
        const std::string& path = file.location.file->path();
        const std::string renamed = acd::joinPath(std::string(acd::directoryOf(path)), newName + ".acd");
        changes.push_back({{"kind", "rename"}, {"oldUri", view.uri(path)}, {"newUri", view.uri(renamed)}});
    }
    return {{"documentChanges", changes}};
}

} // namespace lsp
