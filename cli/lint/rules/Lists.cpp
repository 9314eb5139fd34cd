// Rules about the items and fields of values: nothing is trimmed and nothing is skipped when they are read.
#include "lint/Findings.h"
#include "lint/rules/RuleSets.h"

#include <fmt/format.h>

#include <set>

namespace lint {

namespace {

constexpr Rule BLANK_AROUND_SEPARATOR{
    "F101", Level::ERROR, "blank around a separator",
    "Nothing is trimmed: a blank before or behind \",\" or \":\" is part of the item, which then equals no "
    "name. Only the "
    "blanks before a \"\\\" and those that the next line begins with are dropped.",
    "DEVICE_SUPPORTED = base, kestrel"};
constexpr Rule TRAILING_SEPARATOR{
    "F102", Level::ERROR, "separator at the end",
    "A separator at the end of a list or of a record leaves an empty item behind it, "
    "which is a text like any other and names nothing.",
    "DEVICE_SUPPORTED = base,kestrel,"};
constexpr Rule EMPTY_ITEM{
    "F103", Level::ERROR, "empty item",
    "Nothing between two separators is an empty text, not an absence: lists hold it as a name, "
    "records read it as an operation, a mode or an output.",
    "DEVICE_SUPPORTED = base,,kestrel"};
constexpr Rule DUPLICATE_ITEM{
    "F104", Level::WARNING, "item listed twice",
    "What is listed twice counts once. Where it was meant to be another item, that one is "
    "missing.",
    "DEVICE_SUPPORTED = base,kestrel,kestrel"};
constexpr Rule LIST_TOO_LONG{
    "F105", Level::ERROR, "more than 32768 items",
    "Items, and fields of an item, are counted up to 32767, beginning with 0. What stands "
    "behind is never read.",
    ""};

constexpr Rule COMMENT_BEHIND_VALUE{
    "F106", Level::WARNING, "comment behind a value",
    "Comments stand on lines of their own: what looks like one behind a value is part of the value.",
    "PROPERTY = PINS,140 # in the largest package"};

bool isBlank(char byte) { return byte == ' ' || byte == '\t'; }

void checkPieces(const std::vector<Token>& pieces, Findings& findings) {
    for (const Token& piece : pieces) {
        if (piece.text.empty() && pieces.size() > 1) {
            const bool isLast = &piece == &pieces.back();
            findings.add(isLast ? TRAILING_SEPARATOR : EMPTY_ITEM, piece,
                         isLast ? "a separator at the end leaves an empty item behind it" : "empty item");
        } else if (!piece.text.empty() && (isBlank(piece.text.front()) || isBlank(piece.text.back()))) {
            findings.add(BLANK_AROUND_SEPARATOR, piece,
                         fmt::format("the blanks of {} are part of the text", quoted(piece.text)));
        }
        if (piece.text.find(" # ") != piece.text.npos) {
            findings.add(COMMENT_BEHIND_VALUE, piece,
                         fmt::format("the comment is part of the text {}", quoted(piece.text)));
        }
    }
}

void checkSeparators(const Entry& entry, Findings& findings) {
    if (entry.records.size() == 1) {
        checkPieces(entry.records.front().fields, findings);
        return;
    }
    std::vector<Token> wholes;
    for (const Record& record : entry.records) {
        if (record.fields.size() > 1) {
            checkPieces(record.fields, findings);
        }
        // The blanks of a record's own fields are found above.
        wholes.push_back(record.fields.size() > 1 ? Token{"record", record.whole.place} : record.whole);
    }
    checkPieces(wholes, findings);
}

void checkTwice(const std::vector<Token>& items, std::size_t first, Findings& findings) {
    std::set<std::string_view> seen;
    for (std::size_t i = first; i < items.size(); ++i) {
        if (!items[i].text.empty() && !seen.insert(items[i].text).second) {
            findings.add(DUPLICATE_ITEM, items[i], fmt::format("{} is listed twice", quoted(items[i].text)));
        }
    }
}

/// The lists: flat ones, those of the modes behind their labels, the values of properties behind name and count.
void checkTwice(std::string_view key, const Entry& entry, Family::Kind kind, Findings& findings) {
    constexpr std::string_view RECORDS_WITHOUT_LISTS[] = {"OPERATION", "BSDL_OPERATION", "PROGRAM_OPTION",
                                                          "PROPERTY", "IDCODE"};
    if (entry.shape == Shape::LIST) {
        checkTwice(entry.list(), 0, findings);
    }
    if (entry.shape != Shape::RECORDS || key.ends_with("_PROPERTY")) {
        return;
    }
    for (const std::string_view other : RECORDS_WITHOUT_LISTS) {
        if (key == other) {
            return;
        }
    }
    for (const Record& record : entry.records) {
        checkTwice(record.fields, kind == Family::Kind::BASE && key != "PROPERTIES" ? 1 : 2, findings);
    }
}

void checkSection(const Section& section, Family::Kind kind, Findings& findings) {
    for (const auto& [key, entry] : section.entries) {
        checkSeparators(entry, findings);
        checkTwice(key, entry, kind, findings);
        for (const Token& unseen : entry.unseen) {
            findings.add(LIST_TOO_LONG, unseen, "items from here on are never read: there are 32768 before");
        }
    }
}

void check(const Model& model, Findings& findings) {
    for (const Family& family : model.families()) {
        checkSection(family.own, family.kind, findings);
        for (const Section& device : family.devices) {
            checkSection(device, family.kind, findings);
        }
    }
}

} // namespace

Group listRules() {
    return {{&BLANK_AROUND_SEPARATOR, &TRAILING_SEPARATOR, &EMPTY_ITEM, &DUPLICATE_ITEM, &LIST_TOO_LONG,
             &COMMENT_BEHIND_VALUE},
            check};
}

} // namespace lint
