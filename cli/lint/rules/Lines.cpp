// Rules about lines that the reader rejects: each costs the line and is reported at its place.
#include "lint/rules/RuleSets.h"

#include "database/FileNames.h"
#include "lint/FamilyResult.h"
#include "text/Trimmed.h"

#include <algorithm>

namespace lint {

namespace {

constexpr Rule NO_EQUALS_SIGN{
    "L101",
    "no-equals-sign",
    Severity::ERROR,
    R"(line without "=")",
    R"(A line is a comment, a header or an assignment. Any other line is dropped, together with its continuation
lines. Often a "\" is missing at the end of the line before.)",
    "OPERATION = PROGRAM,Bscan,USB2:\n            VERIFY,Bscan,USB2"};
constexpr Rule EMPTY_KEY{
    "L102",
    "empty-key",
    Severity::ERROR,
    R"(no key before "=")",
    R"(An assignment begins with the key that it sets. Without one the line is dropped.)",
    "= VENDOR,Korvel"};
constexpr Rule BLANK_IN_KEY{
    "L103",
    "blank-in-key",
    Severity::ERROR,
    "blank in a key",
    R"(A key is one word; only the blanks around it are dropped. The line is dropped. Often the line was meant to
continue a value, and the "\" before it is missing or followed by a blank.)",
    "BSDL OPERATION = BYPASS,USB2"};
constexpr Rule NUL_BYTE{
    "L104",
    "nul-byte",
    Severity::ERROR,
    "NUL byte",
    R"(Applications read a value up to its first NUL, so a line that contains one is dropped. The file is damaged,
or it is in an encoding with two bytes per character.)",
    "PROPERTY = VENDOR,Kor<NUL>vel"};
constexpr Rule LINE_TOO_LONG{
    "L105",
    "line-too-long",
    Severity::ERROR,
    "line of more than 16 MiB",
    R"(A line that is longer than 16 MiB, its continuation lines included, is dropped. Split it with "+=".)",
    ""};
constexpr Rule CONTINUED_AT_END{
    "L106",
    "continued-at-end",
    Severity::ERROR,
    R"(file ends after "\")",
    R"(The last line says that it continues, but the file ends. The file may be incomplete, so the line is dropped.)",
    "PROPERTY = VENDOR,Korvel: \\"};
constexpr Rule UNCLOSED_HEADER{
    "L107",
    "unclosed-header",
    Severity::ERROR,
    R"(header without "]")",
    R"(A line that begins with "[" opens a section. A malformed header is dropped, and so are the keys up to the
next header, so that they do not become those of another device.)",
    "[KS50"};
constexpr Rule EMPTY_NAME{
    "L108",
    "empty-name",
    Severity::ERROR,
    "header without a name",
    R"(A section belongs to a device, so it needs a name. The header is dropped, and so are the keys up to the next
header.)",
    "[]"};
constexpr Rule BLANK_IN_NAME{
    "L109",
    "blank-in-name",
    Severity::ERROR,
    "blank in the name of a header",
    R"(The name of a device is one word, without blanks around it. The header is dropped, and so are the keys up to
the next header.)",
    "[ KS50 ]"};
constexpr Rule TEXT_AFTER_HEADER{
    "L110",
    "text-after-header",
    Severity::ERROR,
    "text after a header",
    R"(A header ends with its "]"; a comment cannot follow it. The header is dropped, and so are the keys up to the
next header.)",
    "[KS50] # the smallest one"};
constexpr Rule VALUE_TOO_LONG{
    "L111",
    "value-too-long",
    Severity::ERROR,
    "value of more than 1 GiB",
    R"(A value can grow up to 1 GiB by "+=", all layers together. A text that would make it longer is dropped.)",
    ""};
constexpr Rule SWALLOWED_LINE{
    "L112",
    "swallowed-line",
    Severity::ERROR,
    "continuation that looks like a header, a key or a comment",
    R"(After a "\" at the end of a line the next line is part of the value, even if it looks like something else: a header opens
no section, a key sets nothing, and a comment is text. Remove the "\", or move the comment above the key.)",
    "PROPERTY = PINS,140: \\\n[KS100]"};

constexpr Rule LONE_CR{
    "L113",
    "lone-cr",
    Severity::WARNING,
    "carriage return inside a line",
    R"(Lines end in LF or CRLF; a CR anywhere else is part of the text. A file whose lines end in CR alone is a single
line.)",
    "PROPERTY = PINS,140<CR>PROPERTIES = PACKAGES,1,TQ100",
    false,
    true};
constexpr Rule UNREADABLE_FILE{
    "L114",
    "unreadable-file",
    Severity::ERROR,
    "file that cannot be read",
    R"(The file cannot be opened or read, or it is not a regular file. Its devices do not exist for applications. The other
files are checked, but names that this file may define are not reported as unknown. The exit status is 2.)",
    ""};

constexpr Rule UNUSED_INDEX{
    "L115",
    "unused-index",
    Severity::WARNING,
    "index.acx that does not match the files",
    R"(The index of the directory was made from other files, or is damaged or of another version. Applications do not use it:
their first answers take longer. Make it again: tarvik index DIR. The finding is reported in the first file of the
directory.)",
    "# a file was edited after \"tarvik index\""};

const Rule* ruleFor(AcdLines::ParseError error) {
    switch (error) {
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
        return &TEXT_AFTER_HEADER;
    case AcdLines::ParseError::NONE:
        break;
    }
    return nullptr;
}

bool isOneWord(std::string_view text) { return !text.empty() && text.find_first_of(" \t[]#\\") == text.npos; }

/// A header with one name in it, and a comment after it on a line of its own before it.
std::optional<Fix> fixOfHeader(const AcdLines& file, const AcdLines::Line& line) {
    const std::string_view source = file.source(line.firstLine);
    const std::size_t open = source.find('[');
    if (open == source.npos || line.firstLine != line.lastLine) {
        return std::nullopt;
    }
    const std::string_view whole = source.substr(open);
    const std::size_t close = std::min(whole.find(']'), whole.size());
    const std::string_view name = trimmed(whole.substr(1, close - 1));
    const std::string_view rest = trimmed(whole.substr(std::min(close + 1, whole.size())));
    if (!isOneWord(name) || (!rest.empty() && !rest.starts_with('#'))) {
        return std::nullopt;
    }
    const std::string comment = rest.empty() ? std::string() : std::string(rest) + '\n';
    return replacing({whole, {&file, line.firstLine, static_cast<unsigned>(open) + 1}},
                     fmt::format("{}[{}]", comment, name));
}

/// The last line without the separator and the "\" before what is not there.
std::optional<Fix> fixOfLastLine(const AcdLines& file, const AcdLines::Line& line) {
    const std::string_view source = file.source(line.line);
    const std::size_t end = source.find_last_not_of(" \t,:\\") + 1;
    return replacing({source.substr(end), {&file, line.line, static_cast<unsigned>(end) + 1}}, "");
}

std::optional<Fix> fixOf(const AcdLines& file, const AcdLines::Line& line) {
    switch (line.error) {
    case AcdLines::ParseError::UNCLOSED_HEADER:
    case AcdLines::ParseError::BLANK_IN_NAME:
    case AcdLines::ParseError::TEXT_BEHIND_HEADER:
        return fixOfHeader(file, line);
    case AcdLines::ParseError::CONTINUED_AT_END:
        return fixOfLastLine(file, line);
    default:
        return std::nullopt;
    }
}

/// Does the text begin with `KEY =`?
bool looksLikeKey(std::string_view text) {
    const std::size_t end = text.find_first_not_of("ABCDEFGHIJKLMNOPQRSTUVWXYZ0123456789_");
    if (end == 0 || end == text.npos) {
        return false;
    }
    text.remove_prefix(std::min(text.find_first_not_of(" \t", end), text.size()));
    return text.starts_with('=') || text.starts_with("+=");
}

/// What a continuation line looks like, though it is none; null when it looks like a part of a value.
const char* looksLike(std::string_view text) {
    if (text.starts_with('#')) {
        return "a comment";
    }
    if (text.starts_with('[') && text.find(']') != text.npos) {
        return "a header";
    }
    return looksLikeKey(text) ? "a key" : nullptr;
}

void checkSwallowed(const AcdLines& file, const AcdLines::Line& line, Findings& findings) {
    for (const AcdLines::SourceSpan& span : line.spans) {
        if (span.line == line.line) {
            continue;
        }
        const std::string_view source = file.source(span.line);
        const std::string_view text = source.substr(std::min<std::size_t>(span.column - 1, source.size()));
        if (const char* const what = looksLike(text)) {
            findings.add(SWALLOWED_LINE, {text, {&file, span.line, span.column}},
                         "this continues the value of {}, but looks like {}", inQuotes(line.name), what);
        }
    }
}

void checkReturns(const AcdLines& file, unsigned line, Findings& findings) {
    const std::string_view text = file.source(line);
    const std::size_t at = text.find('\r');
    if (at + 1 < text.size() && at != text.npos) {
        findings.addText(LONE_CR, {text.substr(at, 1), {&file, line, static_cast<unsigned>(at + 1)}},
                         "the line does not end at this carriage return");
    }
}

void checkFamily(const FamilyData& family, const FamilyContext& /*any*/, FamilyResult& result) {
    Findings& findings = result.findings;
    for (const AcdLines& file : family.files) {
        if (!file.readError().empty()) {
            findings.add(UNREADABLE_FILE, startOf(file), "the file cannot be read: {}", file.readError());
        }
        for (const AcdLines::Comment& comment : file.comments()) {
            checkReturns(file, comment.line, findings);
        }
        for (const AcdLines::Line& line : file.lines()) {
            if (const Rule* const rule = ruleFor(line.error)) {
                findings.addText(*rule, {{}, {&file, line.line, line.column}}, line.text).fix =
                    fixOf(file, line);
            }
            checkSwallowed(file, line, findings);
            for (unsigned number = line.firstLine; number <= line.lastLine; ++number) {
                checkReturns(file, number, findings);
            }
        }
    }
    family.forEachSection([&](const Section& section) {
        for (const auto& [key, value] : section.values) {
            for (const Token& text : value.oversizedAppends) {
                findings.add(VALUE_TOO_LONG, text, "the value of {} would grow over 1 GiB by this",
                             inQuotes(key));
            }
        }
    });
}

void check(const Model& model, const FamilyResults& /*any*/, Findings& findings) {
    const std::vector<const AcdLines*> files = model.files();
    for (const std::string& directory : model.unusedIndexes()) {
        const auto first = std::find_if(files.begin(), files.end(), [&directory](const AcdLines* file) {
            return acd::directoryOf(file->path()) == directory;
        });
        findings.addText(UNUSED_INDEX, startOf(**first),
                         "index.acx of this directory does not match the files, so it is not used");
    }
}

} // namespace

RuleSet lineRules() {
    return {"lines",
            {&NO_EQUALS_SIGN, &EMPTY_KEY, &BLANK_IN_KEY, &NUL_BYTE, &LINE_TOO_LONG, &CONTINUED_AT_END,
             &UNCLOSED_HEADER, &EMPTY_NAME, &BLANK_IN_NAME, &TEXT_AFTER_HEADER, &VALUE_TOO_LONG,
             &SWALLOWED_LINE, &LONE_CR, &UNREADABLE_FILE, &UNUSED_INDEX},
            checkFamily,
            check};
}

} // namespace lint
