#pragma once

#include "explain/Explanation.h"
#include "explain/Replay.h"

#include <string>
#include <vector>

namespace why {

/// Follows the records to the answer of one question, and notes each step.
class Chain {
public:
    Chain(const StartUp& facts, const Question& question)
        : m_facts(facts), m_question(question), m_replay(facts) {}

    [[nodiscard]] Explanation follow();

private:
    [[nodiscard]] bool isYes();

    // Modes.
    [[nodiscard]] bool output();
    [[nodiscard]] bool device();
    [[nodiscard]] bool deviceThrough();
    [[nodiscard]] bool modeTakesDevice();
    [[nodiscard]] bool isExcluded(const std::string& device);

    // Permission tables.
    [[nodiscard]] bool operation();
    [[nodiscard]] bool option();
    [[nodiscard]] bool bsdl();
    [[nodiscard]] std::string operationOwner(const std::string& resolved);
    [[nodiscard]] std::string optionOwner();
    [[nodiscard]] bool hasCell(bool withMode);
    [[nodiscard]] bool tableExists(const std::string& owner, const TableName& table, const Names& listed);
    [[nodiscard]] bool allows(const Replay::Permissions& permissions, const std::string& table, int row);
    void noteOddities(const Permission& permission);
    void noteShadowed(const std::string& database, const std::string& key, const std::string& word);

    // Properties.
    [[nodiscard]] bool operationInMode();
    [[nodiscard]] bool property();
    [[nodiscard]] bool flashProperty();
    [[nodiscard]] const PropertyValues* properties(const std::string& device, const std::string& key);
    [[nodiscard]] bool holds(const PropertyValues& found, const std::string& key,
                             const std::optional<std::string>& value);

    // Names.
    std::string withoutPackageNoted(const std::string& device);
    std::string familyNoted(const std::string& device);

    void add(const char* topic, std::string text);
    void add(const char* topic, std::string text, const Piece& place);

    const StartUp& m_facts;
    const Question& m_question;
    Replay m_replay;
    std::vector<Step> m_steps;
};

/// The keys, with commas between, or "nothing".
template <typename Keys>
[[nodiscard]] std::string listed(const Keys& keys) {
    std::string text;
    for (const auto& key : keys) {
        text += (text.empty() ? "" : ", ") + std::string(key);
    }
    return text.empty() ? "nothing" : text;
}

} // namespace why
