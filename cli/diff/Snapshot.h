#pragma once

#include <tarvik/TARVIKNS.h>

#include <cstddef>
#include <map>
#include <optional>
#include <set>
#include <string>
#include <vector>

namespace diff {

/// What is asked of a database, of a device or without one.
struct Question {
    enum class Kind {
        NAMES, ///< the answer is a set of names: each comes and goes by itself
        VALUE, ///< the answer is replaced as a whole
    };

    std::string topic;
    Kind kind = Kind::NAMES;
    std::optional<TARVIKNS::MODE_TYPE> mode{};     ///< of questions about a cell of a table
    std::optional<TARVIKNS::OUTPUT_TYPE> output{}; ///< likewise

    friend auto operator<=>(const Question&, const Question&) = default;
};

/// What one database answers to one question: names, or values. No answer is the same as an empty one.
using Texts = std::set<std::string>;

using Answers = std::map<Question, Texts>;

/// What a package changes for a device; what it does not change is as without a package.
struct PackageFacts {
    std::optional<Texts> modes;         ///< when a part of this package is excluded from a mode
    std::optional<std::size_t> options; ///< among the shared answers, when the package has options of its own
};

struct DeviceFacts {
    std::string family;
    std::string own; ///< its answers, packed: most devices answer alike in both databases, and stay so
    std::vector<std::size_t> shared; ///< further answers, for questions that it has no answer of its own to
    std::map<std::string, PackageFacts> packages;
};

/// All that a database answers. Answers that devices have in common are kept once.
struct Facts {
    Answers general; ///< without a device
    std::vector<Answers> shared;
    std::map<std::string, DeviceFacts> devices; ///< and flashes; a family without devices stands for itself

    /// The answer of a device: its own, or else one that is shared.
    [[nodiscard]] const Texts& answer(const Answers& own, const std::vector<std::size_t>& commonOnes,
                                      const Question& question) const;
};

// The topics of the questions about a device.
inline constexpr const char* FAMILY = "family";
inline constexpr const char* MODES = "modes";
inline constexpr const char* OPTIONS = "options";

/// Asks two databases everything, each in a process of its own.
/// @param oldLayers,newLayers their directories, the first one on top
/// @throw CommandError (FAULT) when one is missing or can't be read
[[nodiscard]] std::pair<Facts, Facts> factsOf(const std::vector<std::string>& oldLayers,
                                              const std::vector<std::string>& newLayers);

} // namespace diff
