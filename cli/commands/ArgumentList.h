#pragma once

#include <optional>
#include <string>
#include <variant>
#include <vector>

/// What the text of an argument means. The help names it, and completion offers its values.
enum class ValueKind {
    TEXT,
    PATH, ///< a file or a directory: the shell completes it
    COMMAND,
    DEVICE,
    FLASH,
    FAMILY,
    PACKAGE,
    MODE,
    OUTPUT,
    OPERATION,
    OPTION,
    PROPERTY,
    PROPERTY_VALUE, ///< a property with a value: VENDOR=Korvel
    LINT_CODE,
    CHOICE, ///< one of the argument's `choices`
};

/// One argument of a command, or of the tool: the command line is read by it, and the help, the manual page and the
/// completions of the shells are made from it.
struct Argument {
    /// Where the argument is stored: a flag, a text, a text that may be absent, or any number of texts. It must live
    /// as long as the command line is read.
    using Target = std::variant<bool*, std::string*, std::optional<std::string>*, std::vector<std::string>*>;

    std::string name{};  ///< "--mode" for an option; "DEVICE" for an argument that has its place
    char letter = '\0';  ///< the option's short name, if it has one
    std::string value{}; ///< the name of the option's value, "MODE"; empty for a flag
    std::string description{};
    ValueKind kind = ValueKind::TEXT;
    std::vector<std::string> choices{}; ///< texts to show and to complete; a CHOICE accepts no other
    bool required = false;
    bool isCommaSeparated = false; ///< a text may hold several values, separated by commas
    Target target{};

    [[nodiscard]] bool isOption() const { return name.starts_with('-'); }
    [[nodiscard]] bool isFlag() const { return std::holds_alternative<bool*>(target); }
    [[nodiscard]] bool isRepeatable() const {
        return std::holds_alternative<std::vector<std::string>*>(target);
    }

    /// The name of the value: "MODE" for "--mode MODE", "DEVICE" for DEVICE.
    [[nodiscard]] const std::string& valueName() const { return isOption() ? value : name; }
};

/// The arguments of a command, in the order of their places and of the help.
using ArgumentList = std::vector<Argument>;
