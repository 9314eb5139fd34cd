#include <AcdStore.h>

#include "database/FileNames.h"
#include "database/ReadLog.h"
#include "database/Store.h"
#include "text/OrEmpty.h"

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
        const acd::NameTable& sections = store.database(*found).sectionNames();
        for (std::uint32_t ordinal = 0; ordinal != sections.size(); ++ordinal) {
            names.emplace_back(sections[ordinal]);
        }
    }
    return names;
}

namespace {

[[nodiscard]] AcdStore::Value publicValue(const acd::Opened& opened, const acd::Value& value,
                                          bool fromSection) {
    AcdStore::Value result{value.text(), {}, fromSection, {}};
    for (const acd::Fragment& fragment : opened.database->fragments(value)) {
        const std::string_view path = opened.database->path(fragment.layer);
        result.fragments.push_back(
            {fragment.offset, path, acd::directoryOf(path), fragment.place.line, fragment.place.column});
    }
    return result;
}

} // namespace

std::optional<AcdStore::Value> AcdStore::value(const char* name, const char* key) {
    const acd::Opened opened = Store::instance().open(orEmpty(name));
    const acd::Value* const found = opened.database->find(opened.section, orEmpty(key));
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

AcdStore::Fragment AcdStore::Value::at(std::size_t offset) const {
    const auto behind = std::upper_bound(
        fragments.begin(), fragments.end(), offset,
        [](std::size_t wanted, const Fragment& fragment) { return wanted < fragment.offset; });
    // Of fragments at the same offset all but the last are empty: the byte stands in the last.
    Fragment fragment = *std::prev(behind);
    fragment.column += static_cast<unsigned>(offset - fragment.offset);
    return fragment;
}

AcdStore::ReadObserver AcdStore::setReadObserver(ReadObserver observer) {
    return acd::ReadLog::setObserver(std::move(observer));
}

void AcdStore::forget() {
    setReadObserver({});
    Store::forget();
}
