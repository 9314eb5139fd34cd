#pragma once

#include <tarvik/Attributes.h>

/// How a part name is bound to its personality module. Passed through unchanged.
enum class PM_PARTNAME_BINDING : int {
    UNBOUND = 0, ///< not at all
    BY_NAME = 1, ///< by its name
};

/// What is known of a part: the personality module that describes it.
class TARVIK_HOST_API PM_SPEC {
public:
    /// The part's family.
    /// @return its name as its file spells it, which lives as long as the process; null when the database has
    ///         no such part
    [[nodiscard]] const char* get_pm() const noexcept { return m_module; }

protected:
    /// @param module the family's name, or null; must outlive the object
    explicit PM_SPEC(const char* module) noexcept : m_module(module) {}

private:
    const char* m_module;
};

/// A configuration on which databases can be opened.
class TARVIK_HOST_API PM_PIC : public PM_SPEC {
protected:
    using PM_SPEC::PM_SPEC;
};

/// The configuration of a part, a family or a file, found by its name.
class TARVIK_HOST_API PicConfig : public PM_PIC {
public:
    /// Resolves a name as `AcdReader` does, without opening what it finds.
    /// @param name part, family or file name; null is the empty name, which resolves to nothing
    /// @param flag passed through unchanged, without a meaning to this library
    /// @param binding likewise
    PicConfig(const char* name, int flag, PM_PARTNAME_BINDING binding);
};
