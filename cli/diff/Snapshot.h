#pragma once

#include "diff/NaturalLess.h"
#include "query/DeviceSurvey.h"

#include <tarvik/TARVIKNS.h>

#include <deque>
#include <functional>
#include <map>
#include <optional>
#include <set>
#include <string>
#include <string_view>

namespace diff {

/// What is asked of a database, about a device or in general.
struct Question {
    enum class Kind {
        NAMES, ///< the answer is a set of names: each is lost or gained by itself
        VALUE, ///< the answer changes as a whole
    };

    std::string package; ///< empty: without one
    std::string topic;
    Kind kind = Kind::NAMES;
    std::optional<TARVIKNS::MODE_TYPE> mode{};     ///< of questions about a cell of a table
    std::optional<TARVIKNS::OUTPUT_TYPE> output{}; ///< likewise

    friend auto operator<=>(const Question&, const Question&) = default;
};

using StringSet = std::set<std::string>;

/// The answers of one database. No answer is the same as an empty one.
using Answers = std::map<Question, StringSet>;

/// The topic of answers that are missing because the manager raises.
inline constexpr const char* FAULTS = "faults";

// The topics whose answers are names of families.
inline constexpr const char* FAMILY = "family";
inline constexpr const char* FAMILIES = "families";
inline constexpr const char* FLASH_FAMILIES = "families of flashes";

/// Begins the topics about the outputs of a mode.
inline constexpr const char* OUTPUTS_OF_MODE = "outputs of mode ";

/// The new names of devices and families, by their former ones.
using Renaming = std::map<std::string, std::string, std::less<>>;

/// All that a database answers, read from its serialised form.
class Snapshot {
public:
    struct Device {
        std::string_view family;
        bool isFamily;         ///< a family asked about by its own name
        const Answers* shared; ///< the answers that several devices have in common
        std::string_view own;  ///< its other answers, as `serialized` writes them
    };

    /// @param text as `takeSnapshot` returns it
    explicit Snapshot(std::string text);
    Snapshot(const Snapshot&) = delete;
    Snapshot& operator=(const Snapshot&) = delete;

    /// Gives devices and families other names, also where answers contain them.
    void rename(const Renaming& renamed);

    [[nodiscard]] const Answers& general() const { return m_general; }

    /// The devices and flashes, and the families as names of their own.
    [[nodiscard]] const std::map<std::string_view, Device, NaturalLess>& devices() const { return m_devices; }

private:
    std::string m_text;
    std::deque<std::string> m_renamedTexts; ///< what devices refer to in place of the text
    Answers m_general;
    std::map<std::string_view, Answers> m_shared; ///< by the first device that has them
    std::map<std::string_view, Device, NaturalLess> m_devices;
};

/// Asks the open database everything.
/// @return the answers in a form that another process can read
[[nodiscard]] std::string takeSnapshot(const ProgressCallback& progress);

/// Appends a block to the text, preceded by its size.
void putBlock(std::string& text, std::string_view block);

/// Removes the first block from the text and returns it.
/// @throw CommandError (FAULT) if the text does not begin with a block
[[nodiscard]] std::string_view takeBlock(std::string_view& rest);

/// Answers as lines of fields. Both ends are bytes that no text of a database holds.
[[nodiscard]] std::string serialized(const Answers& answers);
[[nodiscard]] Answers deserialized(std::string_view text);

} // namespace diff
