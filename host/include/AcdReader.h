#pragma once

#include <tarvik/Attributes.h>

class PM_DEVKEY;

/// Opens a database of the search path by the name of a file, a family or a device.
///
/// A name is looked for without regard to ASCII case: as a file ("spi.acd"), as a family, as a device; only
/// when all three fail, the name cut at its first "_", likewise. A name never becomes a path.
class TARVIK_HOST_API AcdReader {
public:
    /// Opens the base database.
    /// @throw DataNotFoundException when there is no base.acd or it can't be read; an info message that names
    ///        the paths tried, or the fault, goes before
    AcdReader();

    /// Opens the database that holds a name. One that resolves to nothing gives an empty database and the
    /// module "base".
    /// @param name of a file, a family or a device; null is the empty name
    /// @throw DataNotFoundException when the family's file is there but can't be read
    explicit AcdReader(const char* name);

    AcdReader(const AcdReader&) = delete;
    AcdReader& operator=(const AcdReader&) = delete;

    /// The accessor of the keys.
    /// @return never null; it outlives the reader: databases live as long as the process
    [[nodiscard]] PM_DEVKEY* getDevkey() const noexcept { return m_accessor; }

    /// The family that the name resolved to.
    /// @return its name as its file spells it; lives as long as the process
    [[nodiscard]] const char* getPM() const noexcept { return m_module; }

private:
    PM_DEVKEY* m_accessor;
    const char* m_module;
};
