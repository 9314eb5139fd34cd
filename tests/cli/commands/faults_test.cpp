// Databases with faulty records: what the commands say about answers that an application would not get.
#include "cli/support/DatabaseDirectory.h"
#include "cli/support/ToolProcess.h"

#include <gmock/gmock.h>
#include <nlohmann/json.hpp>

namespace {

using nlohmann::json;
using testing::AllOf;
using testing::EndsWith;
using testing::HasSubstr;
using testing::Not;
using testing::StartsWith;
using Words = std::vector<std::string>;

/// A database of one family with the devices FN10 and FN20.
class FaultyDatabase {
public:
    explicit FaultyDatabase(const std::string& family)
        : m_directory({{"base.acd", "DEVICE_SUPPORTED = finch\n"
                                    "PROGRAM_OPTION_PACKAGE = finch\n"
                                    "BS = outputs,USB2:families,finch\n"},
                       {"finch.acd", family + "[FN10]\n[FN20]\n"}}) {}

    [[nodiscard]] std::string path() const { return m_directory.path(); }
    [[nodiscard]] std::string path(const std::string& name) const { return m_directory.path(name); }

    [[nodiscard]] ProcessResult run(Words words) const {
        words.insert(words.begin(), {"--database", m_directory.path()});
        return runTool(words);
    }

    [[nodiscard]] json answer(Words words) const {
        words.emplace_back("--json");
        return json::parse(run(words).output);
    }

private:
    DatabaseDirectory m_directory;
};

/// VERIFY is mistyped in the second of three records.
constexpr const char* TYPO = "OPERATION = PROGRAM,Bscan,USB2:VERFY,Bscan,USB2:ERASE,Bscan,USB2\n"
                             "PROPERTY = VENDOR,Korvel\n";
const Words OPERATIONS{"operations", "FN10", "--mode", "BS", "--output", "USB2"};
const Words VERIFY{"check", "FN10", "--mode", "BS", "--output", "USB2", "--operation", "VERIFY"};
const Words ERASE{"check", "FN10", "--mode", "BS", "--output", "USB2", "--operation", "ERASE"};

TEST(Faults, NoteSaysWhatAnApplicationGets) {
    const FaultyDatabase database(TYPO);
    const std::string place = database.path("finch.acd") + ":1:32: \"VERFY\" is faulty: ";
    const std::string effect = "an application gets OutOfRangeException (location 1631), and ";
    const ProcessResult operations = database.run(OPERATIONS);
    EXPECT_EQ(operations.status, 0);
    EXPECT_EQ(operations.output, "PROGRAM  Program\nERASE    Erase\n");
    EXPECT_THAT(operations.error,
                HasSubstr("tarvik: " + place + effect + "\"PROGRAM\" when it asks again\n"));
    EXPECT_THAT(database.run(ERASE).error, HasSubstr(place + effect + "\"no\" when it asks again\n"));
    EXPECT_THAT(database.run(VERIFY).error,
                HasSubstr(place + effect + "the same answer when it asks again\n"));
    EXPECT_THAT(database.run({"property", "FN10", "VENDOR"}).error,
                HasSubstr(place + effect + "the same answer"));
    EXPECT_THAT(database.run({"bsdl", "FN10", "--output", "SVF"}).error, HasSubstr(place));
    EXPECT_THAT(database.run({"options", "FN10", "--mode", "BS", "--output", "USB2"}).error,
                HasSubstr(place));
    EXPECT_THAT(database.run({"operation-options", "FN10", "PROGRAM", "--mode", "BS"}).error,
                HasSubstr(place));
    EXPECT_THAT(database.run({"show", "FN10"}).error,
                HasSubstr(place + effect.substr(0, effect.size() - 4) +
                          "and afterwards answers without this record and those after it\n"));
}

TEST(Faults, AnswerInJsonHasTheFault) {
    const FaultyDatabase database(TYPO);
    EXPECT_EQ(database.answer(OPERATIONS)["fault"], (json{{"exception", "OutOfRangeException"},
                                                          {"location", 1631},
                                                          {"again", "PROGRAM"},
                                                          {"file", database.path("finch.acd")},
                                                          {"line", 1},
                                                          {"column", 32},
                                                          {"fragment", "VERFY"}}));
}

TEST(Faults, AnswersThatReadNoFaultyRecordHaveNoNote) {
    const FaultyDatabase database(TYPO);
    EXPECT_EQ(database.run({"check", "FN10", "--mode", "BS"}).error, "");
    EXPECT_FALSE(database.answer({"check", "FN10", "--mode", "BS"}).contains("fault"));
    const FaultyDatabase sound("OPERATION = PROGRAM,Bscan,USB2\nPROPERTY = VENDOR,Korvel\n");
    EXPECT_EQ(sound.run(OPERATIONS).error, "");
    // An application gets an exception for a missing property in every database.
    EXPECT_FALSE(sound.answer({"property", "FN10", "PINS"}).contains("fault"));
}

TEST(Faults, WhyNamesTheRecordThatIsMistyped) {
    const FaultyDatabase database(TYPO);
    Words question = VERIFY;
    question.front() = "why";
    const ProcessResult outcome = database.run(question);
    EXPECT_EQ(outcome.status, 1);
    EXPECT_THAT(outcome.output, HasSubstr("  note      \"VERFY\" is not an operation; is VERIFY meant?\n"));
    EXPECT_THAT(outcome.output,
                HasSubstr("  fault     an application gets OutOfRangeException (location 1631)"));
    question.back() = "ERASE";
    EXPECT_THAT(database.run(question).output, Not(HasSubstr("meant?")));
    EXPECT_THAT(database.run(question).output, HasSubstr("and \"no\" when it asks again\n"));
}

TEST(Faults, WhyNamesTheMistypedWordsOfAMode) {
    const DatabaseDirectory database(
        {{"base.acd",
          "DEVICE_SUPPORTED = finch\nPROGRAM_OPTION_PACKAGE = finch\n"
          "BS = outputs,USB3,SVF:families,finhc,base\nSS = outputs,USB3,USB2:families,finhc,finch\n"},
         {"finch.acd", "[FN10]\n"}});
    const auto why = [&](const std::string& mode, const std::string& output) {
        return runTool({"--database", database.path(), "why", "FN10", "--mode", mode, "--output", output})
            .output;
    };
    const std::string output = "  note      \"USB3\" is not an output; is USB2 meant?\n            " +
                               database.path("base.acd") + ":3:14: USB3\n";
    const std::string family = "  note      \"finhc\" is not a family; is finch meant?\n            " +
                               database.path("base.acd") + ":3:32: finhc\n";
    EXPECT_THAT(why("BS", "USB2"), AllOf(HasSubstr(output), HasSubstr(family)));
    // Words that others than the one that is asked for are meant by.
    EXPECT_THAT(why("BS", "PARALLEL"), Not(HasSubstr("an output;")));
    EXPECT_THAT(why("SS", "USB2"), Not(HasSubstr("meant?")));
}

TEST(Faults, RecordThatLacksAFieldIsNamedWhole) {
    const FaultyDatabase database("OPERATION = PROGRAM,Bscan:ERASE,Bscan,USB2\n");
    EXPECT_THAT(
        database.run(ERASE).error,
        HasSubstr("finch.acd:1:13: \"PROGRAM,Bscan\" is faulty: an application gets DataMismatchException "
                  "(location 1649), and \"no\" when it asks again\n"));
}

TEST(Faults, FamilyWithoutATable) {
    const DatabaseDirectory database(
        {{"base.acd",
          "DEVICE_SUPPORTED = other\nPROGRAM_OPTION_PACKAGE = finch\nBS = outputs,USB2:families,finch\n"},
         {"finch.acd", "OPERATION = ERASE,Bscan,USB2\n[FN10]\n"}});
    Words words = ERASE;
    words.insert(words.begin(), {"--database", database.path()});
    EXPECT_THAT(runTool(words).error,
                HasSubstr("DEVICE_SUPPORTED lists neither the device nor its family: an application gets "
                          "OutOfRangeException (location 1999), and"));
}

/// The manager raises at an unknown option, even with exceptions off.
constexpr const char* UNKNOWN_OPTION = "OPERATION = ERASE,Bscan,USB2\nPROGRAM_OPTION = NONSENSE,Bscan,USB2\n";

TEST(Faults, CommandsThatHaveNoAnswerGiveThePlace) {
    const FaultyDatabase database(UNKNOWN_OPTION);
    for (const Words& words :
         {OPERATIONS, ERASE, Words{"show", "FN10"}, Words{"property", "FN10", "VENDOR"}}) {
        const ProcessResult outcome = database.run(words);
        EXPECT_EQ(outcome.status, 2);
        EXPECT_EQ(outcome.output, "");
        EXPECT_THAT(outcome.error, HasSubstr(database.path("finch.acd") + ":2:18: "));
    }
    Words question = ERASE;
    question.front() = "why";
    EXPECT_THAT(database.run(question).output, HasSubstr(database.path("finch.acd") + ":2:18: NONSENSE\n"));
}

TEST(Faults, PackageInANameIsTakenOffBeforeTheFault) {
    const FaultyDatabase database(UNKNOWN_OPTION);
    const ProcessResult outcome = database.run({"check", "FN10_P48", "--mode", "BS", "--output", "USB2"});
    EXPECT_EQ(outcome.status, 0);
    EXPECT_EQ(outcome.output, "yes: FN10 in package P48 in mode BS through USB2\n");
}

TEST(Faults, RecordThatEndsTheStartUpIsNamed) {
    const DatabaseDirectory database(
        {{"base.acd", "DEVICE_SUPPORTED = base,spi\nPROGRAM_OPTION_PACKAGE = base,spi\n"},
         {"spi.acd",
          "DEVICE_FAMILY = AT1\nAT1_DEVICES = OV1\nPROGRAM_OPTION = ERASE,Bscan,USB2:NOSUCH,Bscan,USB2\n"}});
    const std::string note =
        "tarvik: " + database.path("spi.acd") + ":3:35: \"NOSUCH\" ends the start-up, in applications, too";
    for (const Words& words :
         {Words{"families"}, Words{"which", "--operation", "ERASE"}, Words{"spi", "OV1"},
          Words{"why", "OV1", "--mode", "SPI", "--output", "USB2", "--option", "ERASE"}}) {
        Words all{"--database", database.path()};
        all.insert(all.end(), words.begin(), words.end());
        EXPECT_THAT(runTool(all).error, HasSubstr(note)) << words.front();
    }
}

TEST(Faults, SurveysSayHowManyDevicesHaveNoAnswer) {
    const FaultyDatabase database(UNKNOWN_OPTION);
    const std::string place = database.path("finch.acd") + ":2:18: \"NONSENSE\" is faulty";
    const std::string note = "tarvik: no answer for 2 devices, the first FN10: see tarvik show FN10\n";
    for (const Words& words :
         {Words{"which", "--operation", "ERASE"}, Words{"which", "--property", "VENDOR=Korvel"},
          Words{"report", "--file", "-"}, Words{"report", "--file", database.path("report.html")}}) {
        const ProcessResult outcome = database.run(words);
        EXPECT_EQ(outcome.status, 2);
        EXPECT_THAT(outcome.error, AllOf(HasSubstr(place), EndsWith(note)));
    }
    EXPECT_EQ(database.answer({"report", "--file", database.path("report.html")})["faults"],
              (json{"FN10", "FN20"}));
    EXPECT_EQ(database.answer({"which", "--operation", "ERASE"})["faults"], (json{"FN10", "FN20"}));
}

TEST(Faults, SurveysSayWhatAnApplicationGets) {
    const FaultyDatabase database(TYPO);
    const FaultyDatabase sound("OPERATION = ERASE,Bscan,USB2\n");
    const std::string note = database.path("finch.acd") +
                             ":1:32: \"VERFY\" is faulty: an application gets OutOfRangeException (location "
                             "1631), and afterwards answers without this record and those after it";
    json fault{{"exception", "OutOfRangeException"},
               {"location", 1631},
               {"file", database.path("finch.acd")},
               {"line", 1},
               {"column", 32},
               {"fragment", "VERFY"},
               {"note", note}};
    for (const Words& words :
         {Words{"which", "--operation", "ERASE"}, Words{"which", "--property", "VENDOR=Korvel"},
          Words{"report", "--file", database.path("report.html")}}) {
        const ProcessResult outcome = database.run(words);
        EXPECT_EQ(outcome.status, 0);
        EXPECT_THAT(outcome.error, StartsWith("tarvik: " + note + "\n"));
        EXPECT_EQ(database.answer(words)["applicationFaults"], json::array({fault}));
    }
    const Words diff{"diff", sound.path(), database.path(), "--json"};
    EXPECT_THAT(runTool({diff.begin(), diff.end() - 1}).error, StartsWith("tarvik: " + note + "\n"));
    fault["database"] = "new";
    EXPECT_EQ(json::parse(runTool(diff).output)["applicationFaults"], json::array({fault}));
}

TEST(Faults, SurveysSayWhatADeviceWithoutATableGets) {
    const DatabaseDirectory database(
        {{"base.acd", "DEVICE_SUPPORTED = other\nPROGRAM_OPTION_PACKAGE = finch\n"},
         {"finch.acd", "OPERATION = ERASE,Bscan,USB2\nPROPERTY = VENDOR,Korvel\n[FN10]\n[FN20]\n[FN30]\n"}});
    const ProcessResult outcome =
        runTool({"--database", database.path(), "which", "--property", "VENDOR=Korvel"});
    EXPECT_THAT(outcome.error,
                StartsWith("tarvik: FN10 and 2 more: DEVICE_SUPPORTED lists neither the device nor "
                           "its family: an application gets OutOfRangeException (location 1999)"));
}

TEST(Faults, SurveysShowTheFirstFaultsOfMany) {
    std::string sections;
    std::string names = "finch";
    for (int device = 1; device <= 8; ++device) {
        const std::string number = std::to_string(device);
        sections += "[FN" + number + "]\nOPERATION = WRONG" + number + ",Bscan,USB2\n";
        names += ",FN" + number;
    }
    const DatabaseDirectory database(
        {{"base.acd", "DEVICE_SUPPORTED = " + names + "\nPROGRAM_OPTION_PACKAGE = finch\n"},
         {"finch.acd", sections}});
    Words words{"--database", database.path(), "which", "--operation", "ERASE"};
    const std::string notes = runTool(words).error;
    EXPECT_THAT(notes, HasSubstr("\"WRONG5\" is faulty"));
    EXPECT_THAT(notes, Not(HasSubstr("\"WRONG6\" is faulty")));
    EXPECT_THAT(notes, HasSubstr("tarvik: 3 more such faults: see tarvik lint\n"));
    words.emplace_back("--json");
    EXPECT_EQ(json::parse(runTool(words).output)["applicationFaults"].size(), 8U);
}

TEST(Faults, ComparisonNamesTheFileThatCannotBeRead) {
    const FaultyDatabase sound("");
    const DatabaseDirectory unreadable({{"base.acd", "DEVICE_SUPPORTED = finch\n"}, {"spi.acd", ""}});
    std::filesystem::create_directory(unreadable.path("finch.acd"));
    const ProcessResult outcome = runTool({"diff", sound.path(), unreadable.path()});
    EXPECT_EQ(outcome.status, 2);
    EXPECT_THAT(outcome.error, HasSubstr("tarvik: " + unreadable.path("finch.acd") + ": can't be read: "));
}

TEST(Faults, SurveysOfASoundDatabase) {
    const FaultyDatabase database("OPERATION = ERASE,Bscan,USB2\n");
    const ProcessResult report = database.run({"report", "--file", database.path("report.html")});
    EXPECT_EQ(report.status, 0);
    EXPECT_EQ(report.error, "");
    EXPECT_EQ(database.run({"which", "--operation", "ERASE"}).status, 0);
    EXPECT_FALSE(database.answer({"which", "--operation", "ERASE"}).contains("applicationFaults"));
    EXPECT_EQ(runTool({"diff", database.path(), database.path()}).error, "");
}

} // namespace
