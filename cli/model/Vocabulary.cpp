// Reads the words of the vocabulary strictly: a mistyped mode must not be answered for another one.
#include "model/Vocabulary.h"

#include "term/ExitCode.h"
#include "term/Table.h"
#include "text/Json.h"
#include "text/Suggest.h"

#include <tarvik/ConstraintsManager.h>

#include <fmt/format.h>

#include <algorithm>

using TARVIKNS::MODE_TYPE;
using TARVIKNS::OP_TYPE;
using TARVIKNS::OUTPUT_TYPE;
using TARVIKNS::PROGRAM_OPTION;

namespace vocabulary {

namespace {

/// What the manager's mode converter knows besides the key names.
const std::vector<std::string> OTHER_MODE_TEXTS{"Bscan", "SSerial",      "Smap", "DTCONFIG",
                                                "CF",    "CompactFlash", "MPM",  "PromFile"};

/// The texts of all values from 0 to `last`.
template <typename Type>
std::vector<std::string> texts(Type last, StringBase (*convert)(Type)) {
    std::vector<std::string> all;
    for (int value = 0; value <= static_cast<int>(last); ++value) {
        all.push_back(plain(convert(static_cast<Type>(value))));
    }
    return all;
}

/// The position of a text among others; nothing when it is not there.
template <typename Equal>
std::optional<int> position(const std::vector<std::string>& all, const std::string& text, Equal equal) {
    const auto found = std::find_if(all.begin(), all.end(),
                                    [&](const std::string& candidate) { return equal(candidate, text); });
    return found == all.end() ? std::nullopt : std::optional(static_cast<int>(found - all.begin()));
}

std::vector<std::string> joined(std::vector<std::string> left, const std::vector<std::string>& right) {
    left.insert(left.end(), right.begin(), right.end());
    return left;
}

/// @param kind "mode", "output", "operation"
/// @param accepted what to list
/// @param known what to suggest from
CommandError unknown(const char* kind, const std::string& text, const char* rule,
                     const std::vector<std::string>& accepted, const std::vector<std::string>& known) {
    return {ExitCode::FAULT, fmt::format("unknown {} \"{}\"{}\n{}:\n{}", kind, text, didYouMean(text, known),
                                         rule, wrapped(accepted, 2))};
}

} // namespace

const std::vector<std::string>& modes() {
    static const std::vector<std::string> all = texts(MODE_TYPE::PFF, ConstraintsManager::modeType2String);
    return all;
}

const std::vector<std::string>& outputs() {
    static const std::vector<std::string> all =
        texts(OUTPUT_TYPE::NONE, ConstraintsManager::cableType2String);
    return all;
}

const std::vector<std::string>& operations() {
    static const std::vector<std::string> all =
        texts(OP_TYPE::EXPRESSQSVF, ConstraintsManager::operationType2String);
    return all;
}

const std::vector<std::string>& options() {
    static const std::vector<std::string> all =
        texts(PROGRAM_OPTION::RS_PIN0, ConstraintsManager::optionType2String);
    return all;
}

const std::vector<std::string>& operationNames() {
    static const std::vector<std::string> all =
        texts(OP_TYPE::EXPRESSQSVF, ConstraintsManager::operationType2DisplayString);
    return all;
}

std::vector<std::string> otherModeTexts(MODE_TYPE mode) {
    std::vector<std::string> others;
    for (const std::string& text : OTHER_MODE_TEXTS) {
        if (ConstraintsManager::modeString2Type(text.c_str()) == mode) {
            others.push_back(text);
        }
    }
    return others;
}

MODE_TYPE readMode(const std::string& text) {
    if (const std::optional<int> value = position(modes(), text, sameWithoutCase)) {
        return static_cast<MODE_TYPE>(*value);
    }
    if (position(OTHER_MODE_TEXTS, text, sameWithoutCase)) {
        return ConstraintsManager::modeString2Type(text.c_str());
    }
    const std::vector<std::string> all = joined(modes(), OTHER_MODE_TEXTS);
    throw unknown("mode", text, "modes, in any case", all, all);
}

OUTPUT_TYPE readOutput(const std::string& text) {
    if (const std::optional<int> value = position(outputs(), text, std::equal_to<>())) {
        return static_cast<OUTPUT_TYPE>(*value);
    }
    throw unknown("output", text, "outputs, in upper case", outputs(), outputs());
}

OP_TYPE readOperation(const std::string& text) {
    std::optional<int> value = position(operations(), text, sameWithoutCase);
    if (!value) {
        value = position(operationNames(), text, sameWithoutCase);
    }
    if (value) {
        return static_cast<OP_TYPE>(*value);
    }
    throw unknown("operation", text, "operations, in any case (or by display name, see: tarvik vocabulary)",
                  operations(), joined(operations(), operationNames()));
}

const std::string& key(MODE_TYPE mode) { return modes().at(static_cast<std::size_t>(mode)); }
const std::string& key(OUTPUT_TYPE output) { return outputs().at(static_cast<std::size_t>(output)); }
const std::string& key(OP_TYPE operation) { return operations().at(static_cast<std::size_t>(operation)); }

} // namespace vocabulary
