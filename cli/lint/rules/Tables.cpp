// Rules about OPERATION, BSDL_OPERATION and PROGRAM_OPTION: which cells of the permission tables they set.
#include "lint/FamilyResult.h"
#include "lint/rules/RuleSets.h"

#include "model/Vocabulary.h"
#include "text/Suggest.h"

#include <tarvik/ConstraintsManager.h>

#include <algorithm>
#include <optional>
#include <set>
#include <tuple>

namespace lint {

namespace {

using TARVIKNS::MODE_TYPE;

constexpr Rule UNKNOWN_OPERATION{
    "T101",
    "unknown-operation",
    Severity::ERROR,
    "unknown operation",
    R"(Operations are written by their key names, in any case. An unknown one raises OutOfRangeException, and the rest
of the key is not read; with exceptions off the record has no effect.)",
    "OPERATION = PROGRM,Bscan,USB2"};
constexpr Rule UNKNOWN_OPTION{
    "T102",
    "unknown-option",
    Severity::ERROR,
    "unknown option",
    R"(Options are written by their key names, in upper case. An unknown one raises DataMismatchException even with
exceptions off, and the rest of the key is not read; in spi.acd it ends the start-up.)",
    "PROGRAM_OPTION = Verify,Bscan,USB2"};
constexpr Rule UNREADABLE_OPTION{
    "T103",
    "unreadable-option",
    Severity::ERROR,
    "option that a database cannot give",
    R"(The manager has names for the options from PROGRAM_ONLYFPGA to RS_PIN0, but reading one from a database raises
DataMismatchException, as an unknown option does.)",
    "PROGRAM_OPTION = OTP,Bscan,USB2"};
constexpr Rule UNKNOWN_MODE{
    "T104",
    "unknown-mode",
    Severity::ERROR,
    "unknown mode",
    R"(An unknown mode is silently read as Boundary Scan. Modes are Bscan, SSerial, Smap, BSFILE, DP770 and SPI, in any
case.)",
    "OPERATION = PROGRAM,Slave,USB2"};
constexpr Rule ACCIDENTAL_MODE{
    "T105",
    "accidental-mode",
    Severity::WARNING,
    "mode BS",
    R"(BS is the key of Boundary Scan in base.acd and in properties, but records do not know it. It is read as Boundary
Scan only by accident, as every unknown text is. Write Bscan.)",
    "OPERATION = PROGRAM,BS,USB2"};
constexpr Rule UNKNOWN_OUTPUT{
    "T106",
    "unknown-output",
    Severity::ERROR,
    "unknown output",
    R"(Outputs are PARALLEL, ZORVA, USB2, SVF and STAPL, in upper case. Any other text raises DataMismatchException,
and the rest of the key is not read; with exceptions off it has no effect. QSVF and NULLCABLE have names, but a database
cannot give them.)",
    "OPERATION = PROGRAM,Bscan,USB"};
constexpr Rule OUTPUT_WITHOUT_CELL{
    "T107",
    "output-without-cell",
    Severity::WARNING,
    "output without a cell",
    R"(EXPRESSSVF and EXPRESSQSVF are outputs of modes, but the tables have no cells for them: here they silently have
no effect.)",
    "OPERATION = PROGRAM,BSFILE,EXPRESSSVF"};
constexpr Rule MODE_WITHOUT_CELL{
    "T108",
    "mode-without-cell",
    Severity::WARNING,
    "mode without a cell",
    R"(The tables have no cells for the Kite modes and the PROM file formatter: the record silently has no effect. List
such a mode in the property with the name of the operation.)",
    "OPERATION = PROGRAM,KITECF,SVF"};
constexpr Rule NO_OUTPUT{
    "T109",
    "no-output",
    Severity::ERROR,
    "record without outputs",
    R"(A record sets one cell for each of its outputs. Without an output, or without a mode, it raises
DataMismatchException, and the rest of the key is not read.)",
    "OPERATION = PROGRAM,Bscan"};
constexpr Rule CELL_TWICE{
    "T110",
    "cell-twice",
    Severity::WARNING,
    "cell given twice",
    R"(The key already has the same operation or option with this mode and output. If another was meant, that one is
missing.)",
    "OPERATION = PROGRAM,Bscan,USB2:PROGRAM,Bscan,USB2,SVF"};
constexpr Rule SPI_MODE_ELSEWHERE{
    "T111",
    "spi-mode-elsewhere",
    Severity::WARNING,
    "mode SPI outside spi.acd",
    R"(In SPI mode the manager asks for family "spi" for all devices, so a record with that mode has an effect only
in spi.acd.)",
    "# in kestrel.acd\nOPERATION = PROGRAM,SPI,USB2"};
constexpr Rule MODE_WITHOUT_FAMILY{
    "T112",
    "mode-without-family",
    Severity::WARNING,
    "mode that does not list the family",
    R"(The tables allow something in a mode under which base.acd does not list the family: an application that asks
whether the device can be configured in the mode gets no, and one that asks for the operation gets yes.)",
    "# in kestrel.acd, while base.acd has no kestrel under SM\nOPERATION = PROGRAM,Smap,USB2"};
constexpr Rule MODE_WITHOUT_OUTPUT{
    "T113",
    "mode-without-output",
    Severity::WARNING,
    "output that the mode cannot use",
    R"(The tables allow something through an output that base.acd does not list under the mode: an application that
asks for the mode and the output gets no, and one that asks for the operation gets yes.)",
    "# while base.acd has no PARALLEL under SM\nOPERATION = PROGRAM,Smap,PARALLEL"};

std::optional<std::size_t> position(const std::vector<std::string>& all, std::string_view text,
                                    bool anyCase) {
    const auto found = std::find_if(all.begin(), all.end(), [&](const std::string& candidate) {
        return anyCase ? sameWithoutCase(candidate, text) : candidate == text;
    });
    return found == all.end() ? std::nullopt : std::optional(static_cast<std::size_t>(found - all.begin()));
}

/// Checks the records of one key.
class TableCheck {
public:
    TableCheck(const schema::Table& table, const FamilyData& family, const FamilyContext& context,
               Findings& findings)
        : m_table(table), m_family(family), m_modes(context.modes), m_findings(findings) {}

    void check(const std::vector<Item>& records) {
        for (const Item& record : records) {
            m_rows.insert(rowOf(record));
        }
        for (const Item& record : records) {
            checkRecord(record);
        }
    }

private:
    /// The operation or option of a record, and its mode.
    using Row = std::pair<std::string_view, std::string_view>;

    [[nodiscard]] Row rowOf(const Item& record) const {
        const bool hasMode = m_table.firstOutput > 1 && record.fields.size() > 1;
        return {record.fields[0].text, hasMode ? record.fields[1].text : std::string_view()};
    }

    /// The nearest word that the mode of the record does not have yet.
    [[nodiscard]] Suggestion suggestion(const Item& record, const std::vector<std::string>& words) {
        const auto [text, mode] = rowOf(record);
        return m_findings.suggest(text, words, [this, mode = mode](const std::string& word) {
            return m_rows.contains({word, mode});
        });
    }

    void checkRecord(const Item& record) {
        const std::vector<Token>& fields = record.fields;
        if (record.whole.text.empty()) {
            return; // found as an empty item
        }
        const std::optional<std::size_t> row = m_table.hasOptions ? option(record) : operation(record);
        std::optional<std::size_t> mode = 0;
        bool isInMode = false;
        if (m_table.firstOutput > 1 && fields.size() > 1) {
            mode = readMode(fields[1]);
            isInMode = mode && modeTakesFamily(*mode, fields[1]);
        }
        if (fields.size() <= m_table.firstOutput) {
            m_findings.add(NO_OUTPUT, record.whole, "no output in {}", inQuotes(record.whole.text));
        }
        for (std::size_t i = m_table.firstOutput; i < fields.size(); ++i) {
            const std::optional<std::size_t> output = readOutput(fields[i], fields);
            if (isInMode && output) {
                checkModeOutput(*mode, fields[i]);
            }
            if (row && mode && output && !m_cells.insert({*row, *mode, *output}).second) {
                m_findings
                    .add(CELL_TWICE, fields[i], "{} of {} is given already", inQuotes(fields[i].text),
                         inQuotes(record.whole.text))
                    .fix = removing(fields[i]);
            }
        }
    }

    std::optional<std::size_t> operation(const Item& record) {
        const Token& token = record.fields[0];
        const std::optional<std::size_t> found = position(vocabulary::operations(), token.text, true);
        if (!found && !token.text.empty()) {
            m_findings.addUnknown(UNKNOWN_OPERATION, token, token,
                                  suggestion(record, vocabulary::operations()), "unknown operation {}",
                                  inQuotes(token.text));
        }
        return found;
    }

    std::optional<std::size_t> option(const Item& record) {
        const Token& token = record.fields[0];
        const std::optional<std::size_t> found = position(vocabulary::options(), token.text, false);
        if (found && *found >= schema::tableOptions().size()) {
            m_findings.add(UNREADABLE_OPTION, token, "a database cannot give the option {}",
                           inQuotes(token.text));
        } else if (!found && !token.text.empty()) {
            m_findings.addUnknown(UNKNOWN_OPTION, token, token, suggestion(record, schema::tableOptions()),
                                  "unknown option {}", inQuotes(token.text));
        }
        return found;
    }

    /// @return a mode with cells; nothing for any other
    std::optional<std::size_t> readMode(const Token& token) {
        const std::string text(token.text);
        const MODE_TYPE mode = ConstraintsManager::modeString2Type(text.c_str());
        if (mode == MODE_TYPE::BS && !sameWithoutCase(text, schema::BOUNDARY_SCAN)) {
            if (sameWithoutCase(text, "BS")) {
                m_findings
                    .add(ACCIDENTAL_MODE, token,
                         "{} is read as Boundary Scan only because it is unknown; did you mean \"{}\"?",
                         inQuotes(text), schema::BOUNDARY_SCAN)
                    .fix = replacing(token, schema::BOUNDARY_SCAN);
            } else if (!text.empty()) {
                m_findings.addUnknown(UNKNOWN_MODE, token, token,
                                      m_findings.suggest(text, schema::tableModes()),
                                      "unknown mode {}, which is read as Boundary Scan", inQuotes(text));
            }
        } else if (mode > MODE_TYPE::SPI) {
            m_findings.add(MODE_WITHOUT_CELL, token, "the table has no cells for mode {}", inQuotes(text));
            return std::nullopt;
        } else if (mode == MODE_TYPE::SPI && m_family.kind == schema::File::FAMILY) {
            m_findings.addText(SPI_MODE_ELSEWHERE, token, "in SPI mode only the tables of spi.acd are used");
            return std::nullopt;
        }
        return static_cast<std::size_t>(mode);
    }

    /// Can the family be configured in the mode? Unknown devices, which are of family "base", cannot in any.
    bool modeTakesFamily(std::size_t mode, const Token& token) {
        const auto& families = m_modes[mode].families;
        const bool isMissing =
            families && m_family.kind != schema::File::BASE && !families->contains(m_family.name);
        if (isMissing) {
            Finding& finding =
                m_findings.add(MODE_WITHOUT_FAMILY, token, "{} of base.acd does not list the family {}",
                               vocabulary::modes()[mode], inQuotes(m_family.name));
            finding.unlistedIn = vocabulary::modes()[mode];
            finding.reports = finding.restsOn = fact::inMode(m_family.name, finding.unlistedIn);
        }
        return !isMissing;
    }

    void checkModeOutput(std::size_t mode, const Token& token) {
        const auto& outputs = m_modes[mode].outputs;
        if (outputs && !outputs->contains(token.text)) {
            m_findings
                .add(MODE_WITHOUT_OUTPUT, token, "{} of base.acd does not list the output {}",
                     vocabulary::modes()[mode], inQuotes(token.text))
                .restsOn = fact::inMode(token.text, vocabulary::modes()[mode]);
        }
    }

    /// @return an output with a cell; nothing for any other
    std::optional<std::size_t> readOutput(const Token& token, const std::vector<Token>& fields) {
        const std::optional<std::size_t> found = position(schema::tableOutputs(), token.text, false);
        if (found || token.text.empty()) {
            return found;
        }
        if (position(schema::modeOutputs(), token.text, false)) {
            Finding& finding = m_findings.add(OUTPUT_WITHOUT_CELL, token,
                                              "the table has no cells for output {}", inQuotes(token.text));
            if (fields.size() > m_table.firstOutput + 1) {
                finding.fix = removing(token);
            }
        } else if (position(vocabulary::outputs(), token.text, false)) {
            m_findings.add(UNKNOWN_OUTPUT, token, "a database cannot give the output {}",
                           inQuotes(token.text));
        } else {
            m_findings.addUnknown(UNKNOWN_OUTPUT, token, token,
                                  m_findings.suggest(token.text, schema::tableOutputs(), fields),
                                  "unknown output {}", inQuotes(token.text));
        }
        return std::nullopt;
    }

    const schema::Table& m_table;
    const FamilyData& m_family;
    const std::vector<FamilyContext::ModeLists>& m_modes;
    Findings& m_findings;
    std::set<Row> m_rows; ///< of all records
    std::set<std::tuple<std::size_t, std::size_t, std::size_t>> m_cells;
};

void checkFamily(const FamilyData& family, const FamilyContext& context, FamilyResult& result) {
    family.forEachSection([&](const Section& section) {
        for (const schema::Table& table : schema::TABLES) {
            TableCheck(table, family, context, result.findings).check(section.items(table.key));
        }
    });
}

} // namespace

RuleSet tableRules() {
    return {"tables of operations and options",
            {&UNKNOWN_OPERATION, &UNKNOWN_OPTION, &UNREADABLE_OPTION, &UNKNOWN_MODE, &ACCIDENTAL_MODE,
             &UNKNOWN_OUTPUT, &OUTPUT_WITHOUT_CELL, &MODE_WITHOUT_CELL, &NO_OUTPUT, &CELL_TWICE,
             &SPI_MODE_ELSEWHERE, &MODE_WITHOUT_FAMILY, &MODE_WITHOUT_OUTPUT},
            checkFamily,
            nullptr};
}

} // namespace lint
