// Keeps one database in memory while its files are edited.
#include "lsp/Workspace.h"

#include "text/Json.h"

#include "database/FileLines.h"
#include "database/FileNames.h"

#include <fmt/format.h>
#include <fmt/ranges.h>

#include <algorithm>
#include <utility>

namespace lsp {

namespace {

AcdLines linesOf(const acd::Catalogue& catalogue, const acd::Family& family, const acd::SourceFile& file,
                 const Documents& documents) {
    if (const auto document = documents.find(file.path); document != documents.end()) {
        return AcdFileLines::make(family, file, document->second.text, {});
    }
    try {
        const acd::Text text = acd::readAll(*catalogue.open(file));
        return AcdFileLines::make(family, file, {text.bytes.get(), text.size}, {});
    } catch (const acd::ReadError& unreadable) {
        return AcdFileLines::make(family, file, {}, unreadable.what());
    }
}

} // namespace

bool Workspace::contains(const std::string& path) const {
    return std::find(m_directories.begin(), m_directories.end(), acd::directoryOf(path)) !=
           m_directories.end();
}

void Workspace::reload(const Documents& documents) {
    std::vector<std::string> unsaved;
    for (const auto& [path, document] : documents) {
        unsaved.push_back(path);
    }
    acd::DeferredMessages faults; // a directory that cannot be listed has no base.acd
    m_catalogue = std::make_unique<acd::Catalogue>(m_directories, faults, unsaved);
    m_unusedIndexes = lint::unusedIndexes(m_directories);
    m_statuses.clear();
    for (const std::string& directory : m_directories) {
        try {
            const acd::DirectoryStatus status(directory);
            for (const auto& family : m_catalogue->families()) {
                for (const acd::SourceFile& file : family->files) {
                    if (acd::directoryOf(file.path) == directory) {
                        if (const auto found =
                                status.ofReadableFile(std::string(acd::fileNameOf(file.path)))) {
                            m_statuses.emplace(file.path, *found);
                        }
                    }
                }
            }
        } catch (const acd::ReadError&) {
            continue;
        }
    }
    update(documents);
}

void Workspace::update(const Documents& documents) {
    std::map<std::string, Entry> former = std::exchange(m_entries, {});
    lint::Families families;
    bool isSame = true;
    for (const auto& family : m_catalogue->families()) {
        Entry entry;
        for (const acd::SourceFile& file : family->files) {
            const auto document = documents.find(file.path);
            const auto status = m_statuses.find(file.path);
            entry.states.push_back(
                {file.path, document == documents.end() ? 0 : document->second.stamp,
                 status == m_statuses.end() ? std::nullopt : std::optional(status->second)});
        }
        const auto known = former.find(family->name);
        if (known != former.end() && known->second.states == entry.states) {
            entry.data = known->second.data;
        } else {
            isSame = false;
            std::vector<AcdLines> files;
            for (const acd::SourceFile& file : family->files) {
                files.push_back(linesOf(*m_catalogue, *family, file, documents));
            }
            entry.data = std::make_shared<const lint::FamilyData>(std::move(files));
        }
        families.push_back(entry.data);
        m_entries.emplace(family->name, std::move(entry));
    }
    if (!isSame || m_entries.size() != former.size() || m_model->unusedIndexes() != m_unusedIndexes) {
        m_findings.reset(); // before the model that they refer to
        m_model = std::make_unique<const lint::Model>(std::move(families), m_unusedIndexes);
    }
    requireDatabase();
}

/// What `tarvik lint` requires of a database.
void Workspace::requireDatabase() {
    const lint::FamilyData* const base = m_model->base();
    const bool isReadable =
        base != nullptr && std::all_of(base->files.begin(), base->files.end(),
                                       [](const AcdLines& file) { return file.readError().empty(); });
    m_fault = isReadable ? std::string()
                         : fmt::format("the database has no base.acd that can be read; tried: \"{}\"",
                                       fmt::join(m_directories, "\", \""));
}

const std::vector<lint::Finding>& Workspace::findingsIn(const AcdLines& file) {
    if (!m_findings) {
        m_findings.emplace();
        for (lint::Finding& finding : m_checker.check(*m_model, {})) {
            (*m_findings)[finding.location.file].push_back(std::move(finding));
        }
    }
    static const std::vector<lint::Finding> none;
    const auto found = m_findings->find(&file);
    return found == m_findings->end() ? none : found->second;
}

const lint::FamilyData* Workspace::family(std::string_view path) const {
    for (const auto& family : m_model->families()) {
        for (const AcdLines& file : family->files) {
            if (file.path() == path) {
                return family.get();
            }
        }
    }
    return nullptr;
}

const AcdLines* Workspace::file(std::string_view path) const {
    const lint::FamilyData* const found = family(path);
    if (found == nullptr) {
        return nullptr;
    }
    return &*std::find_if(found->files.begin(), found->files.end(),
                          [path](const AcdLines& file) { return file.path() == path; });
}

} // namespace lsp
