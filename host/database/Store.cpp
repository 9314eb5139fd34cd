#include "database/Store.h"

#include "database/ReadLog.h"

#include <TarvikException.h>

#include <utility>

// The one store of the process: where its databases come from, what names mean in them, and the errors
// raised when what is there can't be read.

namespace acd {

namespace {

/// No value that was read is the cause.
[[noreturn]] void raise(int location) {
    ReadLog::clear();
    throw DataNotFoundException(PRODUCT, SOURCE, REVISION, location);
}

} // namespace

Store*& Store::current() {
    // Never destroyed: readers may be used until the very end of the process.
    static auto* store = new Store;
    return store;
}

Store& Store::instance() { return *current(); }

void Store::resetForTesting() { delete std::exchange(current(), new Store); }

void Store::setSearchPath(std::vector<std::string> directories) {
    if (isSettled("the search path")) {
        return;
    }
    m_memoryFiles.reset();
    m_searchPath = SearchPath{std::move(directories), {}};
}

void Store::setMemoryFiles(MemoryFiles files) {
    if (isSettled("the files in memory")) {
        return;
    }
    m_memoryFiles = std::make_shared<const MemoryFiles>(std::move(files));
    m_searchPath = SearchPath();
}

/// Databases never change once they have been looked for: answers of two would be mixed. Reports an attempt.
bool Store::isSettled(const char* what) {
    if (m_catalogue == nullptr) {
        return false;
    }
    m_messages.addTooLate(what);
    m_messages.issue();
    return true;
}

const std::vector<std::string>& Store::directories() { return searchPath().directories; }

const SearchPath& Store::searchPath() {
    if (!m_searchPath) {
        m_searchPath = defaultSearchPath();
    }
    return *m_searchPath;
}

Catalogue& Store::catalogue() {
    if (m_catalogue == nullptr) {
        DeferredMessages found;
        m_catalogue = m_memoryFiles != nullptr ? std::make_unique<Catalogue>(m_memoryFiles)
                                               : std::make_unique<Catalogue>(directories(), found);
        m_messages.add(std::move(found));
    }
    m_messages.issue();
    return *m_catalogue;
}

const std::vector<std::unique_ptr<Family>>& Store::families() { return catalogue().families(); }

Family* Store::family(std::string_view name) { return catalogue().family(name); }

Resolution Store::resolve(std::string_view name) {
    // What was read before has nothing to do with what may be wrong with this name.
    ReadLog::clear();
    Catalogue& catalogue = this->catalogue();
    const auto resolveWhole = [&](std::string_view whole) -> Resolution {
        if (Family* const family = catalogue.familyOfFile(whole)) {
            return {family, {}};
        }
        if (Family* const family = catalogue.family(whole)) {
            return {family, {}};
        }
        return {catalogue.familyOfDevice(whole, m_messages), whole};
    };
    Resolution resolution = resolveWhole(name);
    if (const std::size_t cut = name.find('_'); resolution.family == nullptr && cut != name.npos) {
        resolution = resolveWhole(name.substr(0, cut));
    }
    m_messages.issue();
    return resolution;
}

DatabaseHandle Store::open(std::string_view name) {
    const Resolution resolution = resolve(name);
    if (resolution.family == nullptr) {
        return {nullptr, &m_nothing, nullptr};
    }
    const Database& database = this->database(*resolution.family);
    return {resolution.family, &database, database.section(resolution.device)};
}

DatabaseHandle Store::openBase() {
    if (Family* const base = family("base")) {
        return {base, &database(*base), nullptr};
    }
    m_messages.addMissingBase(placesSearched());
    m_messages.issue();
    raise(location::BASE_MISSING);
}

/// Where the catalogue comes from, for the user to look there.
std::string Store::placesSearched() {
    if (m_memoryFiles != nullptr) {
        return "among the files in memory";
    }
    const bool isDefault = directories().empty() && !searchPath().tried.empty();
    std::string places;
    for (const std::string& directory : isDefault ? searchPath().tried : directories()) {
        places += (places.empty() ? "in " : ", ") + directory;
    }
    if (isDefault) {
        places += ", and TARVIK_DATABASE is not set";
    }
    return places.empty() ? "since there is no directory to search" : places;
}

const Database& Store::database(Family& family) {
    const Database* const database = catalogue().database(family, m_messages);
    m_messages.issue();
    if (database == nullptr) {
        raise(location::FILE_UNREADABLE);
    }
    return *database;
}

const Database& Store::databaseOfFile(std::string_view fileName) {
    Family* const family = catalogue().familyOfFile(fileName);
    return family == nullptr ? m_nothing : database(*family);
}

Text Store::tryRead(const SourceFile& file, std::string& error) {
    try {
        return readAll(*catalogue().open(file));
    } catch (const ReadError& unreadable) {
        error = unreadable.what();
        m_messages.add(file.path, location::FILE_UNREADABLE, unreadable.what());
    }
    m_messages.issue();
    return {};
}

PM_DEVKEY& Store::accessor(const DatabaseHandle& opened) {
    if (opened.family == nullptr) {
        return m_nothingAccessor;
    }
    auto& accessors = opened.family->accessors;
    accessors.resize(opened.database->sectionNames().size() + 1);
    auto& accessor = accessors[opened.database->ordinal(opened.section)];
    if (accessor == nullptr) {
        accessor = std::make_unique<PM_DEVKEY>(*opened.database, opened.section);
    }
    return *accessor;
}

} // namespace acd
