// What the linter tells, where, and how it ends.
#include "LintFixtures.h"

#include <gmock/gmock.h>

using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

TEST(Lint, IsSilentAboutACleanDatabase) {
    const ProcessResult outcome = lint(cleanDatabase(), {"--strict"});
    EXPECT_EQ(outcome.status, 0);
    EXPECT_EQ(outcome.output, "");
    EXPECT_EQ(outcome.error, "");
}

TEST(Lint, FindsNothingInTheDemonstration) {
    const ProcessResult outcome = runLint({TARVIK_SOURCE_DIRECTORY "/database", "--strict"});
    EXPECT_EQ(outcome.status, 0);
    EXPECT_EQ(outcome.output, "");
}

TEST(Lint, LooksAtTheDemonstrationWhenNoDirectoryIsGiven) {
    ProcessOptions start{{"lint", "--strict"}, {}, {}, {}};
    const ProcessResult outcome = runTool(start);
    EXPECT_EQ(outcome.status, 0);
    EXPECT_THAT(outcome.error, HasSubstr("built-in demonstration"));
}

TEST(Lint, ShowsPlaceLevelTextCodeAndTheLineWithACaret) {
    const DatabaseDirectory directory(withFamily("OPERATION = PROGRAM,Bscan,USB2: \\\n"
                                                 "            VERFIY,Bscan,USB2\n"
                                                 "[KS50]\n"));
    const ProcessResult outcome = runLint({directory.path()});
    EXPECT_EQ(outcome.output,
              directory.path("kestrel.acd") +
                  ":2:13: error: unknown operation \"VERFIY\"; did you mean \"VERIFY\"? [T101]\n"
                  "                VERFIY,Bscan,USB2\n"
                  "                ^~~~~~\n");
    EXPECT_EQ(outcome.error, "tarvik: 1 error, 0 warnings\nT101: 1\n");
    EXPECT_EQ(outcome.status, 1);
}

TEST(Lint, ShowsOfALongLineWhatIsAroundTheFinding) {
    const std::string many(500, 'A');
    const ProcessResult outcome = lint(withFamily("PROPERTY = LONG," + many + ":LONG,1\n[KS50]\n"));
    EXPECT_THAT(outcome.output, HasSubstr("    ..." + std::string(34, 'A') + ":LONG,1\n"));
    EXPECT_THAT(outcome.output, HasSubstr("\n    " + std::string(38, ' ') + "^~~~\n"));
}

TEST(Lint, KeepsTheCaretBelowTheColumnBehindTabsAndWideBytes) {
    const ProcessResult outcome = lint(withFamily("PROPERTY\t=\tT,K\xC3\xA9strel:T,2\n[KS50]\n"));
    EXPECT_THAT(outcome.output, HasSubstr("\n    PROPERTY = T,K\xC3\xA9strel:T,2\n"
                                          "                         ^\n"));
}

TEST(Lint, SendsNoControlBytesToATerminal) {
    const ProcessResult outcome = lint(withFamily("K\x1B[31m = 1\n[KS50]\n"));
    EXPECT_EQ(outcome.output.find('\x1B'), std::string::npos);
    EXPECT_THAT(outcome.output, HasSubstr("[K102]"));
}

TEST(Lint, OneBadLineNeverHidesTheNext) {
    EXPECT_THAT(codes(withFamily("no sense\n"
                                 "= 1\n"
                                 "OPERATION = NONSENSE,Bscan,USB2:PROGRAM,Nowhere,USB2:VERIFY,Bscan,USB3\n"
                                 "[KS50\n"
                                 "IGNORED = 1\n"
                                 "[KS50]\n"
                                 "PROPERTY = VENDOR\n")),
                ElementsAre("L101", "L102", "T101", "T104", "T106", "L107", "P103"));
}

TEST(Lint, TellsOnlyTheHeaderWhoseKeysAreDropped) {
    EXPECT_THAT(codes(withFamily("[KS50]\n[\nNONSENSE = 1\nNONSENSE = 2\nOPERATION = a, b,\n")),
                ElementsAre("L107"));
}

TEST(Lint, EndsWithOneForErrorsOnlyUnlessStrict) {
    const Files warning = withFamily("NONSENSE = 1\n[KS50]\n");
    EXPECT_EQ(lint(warning).status, 0);
    EXPECT_EQ(lint(warning, {"--strict"}).status, 1);
    EXPECT_EQ(lint(withFamily("NONSENSE\n[KS50]\n")).status, 1);
}

TEST(Lint, EndsWithTwoWhenADirectoryIsMissing) {
    const ProcessResult outcome = runLint({"/nowhere/at/all"});
    EXPECT_EQ(outcome.status, 2);
    EXPECT_THAT(outcome.error, HasSubstr("/nowhere/at/all"));
}

TEST(Lint, EndsWithTwoWhenThereIsNoBase) { EXPECT_EQ(lint(Files{{"kestrel.acd", "[KS50]\n"}}).status, 2); }

TEST(Lint, EndsWithTwoAndNamesAFileThatCantBeRead) {
    Files files = withFamily("OPERATION = VERFIY,Bscan,USB2\n[KS50]\n");
    files["base.acd"] =
        "DEVICE_SUPPORTED = base,kestrel,osprey\nPROGRAM_OPTION_PACKAGE = base,kestrel,osprey\n"
        "IDCODE = KS50,0xX4104FB7:OS200,0xX4204FB7\n";
    const DatabaseDirectory directory(files);
    std::filesystem::create_directory(directory.path("osprey.acd"));
    const ProcessResult outcome = runLint({directory.path()});
    EXPECT_EQ(outcome.status, 2);
    EXPECT_THAT(outcome.output, HasSubstr(directory.path("osprey.acd") +
                                          ":1:1: error: the file cannot be read: not a regular file [L114]"));
    // The findings of the other files are there; names are unknown perhaps only for the lack of the file.
    EXPECT_THAT(codes(files), ElementsAre("B101", "B102", "D104", "T101"));
    EXPECT_EQ(outcome.error, "tarvik: 2 errors, 0 warnings\nL114: 1, T101: 1\n");
    EXPECT_EQ(runLint({directory.path(), "--select", "T2"}).status, 2);
}

TEST(Lint, EndsWithTwoWhenTheBaseCantBeRead) {
    const DatabaseDirectory directory(Files{{"kestrel.acd", "[KS50]\n"}});
    std::filesystem::create_directory(directory.path("base.acd"));
    const ProcessResult outcome = runLint({directory.path()});
    EXPECT_EQ(outcome.status, 2);
    EXPECT_THAT(outcome.error, HasSubstr("base.acd"));
}

TEST(Lint, MergesLayersAsTheReadersDo) {
    const DatabaseDirectory below(cleanDatabase());
    const DatabaseDirectory above(Files{{"sparrow.acd", "[SW10]\n"},
                                        {"base.acd", "DEVICE_SUPPORTED += ,sparrow\n"
                                                     "PROGRAM_OPTION_PACKAGE += ,sparrow\n"
                                                     "IDCODE += :SW10,0xX9004FB7\n"}});
    EXPECT_EQ(runLint({above.path(), below.path(), "--strict"}).status, 0);
    EXPECT_EQ(runLint({below.path(), above.path(), "--strict"}).status, 1);
}

TEST(Lint, NamesTheFileOfTheLayerThatIsWrong) {
    const DatabaseDirectory below(cleanDatabase());
    const DatabaseDirectory above(Files{{"base.acd", "DEVICE_SUPPORTED += ,sparow\n"}});
    EXPECT_THAT(runLint({above.path(), below.path()}).output,
                HasSubstr(above.path("base.acd") + ":1:22: error: \"sparow\" is neither"));
}

TEST(Lint, SelectsByPrefix) {
    const Files files = withFamily("NONSENSE = 1\nOPERATION = PROGRM,BS,USB2\n[KS50]\n");
    EXPECT_THAT(codes(files), ElementsAre("K102", "T101", "T105"));
    EXPECT_THAT(codes(files, {"--select", "T"}), ElementsAre("T101", "T105"));
    EXPECT_THAT(codes(files, {"--select", "T105,K"}), ElementsAre("K102", "T105"));
    EXPECT_THAT(codes(files, {"--ignore", "T1"}), ElementsAre("K102"));
    EXPECT_THAT(codes(files, {"--select", "T", "--ignore", "T105"}), ElementsAre("T101"));
}

TEST(Lint, RefusesAPrefixThatNoCodeHas) {
    const ProcessResult outcome = lint(cleanDatabase(), {"--ignore", "Q1"});
    EXPECT_EQ(outcome.status, 2);
    EXPECT_THAT(outcome.error, HasSubstr("no code begins with \"Q1\""));
}

TEST(LintComments, IgnoreACodeInTheLineBelow) {
    EXPECT_THAT(codes(withFamily("# lint: ignore T105\nOPERATION = PROGRAM,BS,USB2\n[KS50]\n")), IsEmpty());
}

TEST(LintComments, SpeakForAllThatTheLineGoesOnWith) {
    EXPECT_THAT(codes(withFamily("# lint: ignore T105, T110\n# old\n"
                                 "OPERATION = PROGRAM,BS,USB2: \\\n PROGRAM,Bscan,USB2\n[KS50]\n")),
                IsEmpty());
}

TEST(LintComments, DoNotReachPastABlankLine) {
    EXPECT_THAT(codes(withFamily("# lint: ignore T105\n\nOPERATION = PROGRAM,BS,USB2\n[KS50]\n")),
                ElementsAre("X102", "T105"));
}

TEST(LintComments, LeaveOtherCodesAlone) {
    EXPECT_THAT(codes(withFamily("# lint: ignore T105\nOPERATION = PROGRAM,BS,USB\n[KS50]\n")),
                ElementsAre("T106"));
}

TEST(LintComments, AreNotUnusedWhenTheCodeIsNotSelected) {
    EXPECT_THAT(
        codes(withFamily("# lint: ignore T105\nOPERATION = PROGRAM,BS,USB2\n[KS50]\n"), {"--select", "X"}),
        IsEmpty());
}

TEST(LintComments, AreTextInsideAContinuation) {
    // " ignore T105" is a property of its own, without a value.
    EXPECT_THAT(codes(withFamily("PROPERTY = A,1:B,2\\\n# lint: ignore T105\n[KS50]\n")),
                ElementsAre("L112", "F101", "P103"));
}

TEST(LintComments, MustBeReadable) {
    EXPECT_THAT(codes(withFamily("# lint: skip T105\n[KS50]\n")), ElementsAre("X101"));
    EXPECT_THAT(codes(withFamily("# lint: ignore\n[KS50]\n")), ElementsAre("X101"));
    EXPECT_THAT(codes(withFamily("# lint: ignored T105\n[KS50]\n")), ElementsAre("X101"));
}

TEST(LintJson, HoldsAllThatTheTextDoes) {
    const DatabaseDirectory directory(withFamily("OPERATION = PROGRAM,BS,USB2\n[KS50]\n"));
    const nlohmann::json report =
        nlohmann::json::parse(runLint({directory.path(), "--format", "json"}).output);
    EXPECT_EQ(report.at("version"), 1);
    EXPECT_EQ(report.at("errors"), 0);
    EXPECT_EQ(report.at("warnings"), 1);
    const nlohmann::json& finding = report.at("findings").at(0);
    EXPECT_EQ(finding.at("file"), directory.path("kestrel.acd"));
    EXPECT_EQ(finding.at("line"), 1);
    EXPECT_EQ(finding.at("column"), 21);
    EXPECT_EQ(finding.at("length"), 2);
    EXPECT_EQ(finding.at("level"), "warning");
    EXPECT_EQ(finding.at("code"), "T105");
}

TEST(LintJson, IsTheSameByTheOptionOfTheTool) {
    const DatabaseDirectory directory(withFamily("OPERATION = PROGRAM,BS,USB2\n[KS50]\n"));
    EXPECT_EQ(runLint({directory.path(), "--format", "json"}).output,
              runLint({directory.path(), "--json"}).output);
}

namespace {

std::string fingerprint(const Files& files) {
    return nlohmann::json::parse(lint(files, {"--format", "json"}).output)["findings"][0]["fingerprint"];
}

} // namespace

TEST(LintFingerprints, OutliveLinesAddedAbove) {
    EXPECT_EQ(fingerprint(withFamily("OPERATION = PROGRAM,BS,USB2\n[KS50]\n")),
              fingerprint(withFamily("# new\n\nPROPERTY = A,1\nOPERATION = PROGRAM,BS,USB2\n[KS50]\n")));
    EXPECT_NE(fingerprint(withFamily("OPERATION = PROGRAM,BS,USB2\n[KS50]\n")),
              fingerprint(withFamily("OPERATION = VERIFY,BS,USB2\n[KS50]\n")));
}

TEST(LintFingerprints, TellEqualLinesApart) {
    const nlohmann::json findings = nlohmann::json::parse(
        lint(withFamily("no sense\nno sense\n[KS50]\n"), {"--format", "json"}).output)["findings"];
    EXPECT_NE(findings[0]["fingerprint"], findings[1]["fingerprint"]);
}

TEST(Lint, AnUnreadableDatabaseIsAnErrorObjectInJson) {
    const ProcessResult outcome = runLint({"/no/such/directory", "--format", "json"});
    EXPECT_EQ(outcome.status, 2);
    EXPECT_NE(nlohmann::json::parse(outcome.output).at("error").get<std::string>().find("/no/such/directory"),
              std::string::npos);
}

TEST(Lint, ALimitThatIsNoNumberIsAMistake) {
    for (const char* const limit : {"x", "-1", "1x", "99999999999999999999"}) {
        const ProcessResult outcome = lint(cleanDatabase(), {std::string("--max=") + limit});
        EXPECT_EQ(outcome.status, 2) << limit;
        EXPECT_NE(outcome.error.find("--max needs a number, not \"" + std::string(limit) + '"'),
                  std::string::npos)
            << outcome.error;
    }
}
