#pragma once

#include <optional>
#include <string>

enum class PM_PARTNAME_BINDING : int { BY_NAME = 1 };

/// What is known of a part.
class [[gnu::visibility("default")]] PM_SPEC {
public:
    /// The part's family, null when it is not known; goes with this object.
    [[nodiscard]] const char* get_pm() const;

protected:
    std::optional<std::string> m_module;
};

class [[gnu::visibility("default")]] PM_PIC : public PM_SPEC{};

/// The configuration of a part, found by its name.
class [[gnu::visibility("default")]] PicConfig : public PM_PIC {
public:
    PicConfig(const char* name, int flag, PM_PARTNAME_BINDING binding);
};
