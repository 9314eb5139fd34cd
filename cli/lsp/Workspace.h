#pragma once

#include "lint/Check.h"

#include "text/Json.h"

#include "database/Catalogue.h"

#include <cstdint>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace lsp {

/// A document that an editor has opened.
struct Document {
    std::string uri; ///< as the editor spells it
    std::string text;
    Json version;            ///< as the editor gave it
    std::uint64_t stamp = 0; ///< another one after each change
};

/// By path.
using Documents = std::map<std::string, Document>;

/// One database: its files, with the open documents in the place of those that are saved, and what lint finds in it.
/// What a change does not concern is kept.
class Workspace {
public:
    /// @param directories its layers, absolute, the uppermost first
    explicit Workspace(std::vector<std::string> directories) : m_directories(std::move(directories)) {}
    Workspace(const Workspace&) = delete;
    Workspace& operator=(const Workspace&) = delete;

    [[nodiscard]] const std::vector<std::string>& directories() const noexcept { return m_directories; }

    /// Is the file in one of the directories?
    [[nodiscard]] bool contains(const std::string& path) const;

    /// Lists the directories and reads the files that changed on disk.
    void reload(const Documents& documents);

    /// Takes over documents that changed.
    void update(const Documents& documents);

    /// Why there is no database: what `tarvik lint` says in place of findings; empty if there is one.
    [[nodiscard]] const std::string& fault() const noexcept { return m_fault; }

    [[nodiscard]] const lint::Model& model() const noexcept { return *m_model; }

    /// What lint finds in a file of the model.
    [[nodiscard]] const std::vector<lint::Finding>& findingsIn(const AcdLines& file);

    /// A file of the database; null for any other path.
    [[nodiscard]] const AcdLines* file(std::string_view path) const;

    /// The family that a file belongs to; null for any other path.
    [[nodiscard]] const lint::FamilyData* family(std::string_view path) const;

private:
    /// One state of a file: of an open document its stamp, of any other its status on disk.
    struct State {
        std::string path;
        std::uint64_t stamp = 0;
        std::optional<acd::FileStatus> status;

        friend bool operator==(const State&, const State&) = default;
    };

    struct Entry {
        std::vector<State> states; ///< of its files
        std::shared_ptr<const lint::FamilyData> data;
    };

    void requireDatabase();

    std::vector<std::string> m_directories;
    std::map<std::string, Entry> m_entries; ///< by family
    std::unique_ptr<acd::Catalogue> m_catalogue;
    std::vector<std::string> m_unusedIndexes;          ///< when they were listed
    std::map<std::string, acd::FileStatus> m_statuses; ///< of the files on disk, when they were listed
    std::unique_ptr<const lint::Model> m_model = std::make_unique<const lint::Model>(lint::Families());
    std::string m_fault;
    lint::Checker m_checker;
    std::optional<std::map<const AcdLines*, std::vector<lint::Finding>>> m_findings; ///< by file
};

} // namespace lsp
