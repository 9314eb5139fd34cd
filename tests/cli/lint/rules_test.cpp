// Each rule by its bad database, and the documents by the rules.
#include "LintFixtures.h"

#include <gmock/gmock.h>

#include <algorithm>
#include <regex>
#include <set>
#include <sstream>

using testing::ElementsAre;
using testing::IsEmpty;

namespace {

const std::string SOURCE = TARVIK_SOURCE_DIRECTORY;

/// Those that are too large to be kept as files, which `LongDatabases` makes (the value of L111 takes gigabytes),
/// those that need two layers, and the one that needs a file that cannot be read.
const std::set<std::string> MADE_BY_TESTS{"F105", "L105", "L111", "L114", "R102", "R103"};

struct Rule {
    std::string code;
    std::string name;
    std::string level;
    std::string title;
    std::string explanation;
};

std::vector<Rule> allRules() {
    const nlohmann::json answer = nlohmann::json::parse(runLint({"--explain", "all", "--json"}).output);
    std::vector<Rule> all;
    for (const nlohmann::json& rule : answer.at("rules")) {
        all.push_back(
            {rule.at("code"), rule.at("name"), rule.at("level"), rule.at("title"), rule.at("explanation")});
    }
    return all;
}

std::string readFile(const std::string& path) {
    std::ifstream file(path, std::ios::binary);
    std::ostringstream text;
    text << file.rdbuf();
    return text.str();
}

/// With each run of blanks and line ends as one blank.
std::string onOneLine(const std::string& text) { return std::regex_replace(text, std::regex("\\s+"), " "); }

/// The finding lines of a text report, without the directory.
std::string findingLines(const ProcessResult& outcome, const std::string& directory) {
    std::istringstream lines(outcome.output);
    std::string found;
    for (std::string line; std::getline(lines, line);) {
        if (line.rfind(directory, 0) == 0) {
            found += line.substr(directory.size() + 1) + '\n';
        }
    }
    return found;
}

} // namespace

TEST(Rules, HaveCodesOfALetterAndThreeDigitsInOrder) {
    const std::vector<Rule> rules = allRules();
    EXPECT_GT(rules.size(), 70U);
    for (const Rule& rule : rules) {
        EXPECT_TRUE(std::regex_match(rule.code, std::regex("[A-Z][0-9]{3}"))) << rule.code;
    }
    const auto isNotBefore = [](const Rule& left, const Rule& right) { return left.code >= right.code; };
    EXPECT_EQ(std::adjacent_find(rules.begin(), rules.end(), isNotBefore), rules.end());
}

TEST(Rules, GiveExactlyTheirFindingInTheirBadDatabase) {
    for (const Rule& rule : allRules()) {
        if (MADE_BY_TESTS.count(rule.code) != 0) {
            continue;
        }
        const std::string directory = SOURCE + "/tests/data/bad/" + rule.code;
        const ProcessResult outcome = runLint({directory, "--strict"});
        const std::string found = findingLines(outcome, directory);
        EXPECT_EQ(outcome.status, 1) << rule.code;
        EXPECT_EQ(std::count(found.begin(), found.end(), '\n'), 1) << found;
        EXPECT_NE(found.find(": " + rule.level + ": "), std::string::npos) << found;
        EXPECT_NE(found.find(" [" + rule.code + "]\n"), std::string::npos) << rule.code << " gives " << found;
        EXPECT_EQ(found, readFile(directory + "/expected.txt"));
    }
}

TEST(Rules, HaveNoBadDatabaseWithoutARule) {
    std::set<std::string> known;
    for (const Rule& rule : allRules()) {
        known.insert(rule.code);
    }
    for (const auto& entry : std::filesystem::directory_iterator(SOURCE + "/tests/data/bad")) {
        EXPECT_EQ(known.count(entry.path().filename().string()), 1U) << entry.path();
    }
}

TEST(Rules, HaveDifferentNamesInWords) {
    std::set<std::string> names;
    for (const Rule& rule : allRules()) {
        EXPECT_TRUE(std::regex_match(rule.name, std::regex("[a-z0-9]+(-[a-z0-9]+)*"))) << rule.code;
        EXPECT_TRUE(names.insert(rule.name).second) << rule.name;
    }
}

TEST(Rules, StandInTheDocument) {
    const std::string document = onOneLine(readFile(SOURCE + "/docs/lint.md"));
    for (const Rule& rule : allRules()) {
        EXPECT_NE(document.find("### " + rule.code + " (" + rule.level + "): " + rule.title),
                  std::string::npos)
            << rule.code;
        EXPECT_NE(document.find(onOneLine(rule.explanation)), std::string::npos) << rule.code;
    }
}

TEST(Rules, StandInTheDocumentOnlyWhenTheyExist) {
    std::set<std::string> known;
    for (const Rule& rule : allRules()) {
        known.insert(rule.code);
    }
    const std::string document = readFile(SOURCE + "/docs/lint.md");
    const std::regex heading("### ([A-Z][0-9]{3})");
    for (std::sregex_iterator match(document.begin(), document.end(), heading), end; match != end; ++match) {
        EXPECT_EQ(known.count((*match)[1]), 1U) << (*match)[1];
    }
}

TEST(Rules, AreExplainedByCode) {
    const ProcessResult outcome = runLint({"--explain", "T105"});
    EXPECT_EQ(outcome.status, 0);
    EXPECT_EQ(outcome.output.rfind("accidental-mode (T105), warning: mode BS\n", 0), 0U);
    EXPECT_EQ(runLint({"--explain", "t105"}).output, outcome.output);
    EXPECT_EQ(runLint({"--explain", "accidental-mode"}).output, outcome.output);
    EXPECT_EQ(runLint({"--explain", "T999"}).status, 2);
}

TEST(LongDatabases, ListsAreReadUpTo32768Items) {
    std::string properties = "PROPERTY = P0,V";
    for (int i = 1; i <= 32767; ++i) {
        properties += ":P" + std::to_string(i) + ",V";
    }
    EXPECT_THAT(codes(withFamily(properties + "\n[KS50]\n")), IsEmpty());
    EXPECT_THAT(codes(withFamily(properties + ":Q,V\n[KS50]\n")), ElementsAre("F105"));
}

TEST(LongDatabases, LinesAreReadUpTo16MiB) {
    const std::string line = "PROPERTY = LONG,";
    const std::string rest((std::size_t{16} << 20) - line.size(), 'A');
    EXPECT_THAT(codes(withFamily(line + rest + "\n[KS50]\n")), IsEmpty());
    EXPECT_THAT(codes(withFamily(line + rest + "A\n[KS50]\n")), ElementsAre("L105"));
}

TEST(LongDatabases, ManyUnknownNamesTakeNoTimeWithoutBounds) {
    std::string base = "DEVICE_SUPPORTED = base,kestrel";
    for (int i = 0; i < 30000; ++i) {
        base += ",unknown" + std::to_string(i);
    }
    std::string devices;
    for (int i = 0; i < 3000; ++i) {
        devices += "[KS" + std::to_string(i) + "]\n";
    }
    EXPECT_EQ(
        codes({{"base.acd", base + "\nPROGRAM_OPTION_PACKAGE = base,kestrel\n"}, {"kestrel.acd", devices}},
              {"--select", "B101"})
            .size(),
        30000U);
}

TEST(Accepted, IsAnEmptyPropertyList) {
    EXPECT_THAT(codes(withFamily("PROPERTIES = NONE,0\n[KS50]\n")), IsEmpty());
}

TEST(Accepted, IsALongNameOfAProperty) {
    EXPECT_THAT(codes(withFamily("PROPERTY = A_PROPERTY_OF_MORE_THAN_15_BYTES,1\n[KS50]\n")), IsEmpty());
}

TEST(Accepted, AreAllModeKeysInThePropertyOfAnOperation) {
    EXPECT_THAT(
        codes(withFamily("PROPERTIES = PROGRAM,9,BS,SS,SM,BSFILE,DP770,SPI,KITECF,KITEMPM,PFF\n[KS50]\n")),
        IsEmpty());
}

TEST(Accepted, AreTheTablesOfAllFlashesInSpi) {
    Files files = cleanDatabase();
    files["base.acd"] += "DEVICE_SUPPORTED += ,spi\nPROGRAM_OPTION_PACKAGE += ,spi\n";
    files["spi.acd"] =
        "OPERATION = PROGRAM,SPI,USB2\nBSDL_OPERATION = BYPASS,USB2\n"
        "PROGRAM_OPTION = VERIFY,SPI,USB2\nPROPERTY = KIND,FLASH\nPROPERTIES = PROGRAM,1,SPI\n";
    EXPECT_THAT(codes(files), IsEmpty());
}

TEST(Accepted, IsAKeyThatALayerOnTopSetsAnew) {
    const DatabaseDirectory below(withFamily("PROPERTY = VENDOR,Korvel\n[KS50]\n"));
    const DatabaseDirectory above(Files{{"kestrel.acd", "PROPERTY = VENDOR,Site\n"}});
    EXPECT_EQ(runLint({above.path(), below.path(), "--strict"}).status, 0);
}

TEST(Accepted, AreOptionsOfADeviceThatIsListedByItsBareName) {
    Files files = withFamily("[KS50]\nPROGRAM_OPTION = VERIFY,Bscan,USB2\n");
    files["base.acd"] += "PROGRAM_OPTION_PACKAGE += ,KS50\n";
    EXPECT_THAT(codes(files), IsEmpty());
}

TEST(Accepted, IsWhatALayerOnTopAppendsInPlaceOfSomething) {
    const DatabaseDirectory below(withFamily("PROPERTY = VENDOR,Korvel\nPROPERTIES = LIST,1,A\n[KS50]\n"));
    const DatabaseDirectory above(
        Files{{"base.acd", "IDCODE += :KS50,0xX5104FB7\n"},
              {"kestrel.acd", "PROPERTY += :VENDOR,Site\nPROPERTIES += :LIST,1,B\n"}});
    EXPECT_EQ(runLint({above.path(), below.path(), "--strict"}).output, "");
}

TEST(Layers, HaveTheirFindingsInTheirOwnFiles) {
    const DatabaseDirectory below(withFamily("OPERATION = PROGRM,Bscan,USB2\n[KS50]\n"));
    const DatabaseDirectory above(Files{{"kestrel.acd", "OPERATION += :VERIFY,Bscan,USB\n[KS75]\n"}});
    const nlohmann::json report =
        nlohmann::json::parse(runLint({above.path(), below.path(), "--format", "json"}).output);
    std::vector<std::string> places;
    for (const nlohmann::json& finding : report.at("findings")) {
        places.push_back(finding.at("file").get<std::string>() + ' ' + finding.at("code").get<std::string>());
    }
    EXPECT_THAT(places, ElementsAre(below.path("kestrel.acd") + " T101", above.path("kestrel.acd") + " T106",
                                    above.path("kestrel.acd") + " D105"));
}

TEST(Layers, LookAtListsAsAWhole) {
    const DatabaseDirectory below(cleanDatabase());
    const DatabaseDirectory above(Files{{"base.acd", "DEVICE_SUPPORTED += ,sparow\n"}});
    const ProcessResult outcome = runLint({above.path(), below.path()});
    EXPECT_EQ(findingLines(outcome, above.path()),
              "base.acd:1:22: error: \"sparow\" is neither a family nor a device [B101]\n");
}

TEST(Layers, HaveNoFindingsInWhatIsReplaced) {
    const DatabaseDirectory below(withFamily("OPERATION = PROGRM,Bscan,USB2\n[KS50]\n"));
    const DatabaseDirectory above(Files{{"kestrel.acd", "OPERATION = PROGRAM,Bscan,USB2\n"}});
    EXPECT_EQ(runLint({above.path(), below.path(), "--strict"}).output, "");
}
