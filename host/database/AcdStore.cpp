#include <AcdStore.h>

#include "database/FileNames.h"
#include "database/ReadLog.h"
#include "database/Store.h"
#include "text/NullToEmpty.h"

#include <algorithm>
#include <iterator>
#include <utility>

// The public face of the store.

using acd::Store;

void AcdStore::setSearchPath(std::vector<std::string> directories) {
    Store::instance().setSearchPath(std::move(directories));
}

void AcdStore::setMemoryFiles(std::map<std::string, std::string> files) {
    Store::instance().setMemoryFiles(std::move(files));
}

std::vector<std::string> AcdStore::searchPath() { return Store::instance().directories(); }

std::vector<std::string> AcdStore::families() {
    std::vector<std::string> names;
    for (const auto& family : Store::instance().families()) {
        names.push_back(family->name);
    }
    return names;
}

std::vector<std::string> AcdStore::devices(const std::string& family) {
    Store& store = Store::instance();
    std::vector<std::string> names;
    if (acd::Family* const found = store.family(family)) {
        const acd::CaseInsensitiveNameSet& sections = store.database(*found).sectionNames();
        for (std::uint32_t ordinal = 0; ordinal != sections.size(); ++ordinal) {
            names.emplace_back(sections[ordinal]);
        }
    }
    return names;
}

namespace {

[[nodiscard]] AcdStore::Value publicValue(const acd::DatabaseHandle& opened, const acd::Value& value,
                                          bool fromSection) {
    AcdStore::Value result{value.text(), {}, fromSection, {}};
    for (const acd::LayerSpan& span : opened.database->spans(value)) {
        const std::string_view path = opened.database->path(span.layer);
        result.spans.push_back(
            {span.offset, path, acd::directoryOf(path), span.location.line, span.location.column});
    }
    return result;
}

} // namespace

std::optional<AcdStore::Value> AcdStore::value(const char* name, const char* key) {
    const acd::DatabaseHandle opened = Store::instance().open(nullToEmpty(name));
    const acd::Value* const found = opened.database->find(opened.section, nullToEmpty(key));
    if (found == nullptr) {
        return std::nullopt;
    }
    const bool fromSection = opened.section != nullptr && opened.database->holds(*opened.section, *found);
    Value value = publicValue(opened, *found, fromSection);
    for (const acd::Value& replaced : opened.database->replaced(*found)) {
        value.replaced.push_back(publicValue(opened, replaced, fromSection));
    }
    return value;
}

AcdStore::SourceSpan AcdStore::Value::at(std::size_t offset) const {
    const auto behind =
        std::upper_bound(spans.begin(), spans.end(), offset,
                         [](std::size_t wanted, const SourceSpan& span) { return wanted < span.offset; });
    // Of spans at the same offset all but the last are empty: the byte stands in the last.
    SourceSpan span = *std::prev(behind);
    span.column += static_cast<unsigned>(offset - span.offset);
    return span;
}

AcdStore::ReadObserver AcdStore::setReadObserver(ReadObserver observer) {
    return acd::ReadLog::setObserver(std::move(observer));
}

void AcdStore::resetForTesting() {
    setReadObserver({});
    Store::resetForTesting();
}
