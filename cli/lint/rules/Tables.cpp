// Rules about OPERATION, BSDL_OPERATION and PROGRAM_OPTION: which cells of the permission tables they turn on.
#include "lint/Findings.h"
#include "lint/rules/RuleSets.h"

#include "model/Vocabulary.h"
#include "text/Suggest.h"

#include <tarvik/ConstraintsManager.h>

#include <fmt/format.h>

#include <algorithm>
#include <optional>
#include <set>
#include <tuple>

namespace lint {

namespace {

using TARVIKNS::MODE_TYPE;
using TARVIKNS::OUTPUT_TYPE;
using TARVIKNS::PROGRAM_OPTION;

constexpr Rule UNKNOWN_OPERATION{"T101", Level::ERROR, "unknown operation",
                                 "Operations go by their key names, in any case. An unknown one raises "
                                 "OutOfRangeException, and the rest of the key is "
                                 "never read; with exceptions off the record says nothing.",
                                 "OPERATION = PROGRM,Bscan,USB2"};
constexpr Rule UNKNOWN_OPTION{"T102", Level::ERROR, "unknown option",
                              "Options go by their key names, in upper case. An unknown one raises "
                              "DataMismatchException even with exceptions off, "
                              "and the rest of the key is never read; in spi.acd it ends the start-up.",
                              "PROGRAM_OPTION = Verify,Bscan,USB2"};
constexpr Rule UNREADABLE_OPTION{
    "T103", Level::ERROR, "option that can be named but not read",
    "The manager names the options from PROGRAM_ONLYFPGA to RS_PIN0, but a database can't "
    "give them: reading one raises as an unknown option does.",
    "PROGRAM_OPTION = OTP,Bscan,USB2"};
constexpr Rule UNKNOWN_MODE{
    "T104", Level::ERROR, "unknown mode",
    "A text that names no mode counts as Boundary Scan, silently. Modes are Bscan, SSerial, Smap, "
    "BSFILE, DP770 and SPI, in any case.",
    "OPERATION = PROGRAM,Slave,USB2"};
constexpr Rule ACCIDENTAL_MODE{
    "T105", Level::WARNING, "mode BS",
    "BS is the key of Boundary Scan in base.acd and in properties, but no text that a record "
    "knows. It counts as Boundary Scan by accident, as every unknown text does. Write Bscan.",
    "OPERATION = PROGRAM,BS,USB2"};
constexpr Rule UNKNOWN_OUTPUT{
    "T106", Level::ERROR, "unknown output",
    "Outputs are PARALLEL, ZORVA, USB2, SVF and STAPL, in upper case. Any other text raises "
    "DataMismatchException, and the rest of the key is never read; with exceptions off it says "
    "nothing. QSVF and NULLCABLE can be named but not read.",
    "OPERATION = PROGRAM,Bscan,USB"};
constexpr Rule OUTPUT_WITHOUT_CELL{
    "T107", Level::WARNING, "output without a cell",
    "EXPRESSSVF and EXPRESSQSVF are outputs of modes, but the tables have no cell for "
    "them: here they say nothing, silently.",
    "OPERATION = PROGRAM,BSFILE,EXPRESSSVF"};
constexpr Rule MODE_WITHOUT_CELL{
    "T108", Level::WARNING, "mode without a cell",
    "The tables have no cells for the Kite modes and the PROM file formatter: the record "
    "says nothing, silently. Such modes belong in the property named as the operation.",
    "OPERATION = PROGRAM,KITECF,SVF"};
constexpr Rule NO_OUTPUT{
    "T109", Level::ERROR, "record without outputs",
    "A record turns on one cell for each of its outputs. Without one, or without a mode, it raises "
    "DataMismatchException, and the rest of the key is never read.",
    "OPERATION = PROGRAM,Bscan"};
constexpr Rule CELL_TWICE{
    "T110", Level::WARNING, "cell given twice",
    "The same operation or option, mode and output stand in the key already. Where another was "
    "meant, that one is missing.",
    "OPERATION = PROGRAM,Bscan,USB2:PROGRAM,Bscan,USB2,SVF"};
constexpr Rule SPI_MODE_ELSEWHERE{
    "T111", Level::WARNING, "mode SPI outside spi.acd",
    "In SPI mode the manager asks for family \"spi\" whatever the device, so a record with "
    "that mode says something in spi.acd only.",
    "# in kestrel.acd\nOPERATION = PROGRAM,SPI,USB2"};

constexpr Rule MODE_WITHOUT_FAMILY{
    "T112", Level::WARNING, "mode that does not list the family",
    "The tables allow something in a mode that base.acd does not list the family under: an application that "
    "asks whether the device can be configured in the mode is told no, and one that asks for the operation, "
    "yes.",
    "# in kestrel.acd, while base.acd has no kestrel under SM\nOPERATION = PROGRAM,Smap,USB2"};

constexpr Rule MODE_WITHOUT_OUTPUT{
    "T113", Level::WARNING, "output that the mode can't use",
    "The tables allow something through an output that base.acd does not list under the mode: an application "
    "that asks for the mode and the output is told no, and one that asks for the operation, yes.",
    "# while base.acd has no PARALLEL under SM\nOPERATION = PROGRAM,Smap,PARALLEL"};

/// What stands before the outputs of a record, by key.
struct Table {
    const char* key;
    bool hasOptions; ///< in place of operations
    bool hasMode;
};

constexpr Table TABLES[] = {
    {"OPERATION", false, true}, {"BSDL_OPERATION", false, false}, {"PROGRAM_OPTION", true, true}};

const std::vector<std::string>& modeTexts() {
    static const std::vector<std::string> texts{"Bscan", "SSerial", "Smap", "BSFILE", "DP770", "SPI"};
    return texts;
}

std::vector<std::string> readableOptions() {
    const std::vector<std::string>& all = vocabulary::options();
    return {all.begin(), all.begin() + static_cast<int>(PROGRAM_OPTION::SECTOR_LOCKDOWN) + 1};
}

const std::vector<std::string>& cellOutputs() {
    static const std::vector<std::string> texts{vocabulary::outputs().begin(),
                                                vocabulary::outputs().begin() +
                                                    static_cast<int>(OUTPUT_TYPE::STAPL) + 1};
    return texts;
}

std::optional<std::size_t> position(const std::vector<std::string>& all, std::string_view text,
                                    bool anyCase) {
    const auto found = std::find_if(all.begin(), all.end(), [&](const std::string& candidate) {
        return anyCase ? sameWithoutCase(candidate, text) : candidate == text;
    });
    return found == all.end() ? std::nullopt : std::optional(static_cast<std::size_t>(found - all.begin()));
}

/// What base.acd says of a mode. A list that is missing says nothing.
struct ModeLists {
    std::optional<std::set<std::string_view>> outputs;
    std::optional<std::set<std::string_view>> families;
};

/// By mode.
using AllModeLists = std::vector<ModeLists>;

/// Behind the label.
std::set<std::string_view> listed(const Record& record) {
    std::set<std::string_view> names;
    for (std::size_t i = 1; i < record.fields.size(); ++i) {
        names.insert(record.fields[i].text);
    }
    return names;
}

AllModeLists modeLists(const Model& model) {
    AllModeLists all;
    for (const std::string& mode : vocabulary::modes()) {
        ModeLists& lists = all.emplace_back();
        const Entry* const entry = model.baseEntry(mode);
        if (entry != nullptr && entry->records.size() > 1) {
            lists.outputs = listed(entry->records[0]);
            lists.families = listed(entry->records[1]);
        }
    }
    return all;
}

/// Looks at the records of one key.
class TableCheck {
public:
    TableCheck(const Table& table, const Family& family, const AllModeLists& modes, Findings& findings)
        : m_table(table), m_family(family), m_modes(modes), m_findings(findings) {}

    void check(const Record& record) {
        const std::vector<Token>& fields = record.fields;
        if (record.whole.text.empty()) {
            return; // an empty item is found as such
        }
        const std::optional<std::size_t> row = m_table.hasOptions ? option(fields[0]) : operation(fields[0]);
        std::size_t next = 1;
        std::optional<std::size_t> mode = 0;
        bool isInMode = false;
        if (m_table.hasMode && fields.size() > 1) {
            mode = readMode(fields[next]);
            isInMode = mode && modeTakesFamily(*mode, fields[next]);
            ++next;
        }
        if (fields.size() <= (m_table.hasMode ? 2U : 1U)) {
            m_findings.add(NO_OUTPUT, record.whole,
                           fmt::format("no output in {}", quoted(record.whole.text)));
        }
        for (; next < fields.size(); ++next) {
            const std::optional<std::size_t> output = readOutput(fields[next]);
            if (isInMode && output) {
                checkModeOutput(*mode, fields[next]);
            }
            if (row && mode && output && !m_cells.insert({*row, *mode, *output}).second) {
                m_findings.add(CELL_TWICE, fields[next],
                               fmt::format("{} of {} is given already", quoted(fields[next].text),
                                           quoted(record.whole.text)));
            }
        }
    }

private:
    std::optional<std::size_t> operation(const Token& token) {
        const std::optional<std::size_t> found = position(vocabulary::operations(), token.text, true);
        if (!found && !token.text.empty()) {
            m_findings.add(UNKNOWN_OPERATION, token,
                           fmt::format("unknown operation {}{}", quoted(token.text),
                                       m_findings.didYouMean(token.text, vocabulary::operations())));
        }
        return found;
    }

    std::optional<std::size_t> option(const Token& token) {
        const std::vector<std::string> readable = readableOptions();
        const std::optional<std::size_t> found = position(vocabulary::options(), token.text, false);
        if (found && *found >= readable.size()) {
            m_findings.add(UNREADABLE_OPTION, token,
                           fmt::format("a database can't give the option {}", quoted(token.text)));
        } else if (!found && !token.text.empty()) {
            m_findings.add(UNKNOWN_OPTION, token,
                           fmt::format("unknown option {}{}", quoted(token.text),
                                       m_findings.didYouMean(token.text, readable)));
        }
        return found;
    }

    /// @return a mode with cells; nothing for any other
    std::optional<std::size_t> readMode(const Token& token) {
        const std::string text(token.text);
        const MODE_TYPE mode = ConstraintsManager::modeString2Type(text.c_str());
        if (mode == MODE_TYPE::BS && !sameWithoutCase(text, "Bscan")) {
            if (sameWithoutCase(text, "BS")) {
                m_findings.add(ACCIDENTAL_MODE, token,
                               fmt::format("{} counts as Boundary Scan by accident; did you mean \"Bscan\"?",
                                           quoted(text)));
            } else if (!text.empty()) {
                m_findings.add(UNKNOWN_MODE, token,
                               fmt::format("unknown mode {}, which counts as Boundary Scan{}", quoted(text),
                                           m_findings.didYouMean(text, modeTexts())));
            }
        } else if (mode > MODE_TYPE::SPI) {
            m_findings.add(MODE_WITHOUT_CELL, token,
                           fmt::format("the table has no cells for mode {}", quoted(text)));
            return std::nullopt;
        } else if (mode == MODE_TYPE::SPI && m_family.kind == Family::Kind::PARTS) {
            m_findings.add(SPI_MODE_ELSEWHERE, token, "in SPI mode only the tables of spi.acd are asked");
            return std::nullopt;
        }
        return static_cast<std::size_t>(mode);
    }

    /// Can the family be configured in the mode? Unknown devices, which are of family "base", can't in any.
    bool modeTakesFamily(std::size_t mode, const Token& token) {
        const auto& families = m_modes[mode].families;
        const bool isMissing =
            families && m_family.kind != Family::Kind::BASE && !families->contains(m_family.name);
        if (isMissing) {
            m_findings.add(MODE_WITHOUT_FAMILY, token,
                           fmt::format("{} of base.acd does not list the family {}",
                                       vocabulary::modes()[mode], quoted(m_family.name)));
        }
        return !isMissing;
    }

    void checkModeOutput(std::size_t mode, const Token& token) {
        const auto& outputs = m_modes[mode].outputs;
        if (outputs && !outputs->contains(token.text)) {
            m_findings.add(MODE_WITHOUT_OUTPUT, token,
                           fmt::format("{} of base.acd does not list the output {}",
                                       vocabulary::modes()[mode], quoted(token.text)));
        }
    }

    /// @return an output with a cell; nothing for any other
    std::optional<std::size_t> readOutput(const Token& token) {
        const std::optional<std::size_t> found = position(cellOutputs(), token.text, false);
        if (found || token.text.empty()) {
            return found;
        }
        if (token.text == "EXPRESSSVF" || token.text == "EXPRESSQSVF") {
            m_findings.add(OUTPUT_WITHOUT_CELL, token,
                           fmt::format("the table has no cells for output {}", quoted(token.text)));
        } else if (position(vocabulary::outputs(), token.text, false)) {
            m_findings.add(UNKNOWN_OUTPUT, token,
                           fmt::format("a database can't give the output {}", quoted(token.text)));
        } else {
            m_findings.add(UNKNOWN_OUTPUT, token,
                           fmt::format("unknown output {}{}", quoted(token.text),
                                       m_findings.didYouMean(token.text, cellOutputs())));
        }
        return std::nullopt;
    }

    const Table& m_table;
    const Family& m_family;
    const AllModeLists& m_modes;
    Findings& m_findings;
    std::set<std::tuple<std::size_t, std::size_t, std::size_t>> m_cells;
};

void checkSection(const Section& section, const Family& family, const AllModeLists& modes,
                  Findings& findings) {
    for (const Table& table : TABLES) {
        if (const Entry* const entry = section.find(table.key)) {
            TableCheck check(table, family, modes, findings);
            for (const Record& record : entry->records) {
                check.check(record);
            }
        }
    }
}

void check(const Model& model, Findings& findings) {
    const AllModeLists modes = modeLists(model);
    for (const Family& family : model.families()) {
        checkSection(family.own, family, modes, findings);
        for (const Section& device : family.devices) {
            checkSection(device, family, modes, findings);
        }
    }
}

} // namespace

Group tableRules() {
    return {{&UNKNOWN_OPERATION, &UNKNOWN_OPTION, &UNREADABLE_OPTION, &UNKNOWN_MODE, &ACCIDENTAL_MODE,
             &UNKNOWN_OUTPUT, &OUTPUT_WITHOUT_CELL, &MODE_WITHOUT_CELL, &NO_OUTPUT, &CELL_TWICE,
             &SPI_MODE_ELSEWHERE, &MODE_WITHOUT_FAMILY, &MODE_WITHOUT_OUTPUT},
            check};
}

} // namespace lint
