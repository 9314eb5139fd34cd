// Rules about "=" and "+=" in layers and sections: each mistake is reported once, at the line that makes it.
#include "lint/FamilyResult.h"
#include "lint/rules/RuleSets.h"

namespace lint {

namespace {

constexpr Rule APPEND_WITHOUT_VALUE{
    "R101",
    "append-without-value",
    Severity::ERROR,
    R"("+=" in a section that has no value of its own)",
    R"(In a section "+=" adds to the section's own value, not to that of the family. Without one the appended text is the
whole value of the device and hides the family's records. Write out all records with "=".)",
    "OPERATION = PROGRAM,Bscan,USB2\n[KS50]\nOPERATION += :VERIFY,Bscan,USB2",
    true,
    true};
constexpr Rule HIDDEN_NAMES{
    "R102",
    "hidden-names",
    Severity::ERROR,
    R"("=" that hides names of the layer below)",
    R"(In a layer "KEY = value" replaces the value of the layers below, so their names are no longer there. Most of them
are missing in the new value: "+=" and a separator add names instead. The consequences are not reported. A key without
any text, and one that repeats most of the names, replace on purpose.)",
    "# in a layer on top\nIDCODE = SW10,0xX9004FB7"};
constexpr Rule HIDDEN_PROPERTIES{
    "R103",
    "hidden-properties",
    Severity::WARNING,
    R"("=" that drops properties of the layer below)",
    R"(In a layer "PROPERTY = value" replaces all properties that the same section has in the layers below, not only those
with the same names. Append the changed ones with "+= :".)",
    "# in a layer on top\n[KS50]\nPROPERTY = PINS,144"};
constexpr Rule JOINED_APPEND{
    "R104",
    "joined-append",
    Severity::ERROR,
    R"("+=" without a separator)",
    R"("+=" puts nothing between the former value and the new text, so the last item and the first one are joined to one.
Begin with "," in lists and with ":" between records.)",
    "DEVICE_SUPPORTED += sparrow",
    false,
    true};

void checkHidings(std::string_view key, const Value& value, Findings& findings) {
    for (const Value::Hiding& hiding : value.hidings) {
        const SourceLocation& below = hiding.below.location;
        const bool isProperty = key != schema::IDCODE && value.shape == schema::Shape::RECORDS &&
                                key.find(schema::PROPERTY) != key.npos;
        const bool areProperties = isProperty || key == schema::PROPERTIES;
        findings.add(areProperties ? HIDDEN_PROPERTIES : HIDDEN_NAMES, hiding.key,
                     "hides {} {}{} of {}:{} ({}{}); did you mean \"+=\"?", hiding.names.size(),
                     areProperties ? "propert" : "name",
                     areProperties ? (hiding.names.size() == 1 ? "y" : "ies")
                                   : (hiding.names.size() == 1 ? "" : "s"),
                     below.file->path(), below.line, inQuotes(hiding.names.front().text),
                     hiding.names.size() == 1 ? "" : " and others");
    }
}

void checkFamily(const FamilyData& family, const FamilyContext& /*any*/, FamilyResult& result) {
    Findings& findings = result.findings;
    family.forEachSection([&](const Section& section) {
        for (const auto& [key, value] : section.values) {
            checkHidings(key, value, findings);
            for (const Token& text : value.joinedAppends) {
                const char* const separator = schema::firstListed(family.kind, key) <= 1 ? "," : ":";
                findings
                    .add(JOINED_APPEND, text, "{} is joined to the text before it; begin with \"{}\"",
                         inQuotes(text.text), separator)
                    .fix = insertingBefore(partOf(text, 0, 0), separator);
            }
        }
    });
    for (const Section& device : family.devices) {
        for (const schema::Table& table : schema::TABLES) {
            const Value* const value = device.find(table.key);
            if (value != nullptr && !value->isAssigned && family.own.find(table.key) != nullptr) {
                findings.add(APPEND_WITHOUT_VALUE, value->key,
                             "the section of {} has no {} of its own: this hides the family's",
                             inQuotes(device.name.text), table.key);
            }
        }
    }
}

} // namespace

RuleSet layerRules() {
    return {"layers and sections",
            {&APPEND_WITHOUT_VALUE, &HIDDEN_NAMES, &HIDDEN_PROPERTIES, &JOINED_APPEND},
            checkFamily,
            nullptr};
}

} // namespace lint
