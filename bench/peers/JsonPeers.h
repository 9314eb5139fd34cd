#pragma once

#include "peers/Question.h"

#include <nlohmann/json.hpp>
#include <simdjson.h>

#include <string_view>
#include <unordered_map>

namespace bench {

/// One JSON document, kept parsed.
class JsonPeer {
public:
    static constexpr const char* NAME = "JSON, nlohmann";

    explicit JsonPeer(const Facts& facts);

    [[nodiscard]] std::uint32_t operations(const Question& question) const {
        return mask(question, "operations");
    }
    [[nodiscard]] std::uint32_t options(const Question& question) const { return mask(question, "options"); }
    [[nodiscard]] bool allows(const Question& question) const {
        return (operations(question) >> question.operation & 1U) != 0;
    }
    [[nodiscard]] std::string_view property(const Question& question) const;

private:
    [[nodiscard]] std::uint32_t mask(const Question& question, const char* table) const;

    nlohmann::json m_document;
};

/// JSON read on demand: a document for each device and family, found by a map, and parsed as far as a question needs
/// it. (One document for all would be parsed to its middle for each question.)
class OnDemandPeer {
public:
    static constexpr const char* NAME = "JSON, simdjson";

    explicit OnDemandPeer(const Facts& facts);

    [[nodiscard]] std::uint32_t operations(const Question& question) { return mask(question, "operations"); }
    [[nodiscard]] std::uint32_t options(const Question& question) { return mask(question, "options"); }
    [[nodiscard]] bool allows(const Question& question) {
        return (operations(question) >> question.operation & 1U) != 0;
    }

    /// Valid until the next question.
    [[nodiscard]] std::string_view property(const Question& question);

private:
    [[nodiscard]] std::uint32_t mask(const Question& question, const char* table);

    std::unordered_map<std::string, simdjson::padded_string> m_devices;
    std::unordered_map<std::string, simdjson::padded_string> m_families;
    simdjson::ondemand::parser m_parser;
    std::string m_family;
};

} // namespace bench
