#pragma once

#include "database/Catalogue.h"
#include "database/SearchPath.h"

#include <PM_DEVKEY.h>

#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace acd {

/// What a name resolved to.
struct Resolution {
    Family* family = nullptr; ///< null when it resolved to nothing
    std::string_view device;  ///< empty when it is the family itself
};

/// A database that was opened by a name.
struct DatabaseHandle {
    Family* family; ///< null when the name resolved to nothing; the database is then an empty one
    const Database* database;
    const Section* section; ///< null for the family itself
};

/// The databases of this process. All readers answer from here.
class Store {
public:
    [[nodiscard]] static Store& instance();

    /// Makes the process forget all that was set and read.
    static void resetForTesting();

    /// Sets where databases come from. Ignored, with a message, once they have been looked for.
    void setSearchPath(std::vector<std::string> directories);
    void setMemoryFiles(MemoryFiles files);

    /// The directories that are looked in, top first; none for memory files.
    [[nodiscard]] const std::vector<std::string>& directories();

    [[nodiscard]] const std::vector<std::unique_ptr<Family>>& families();

    /// The family of that name; null when there is none.
    [[nodiscard]] Family* family(std::string_view name);

    /// Resolves a name: a file, a family or a device; failing that, the name up to its first "_".
    [[nodiscard]] Resolution resolve(std::string_view name);

    /// Opens what a name resolves to.
    /// @throw DataNotFoundException when it can't be read
    [[nodiscard]] DatabaseHandle open(std::string_view name);

    /// Opens the base database.
    /// @throw DataNotFoundException when there is none or it can't be read
    [[nodiscard]] DatabaseHandle openBase();

    /// The database of a family.
    /// @throw DataNotFoundException when it can't be read
    [[nodiscard]] const Database& database(Family& family);

    /// The database in the file of that name; an empty one when there is none.
    /// @throw DataNotFoundException when it can't be read
    [[nodiscard]] const Database& databaseOfFile(std::string_view fileName);

    /// Reads a file of a family, whole. Reports one that can't be read.
    /// @param error set to the reason why it can't be read; the text is empty then
    [[nodiscard]] Text tryRead(const SourceFile& file, std::string& error);

    /// The one accessor of what was opened, however often that is.
    [[nodiscard]] PM_DEVKEY& accessor(const DatabaseHandle& opened);

private:
    Store() = default;
    ~Store() = default;

    [[nodiscard]] static Store*& current();
    [[nodiscard]] const SearchPath& searchPath();
    [[nodiscard]] Catalogue& catalogue();
    [[nodiscard]] std::string placesSearched();
    [[nodiscard]] bool isSettled(const char* what);

    std::shared_ptr<const MemoryFiles> m_memoryFiles; ///< null while databases come from directories
    std::optional<SearchPath> m_searchPath;           ///< once it is settled
    std::unique_ptr<Catalogue> m_catalogue;           ///< once databases have been looked for
    DeferredMessages m_messages;

    const Database m_nothing{};
    PM_DEVKEY m_nothingAccessor{m_nothing, nullptr};
};

} // namespace acd
