#pragma once

#include "explain/Explanation.h"
#include "explain/Inquiry.h"

#include <functional>
#include <set>
#include <string>
#include <vector>

namespace explanation {

/// Finds what decides a question among the records that a manager read for it, and notes each step.
class ExplanationBuilder {
public:
    explicit ExplanationBuilder(const Question& question) : m_question(question), m_asked(question) {}

    [[nodiscard]] Explanation build();

private:
    using Match = ReadLog::Match;

    [[nodiscard]] Conclusion verdict();
    [[nodiscard]] bool isYes();

    // Modes.
    [[nodiscard]] bool output();
    [[nodiscard]] bool device();
    [[nodiscard]] bool modeAllowsDevice();
    [[nodiscard]] bool isExcluded(const std::string& device);
    [[nodiscard]] std::vector<Match> modeWords(int record) const;
    void addAbsentFromMode(int record, const std::string& absent, const std::string& noRecord);
    void addMisspelledWords(int record, const char* kind, const std::string& word,
                            const std::function<bool(const std::string&)>& isKnown);

    // Permission tables.
    struct Permission {
        const ReadLog::Value* value;
        const ReadLog::Item* record;
    };
    [[nodiscard]] bool permission();
    [[nodiscard]] std::string operationOwner();
    [[nodiscard]] std::string optionOwner();
    [[nodiscard]] bool hasCell();
    [[nodiscard]] bool hasTable(std::string& owner);
    [[nodiscard]] bool isAllowedIn(const std::string& table);
    [[nodiscard]] std::vector<Permission> permissionsOf(const std::string& table) const;
    [[nodiscard]] bool isAllowedBy(const ReadLog::Item& record) const;
    void addMisspelledRecords(const std::string& word);
    void addUnknownMode(const Permission& permission);
    void addUnusedWords(const Permission& permission);
    [[nodiscard]] const ReadLog::Value* consulted() const;
    void addNoRecord(const std::string& table, const std::string& word);
    void addShadowedRecords(const std::string& database, const std::string& key, const std::string& word);

    // Properties.
    struct Property {
        std::set<std::string> values;
        Match record;
        catalogue::Shadows shadows; ///< records of lower layers that it replaced
    };
    [[nodiscard]] bool operationInMode();
    [[nodiscard]] bool operationOptions();
    [[nodiscard]] bool property();
    [[nodiscard]] bool flashProperty();
    [[nodiscard]] std::optional<Property> findProperty(const std::string& device, const std::string& key);
    [[nodiscard]] std::optional<Property> storedOrInherited(const std::string& device,
                                                            const std::string& key) const;
    [[nodiscard]] std::optional<Property> storedProperty(const std::string& device, const std::string& wanted,
                                                         const std::string& key) const;
    [[nodiscard]] std::optional<Property> storedFlashProperty(const std::string& wanted) const;
    [[nodiscard]] bool holds(const Property& found, const std::string& key,
                             const std::optional<std::string>& value);

    // Multiboot.
    [[nodiscard]] bool multiboot();

    // Names.
    std::string addNameStep();
    std::string addFamilyStep(const std::string& name);
    [[nodiscard]] Match flashListing(const std::string& name) const;

    void add(const char* topic, std::string text);
    void add(const char* topic, std::string text, const Match& place);

    const Question& m_question;
    Inquiry m_asked;
    std::vector<Step> m_steps;
};

/// What is before the first "_": a device without its package.
[[nodiscard]] std::string withoutPackage(const std::string& device);

/// The keys, with commas between, or "nothing".
template <typename Keys>
[[nodiscard]] std::string listed(const Keys& keys) {
    std::string text;
    for (const auto& key : keys) {
        text += (text.empty() ? "" : ", ") + std::string(key);
    }
    return text.empty() ? "nothing" : text;
}

} // namespace explanation
