// Rules about lines that the reader can make nothing of: each costs the line, and is reported where it stands.
#include "lint/rules/RuleSets.h"

#include "lint/Findings.h"

#include <fmt/format.h>

#include <algorithm>

namespace lint {

namespace {

constexpr Rule NO_EQUALS_SIGN{"L101", Level::ERROR, "line without \"=\"",
                              "A line is a comment, a header or an assignment. One that is none of them is "
                              "dropped, with all that it goes on "
                              "with. Often a \"\\\" is missing at the end of the line before.",
                              "OPERATION = PROGRAM,Bscan,USB2:\n            VERIFY,Bscan,USB2"};
constexpr Rule EMPTY_KEY{"L102", Level::ERROR, "no key before \"=\"",
                         "An assignment begins with the key that it sets. Without one the line is dropped.",
                         "= VENDOR,Korvel"};
constexpr Rule BLANK_IN_KEY{
    "L103", Level::ERROR, "blank in a key",
    "A key is one word; only the blanks around it are dropped. The line is dropped. Often a value that "
    "should have "
    "gone on stands there instead, because the \"\\\" before it is missing or followed by a blank.",
    "BSDL OPERATION = BYPASS,USB2"};
constexpr Rule NUL_BYTE{
    "L104", Level::ERROR, "NUL byte",
    "Values end at a NUL where applications read them, so a line that holds one is dropped. The "
    "file was damaged, or written in an encoding of two bytes a character.",
    "PROPERTY = VENDOR,Kor<NUL>vel"};
constexpr Rule LINE_TOO_LONG{
    "L105", Level::ERROR, "line of more than 16 MiB",
    "A line, with all that it goes on with, is dropped when it is longer than 16 MiB. Split it "
    "by \"+=\".",
    ""};
constexpr Rule CONTINUED_AT_END{"L106", Level::ERROR, "file ends behind \"\\\"",
                                "The last line says that it goes on, and does not: the file may have been "
                                "cut short, so the line is dropped.",
                                "PROPERTY = VENDOR,Korvel: \\"};
constexpr Rule UNCLOSED_HEADER{
    "L107", Level::ERROR, "header without \"]\"",
    "A line that begins with \"[\" opens a section. A malformed one is dropped, and so are "
    "the keys up to the next header, lest they land on another device.",
    "[KS50"};
constexpr Rule EMPTY_NAME{
    "L108", Level::ERROR, "header without a name",
    "A section is that of a device, so it has a name. The header is dropped, and so are the keys "
    "up to the next one.",
    "[]"};
constexpr Rule BLANK_IN_NAME{
    "L109", Level::ERROR, "blank in the name of a header",
    "A device's name is one word, with no blanks around it either. The header is dropped, and "
    "so are the keys up to the next one.",
    "[ KS50 ]"};
constexpr Rule TEXT_BEHIND_HEADER{
    "L110", Level::ERROR, "text behind a header",
    "A header ends with its \"]\"; there are no comments behind it. The header is dropped, "
    "and so are the keys up to the next one.",
    "[KS50] # the smallest one"};

constexpr Rule VALUE_TOO_LONG{
    "L111", Level::ERROR, "value that would grow over 1 GiB",
    "A value may grow up to 1 GiB by \"+=\", over all layers. A text that would make it longer is dropped.",
    ""};

constexpr Rule SWALLOWED_LINE{"L112", Level::ERROR, "line that goes on into a header, a key or a comment",
                              "Behind a \"\\\" at the end of a line the next line is part of the value, "
                              "whatever it looks like: a header opens no section, a key sets nothing, and a "
                              "comment is no comment. Drop the \"\\\", or move the comment above the key.",
                              "PROPERTY = PINS,140: \\\n[KS100]"};

const Rule* ruleFor(AcdLines::ParseError fault) {
    switch (fault) {
    case AcdLines::ParseError::NO_EQUALS_SIGN:
        return &NO_EQUALS_SIGN;
    case AcdLines::ParseError::EMPTY_KEY:
        return &EMPTY_KEY;
    case AcdLines::ParseError::BLANK_IN_KEY:
        return &BLANK_IN_KEY;
    case AcdLines::ParseError::NUL_BYTE:
        return &NUL_BYTE;
    case AcdLines::ParseError::LINE_TOO_LONG:
        return &LINE_TOO_LONG;
    case AcdLines::ParseError::CONTINUED_AT_END:
        return &CONTINUED_AT_END;
    case AcdLines::ParseError::UNCLOSED_HEADER:
        return &UNCLOSED_HEADER;
    case AcdLines::ParseError::EMPTY_NAME:
        return &EMPTY_NAME;
    case AcdLines::ParseError::BLANK_IN_NAME:
        return &BLANK_IN_NAME;
    case AcdLines::ParseError::TEXT_BEHIND_HEADER:
        return &TEXT_BEHIND_HEADER;
    case AcdLines::ParseError::NONE:
        break;
    }
    return nullptr;
}

/// Is this the beginning of `KEY =`?
bool looksLikeKey(std::string_view text) {
    const std::size_t end = text.find_first_not_of("ABCDEFGHIJKLMNOPQRSTUVWXYZ0123456789_");
    if (end == 0 || end == text.npos) {
        return false;
    }
    text.remove_prefix(std::min(text.find_first_not_of(" \t", end), text.size()));
    return text.starts_with('=') || text.starts_with("+=");
}

/// What a line looks like that is none of its own; null when it looks like a part of a value.
const char* disguise(std::string_view text) {
    if (text.starts_with('#')) {
        return "a comment";
    }
    if (text.starts_with('[') && text.find(']') != text.npos) {
        return "a header";
    }
    return looksLikeKey(text) ? "a key" : nullptr;
}

void checkSwallowed(const AcdLines& file, const AcdLines::Line& line, Findings& findings) {
    for (const AcdLines::SourceSpan& fragment : line.spans) {
        if (fragment.line == line.line) {
            continue;
        }
        const std::string_view text =
            file.source(fragment.line)
                .substr(std::min<std::size_t>(fragment.column - 1, file.source(fragment.line).size()));
        if (const char* const what = disguise(text)) {
            findings.add(
                SWALLOWED_LINE, {text, {&file, fragment.line, fragment.column}},
                fmt::format("this is no line of its own but part of the value of {}, though it looks like {}",
                            quoted(line.name), what));
        }
    }
}

void checkLengths(const Section& section, Findings& findings) {
    for (const auto& [key, entry] : section.entries) {
        for (const Token& text : entry.tooLong) {
            findings.add(VALUE_TOO_LONG, text,
                         fmt::format("the value of {} would grow over 1 GiB by this", quoted(key)));
        }
    }
}

void check(const Model& model, Findings& findings) {
    for (const AcdLines& file : model.files()) {
        for (const AcdLines::Line& line : file.lines()) {
            if (const Rule* const rule = ruleFor(line.error)) {
                findings.add(*rule, {{}, {&file, line.line, line.column}}, line.text);
            }
            checkSwallowed(file, line, findings);
        }
    }
    for (const Family& family : model.families()) {
        checkLengths(family.own, findings);
        for (const Section& device : family.devices) {
            checkLengths(device, findings);
        }
    }
}

} // namespace

Group lineRules() {
    return {{&NO_EQUALS_SIGN, &EMPTY_KEY, &BLANK_IN_KEY, &NUL_BYTE, &LINE_TOO_LONG, &CONTINUED_AT_END,
             &UNCLOSED_HEADER, &EMPTY_NAME, &BLANK_IN_NAME, &TEXT_BEHIND_HEADER, &VALUE_TOO_LONG,
             &SWALLOWED_LINE},
            check};
}

} // namespace lint
