// Rules about the items and fields of values: nothing is trimmed and nothing is skipped when they are read.
#include "lint/FamilyResult.h"
#include "lint/rules/RuleSets.h"
#include "text/Trimmed.h"

#include <algorithm>
#include <optional>
#include <set>

namespace lint {

namespace {

constexpr Rule BLANK_AROUND_SEPARATOR{
    "F101",
    "blank-around-separator",
    Severity::ERROR,
    "blank around a separator",
    R"(Nothing is trimmed: a blank before or after "," or ":" is part of the item, which then equals no name. Only
the blanks before a "\" and those at the start of the next line are dropped.)",
    "DEVICE_SUPPORTED = base, kestrel"};
constexpr Rule TRAILING_SEPARATOR{
    "F102",
    "trailing-separator",
    Severity::ERROR,
    "separator at the end",
    R"(A separator at the end of a list or of a record adds an empty item, which is a text like any other and names
nothing.)",
    "DEVICE_SUPPORTED = base,kestrel,"};
constexpr Rule EMPTY_ITEM{
    "F103",
    "empty-item",
    Severity::ERROR,
    "empty item",
    R"(Two adjacent separators enclose an empty text, which is not the same as no item: a list contains it as a name,
and a record reads it as an operation, a mode or an output.)",
    "DEVICE_SUPPORTED = base,,kestrel"};
constexpr Rule DUPLICATE_ITEM{"F104",
                              "duplicate-item",
                              Severity::WARNING,
                              "item listed twice",
                              "An item that is listed twice has the effect of one. If it was meant to be "
                              "another item, that one is missing.",
                              "DEVICE_SUPPORTED = base,kestrel,kestrel"};
constexpr Rule LIST_TOO_LONG{
    "F105",
    "list-too-long",
    Severity::ERROR,
    "more than 32768 items",
    "Items, and fields of an item, are numbered from 0 to 32767. Those after that are not read.",
    ""};
constexpr Rule COMMENT_AFTER_VALUE{
    "F106",
    "comment-after-value",
    Severity::WARNING,
    "comment after a value",
    "A comment needs a line of its own. After a value it is part of the value.",
    "PROPERTY = PINS,140 # in the largest package",
    false,
    true};

constexpr Rule DOUBLED_OPERATOR{
    "F107",
    "doubled-operator",
    Severity::WARNING,
    R"("==" or "=+")",
    R"(A line is split at its first "=", so what follows is part of the value. Appending is written "+=".)",
    "PROPERTY == VENDOR,Korvel",
    false,
    true};

bool isBlank(char byte) { return byte == ' ' || byte == '\t'; }

/// "=" in place of "==", and "+=" in place of "=+".
std::optional<Fix> withOneOperator(const Token& value) {
    const Token second = partOf(value, 0, 1);
    const std::string_view line = value.location.file->source(value.location.line);
    if (second.text == "=") {
        return replacing(second, "");
    }
    if (value.location.column < 2 || !line.substr(value.location.column - 2).starts_with("=+")) {
        return std::nullopt;
    }
    SourceLocation first = value.location;
    --first.column;
    return Fix{{{first, 2, "+="}}};
}

bool isNumberOrFlag(std::string_view text) {
    return std::find(schema::FLAGS.begin(), schema::FLAGS.end(), text) != schema::FLAGS.end() ||
           (!text.empty() && text.find_first_not_of("0123456789.-") == text.npos);
}

/// A "#" between blanks begins a comment, and so does one at the end or after a number; "Kestrel #1" is a title.
bool hasComment(std::string_view text) {
    const std::size_t at = text.find('#');
    if (at == text.npos) {
        return false;
    }
    const std::string_view before = text.substr(0, at);
    const std::string_view word = before.substr(0, before.find_last_not_of(" \t") + 1);
    return at + 1 == text.size() || text.find(" # ") != text.npos || isNumberOrFlag(word);
}

void checkTexts(const std::vector<Token>& tokens, Findings& findings) {
    for (const Token& token : tokens) {
        const std::string_view text = token.text;
        if (text.empty() && tokens.size() > 1) {
            const bool isLast = &token == &tokens.back();
            findings
                .addText(isLast ? TRAILING_SEPARATOR : EMPTY_ITEM, token,
                         isLast ? "a separator at the end adds an empty item" : "empty item")
                .fix = removing(token);
        } else if (!text.empty() && (isBlank(text.front()) || isBlank(text.back()))) {
            findings
                .add(BLANK_AROUND_SEPARATOR, token, "the blanks of {} are part of the text", inQuotes(text))
                .fix = replacing(token, std::string(trimmed(text)));
        }
        // A "#" at the start of a continuation line is found as such.
        const std::string_view line = token.location.file->source(token.location.line);
        const bool isOnItsLine =
            line.find('#', std::min<std::size_t>(token.location.column - 1, line.size())) != line.npos;
        if (isOnItsLine && hasComment(text)) {
            findings.add(COMMENT_AFTER_VALUE, token, "the comment is part of the text {}", inQuotes(text));
        }
    }
}

void checkSeparators(const Value& value, Findings& findings) {
    if (value.items.size() == 1) {
        checkTexts(value.items.front().fields, findings);
        return;
    }
    std::vector<Token> wholes;
    for (const Item& item : value.items) {
        if (item.fields.size() > 1) {
            checkTexts(item.fields, findings);
        }
        // The blanks of a record's own fields are found above.
        wholes.push_back(item.fields.size() > 1 ? Token{"record", item.whole.location} : item.whole);
    }
    checkTexts(wholes, findings);
}

void checkTwice(const Item& item, std::size_t first, Findings& findings) {
    std::set<std::string_view> seen;
    for (std::size_t i = first; i < item.fields.size(); ++i) {
        const Token& token = item.fields[i];
        if (!token.text.empty() && !seen.insert(token.text).second) {
            findings.add(DUPLICATE_ITEM, token, "{} is listed twice", inQuotes(token.text)).fix =
                removing(token);
        }
    }
}

void checkFamily(const FamilyData& family, const FamilyContext& /*any*/, FamilyResult& result) {
    Findings& findings = result.findings;
    family.forEachSection([&](const Section& section) {
        for (const auto& [key, value] : section.values) {
            checkSeparators(value, findings);
            if (!value.items.empty()) {
                const Token& first = value.items.front().whole;
                if (first.text.starts_with('=') || first.text.starts_with('+')) {
                    findings.add(DOUBLED_OPERATOR, first, "the value begins with \"{}\"", first.text.front())
                        .fix = withOneOperator(first);
                }
            }
            for (const Item& item : value.items) {
                checkTwice(item, schema::firstListed(family.kind, key), findings);
            }
            for (const Token& token : value.truncatedItems) {
                findings.add(LIST_TOO_LONG, token,
                             "items from here on are never read: there are 32768 before");
            }
        }
    });
}

} // namespace

RuleSet listRules() {
    return {"items and fields",
            {&BLANK_AROUND_SEPARATOR, &TRAILING_SEPARATOR, &EMPTY_ITEM, &DUPLICATE_ITEM, &LIST_TOO_LONG,
             &COMMENT_AFTER_VALUE, &DOUBLED_OPERATOR},
            checkFamily,
            nullptr};
}

} // namespace lint
