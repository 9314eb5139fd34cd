#pragma once

#include "database/Database.h"
#include "database/DeferredMessages.h"
#include "database/DeviceIndex.h"
#include "database/DirectoryIndex.h"
#include "database/FileReading.h"

#include <PM_DEVKEY.h>

#include <cstdint>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace acd {

/// Database files without directories: name to text.
using MemoryFiles = std::map<std::string, std::string>;

/// One layer's file of a family.
struct SourceFile {
    std::string path;        ///< as it is shown
    std::uint32_t layer;     ///< counted from the bottom
    const std::string* text; ///< of a file in memory; null for one on disk
    bool isUnreadable = false;
    std::vector<std::string>
        caseCollisions{}; ///< paths in the same layer that differ in case alone, and are not read
};

/// A family and what is known of it so far.
struct Family {
    std::string fileName; ///< as the lowest layer spells it: what lies on top must not rename a family
    std::string name;     ///< the same without its ending
    std::vector<SourceFile> files;                     ///< the bottom one first
    std::unique_ptr<const Database> database;          ///< once it was asked for
    std::vector<std::unique_ptr<PM_DEVKEY>> accessors; ///< by section, those that were asked for
};

/// Which databases there are under one search path, and what was read of them.
class Catalogue {
public:
    /// Lists the directories, each once. One that can't be listed is reported; the others still serve.
    /// @param directories the top one first
    /// @param unsaved paths of files in them that an editor holds, whether or not they exist yet
    Catalogue(const std::vector<std::string>& directories, DeferredMessages& reports,
              const std::vector<std::string>& unsaved = {});

    explicit Catalogue(std::shared_ptr<const MemoryFiles> files);

    /// All families, in byte order of their file names.
    [[nodiscard]] const std::vector<std::unique_ptr<Family>>& families() const noexcept { return m_families; }

    /// The family of that name; null when there is none.
    [[nodiscard]] Family* family(std::string_view name) const noexcept;

    /// The family whose file has that name; null when there is none.
    [[nodiscard]] Family* familyOfFile(std::string_view fileName) const noexcept;

    /// The family that a device belongs to; null when none has it. The first call looks through all files that no
    /// index covers, and reports those that can't be read.
    [[nodiscard]] Family* familyOfDevice(std::string_view device, DeferredMessages& reports);

    /// The family's database, read when it is asked for first; null when a file of it can't be read. What is
    /// wrong with the files is reported once.
    [[nodiscard]] const Database* database(Family& family, DeferredMessages& reports) const;

    /// Opens one of the files that were found.
    /// @throw ReadError
    [[nodiscard]] std::unique_ptr<ByteSource> open(const SourceFile& file) const;

private:
    void addFile(std::string_view fileName, SourceFile file);
    void sort();
    [[nodiscard]] std::string absolute(const std::string& path) const;
    [[nodiscard]] std::optional<DirectoryIndex> currentIndex(std::uint32_t layer) const;
    [[nodiscard]] DeviceIndex makeIndex(DeferredMessages& reports) const;

    std::string m_workingDirectory; ///< of the process when it listed the directories; hosts change it
    std::vector<std::string> m_directories; ///< by layer
    std::shared_ptr<const MemoryFiles> m_memoryFiles;
    std::vector<std::unique_ptr<Family>> m_families;
    CaseInsensitiveNameSet m_names; ///< of the families, with the same ordinals
    std::optional<DeviceIndex> m_devices;
};

} // namespace acd
