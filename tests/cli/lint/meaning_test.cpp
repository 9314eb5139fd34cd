// Rules about what a database means: what is nearly wrong, and what layers do on purpose.
#include "LintFixtures.h"

#include <gmock/gmock.h>

using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

namespace {

/// What the linter says of the second layer on top of the first.
std::vector<std::string> codesOfLayers(const Files& below, const Files& above) {
    const DatabaseDirectory bottom(below);
    const DatabaseDirectory top(above);
    const nlohmann::json report =
        nlohmann::json::parse(runLint({top.path(), bottom.path(), "--format", "json"}).output);
    std::vector<std::string> all;
    for (const nlohmann::json& finding : report.at("findings")) {
        all.push_back(finding.at("code").get<std::string>());
    }
    return all;
}

/// A family of that many devices, each with a property PINS.
Files family(int devices, const std::string& lastSection) {
    Files files = cleanDatabase();
    files["base.acd"] =
        "DEVICE_SUPPORTED = base,kestrel\nPROGRAM_OPTION_PACKAGE = base,kestrel\nIDCODE = KS0,0x00000001";
    files["kestrel.acd"] = "";
    for (int i = 0; i <= devices; ++i) {
        files["base.acd"] += ":KS" + std::to_string(i + 1) + ",0x" + std::to_string(1000000 + i) + "X";
        files["kestrel.acd"] += "[KS" + std::to_string(i) + "]\n";
        files["kestrel.acd"] += i < devices ? "PROPERTY = PINS," + std::to_string(i) + "\n" : lastSection;
    }
    files["kestrel.acd"] += "[KS" + std::to_string(devices + 1) + "]\nPROPERTY = PINS,1\n";
    return files;
}

Files withModes(const std::string& modes, const std::string& text) {
    Files files = withFamily(text);
    files["base.acd"] += modes;
    return files;
}

} // namespace

TEST(LayerRules, OneFindingStandsForAllThatALayerHides) {
    const Files below{{"base.acd", "DEVICE_SUPPORTED = base,kestrel\nPROGRAM_OPTION_PACKAGE = base,kestrel\n"
                                   "IDCODE = KS50,0xX4104FB7:KS100,0xX4108FB7\n"},
                      {"kestrel.acd", "[KS50]\n[KS100]\n[KS150]\n"}};
    const DatabaseDirectory bottom(below);
    const DatabaseDirectory top(Files{{"base.acd", "IDCODE = KS150,0xX410CFB7\n"}});
    const ProcessResult outcome = runLint({top.path(), bottom.path()});
    EXPECT_EQ(outcome.output.rfind(top.path("base.acd") + ":1:1: error: hides 2 names of " +
                                       bottom.path("base.acd") +
                                       ":3 (\"KS50\" and others); did you mean \"+=\"? [R102]\n",
                                   0),
              0U)
        << outcome.output;
    EXPECT_THAT(codesOfLayers(below, {{"base.acd", "IDCODE = KS150,0xX410CFB7\n"}}), ElementsAre("R102"));
}

TEST(LayerRules, AListThatIsWrittenAgainMayLoseNames) {
    const Files below{{"base.acd", "DEVICE_SUPPORTED = base,kestrel\nPROGRAM_OPTION_PACKAGE = base,kestrel\n"
                                   "IDCODE = KS50,0xX4104FB7\n"
                                   "NOT_SUPPORTED_PART_IN_MODE = SM_KS50_A,SM_KS50_B,SM_KS50_C\n"},
                      {"kestrel.acd", "[KS50]\n"}};
    EXPECT_THAT(codesOfLayers(below, {{"base.acd", "NOT_SUPPORTED_PART_IN_MODE = SM_KS50_A,SM_KS50_B\n"}}),
                IsEmpty());
    EXPECT_THAT(codesOfLayers(below, {{"base.acd", "NOT_SUPPORTED_PART_IN_MODE =\n"}}), IsEmpty());
}

TEST(LayerRules, ASectionsPropertiesAreReplacedAsAWhole) {
    const Files below = withFamily("PROPERTY = VENDOR,Korvel:KIND,FPGA\n[KS50]\nPROPERTY = PINS,140\n");
    EXPECT_THAT(codesOfLayers(below, {{"kestrel.acd", "PROPERTY = VENDOR,Site\n"}}), ElementsAre("R103"));
    EXPECT_THAT(codesOfLayers(below, {{"kestrel.acd", "PROPERTY = VENDOR,Site:KIND,CPLD\n"}}), IsEmpty());
    EXPECT_THAT(codesOfLayers(below, {{"kestrel.acd", "[KS50]\nPROPERTY = VENDOR,Site\n"}}),
                ElementsAre("R103"));
    EXPECT_THAT(codesOfLayers(below, {{"kestrel.acd", "[KS50]\nPROPERTIES = PACKAGES,1,TQ144\n"}}),
                IsEmpty());
}

TEST(LayerRules, AppendingNeedsASeparatorOnlyBehindAText) {
    const Files below = withFamily("[KS50]\nPROPERTY = PINS,140\n");
    EXPECT_THAT(codesOfLayers(below, {{"kestrel.acd", "[KS50]\nPROPERTY += VENDOR,Site\n"}}),
                ElementsAre("R104"));
    EXPECT_THAT(codesOfLayers(below, {{"kestrel.acd", "[KS50]\nPROPERTY += :VENDOR,Site\n"}}), IsEmpty());
    EXPECT_THAT(codesOfLayers(below, {{"kestrel.acd", "[KS50]\nPROPERTIES += PACKAGES,1,TQ144\n"}}),
                IsEmpty());
    EXPECT_THAT(codesOfLayers(below, {{"kestrel.acd", "[KS50]\nPROPERTY +=\n"}}), IsEmpty());
}

TEST(LayerRules, AnAppendedCodeFreesTheFormerOne) {
    const Files below{{"base.acd", "DEVICE_SUPPORTED = base,kestrel\nPROGRAM_OPTION_PACKAGE = base,kestrel\n"
                                   "IDCODE = KS50,0xX4104FB7:KS100,0xX4108FB7\n"},
                      {"kestrel.acd", "[KS50]\n[KS100]\n"}};
    EXPECT_THAT(codesOfLayers(below, {{"base.acd", "IDCODE += :KS50,0xX4FFCFB7:KS100,0xX4104FB7\n"}}),
                IsEmpty());
    EXPECT_THAT(codesOfLayers(below, {{"base.acd", "IDCODE += :KS100,0xX4104FB7\n"}}), ElementsAre("D103"));
}

TEST(AgreementRules, AreOffForFamiliesWithoutPropertiesOfOperations) {
    EXPECT_THAT(codes(withFamily("OPERATION = VERIFY,Bscan,USB2\nPROPERTIES = PACKAGES,1,TQ144\n[KS50]\n")),
                IsEmpty());
    EXPECT_THAT(codes(withFamily("PROPERTIES = VERIFY,1,SM\n[KS50]\n")), IsEmpty());
}

TEST(AgreementRules, AskEachDeviceForItsOwnAnswers) {
    Files files = withFamily("OPERATION = VERIFY,Bscan,USB2:VERIFY,Smap,USB2\nPROPERTIES = VERIFY,2,BS,SM\n"
                             "[KS50]\nOPERATION = VERIFY,Bscan,USB2\n");
    files["base.acd"] = "DEVICE_SUPPORTED = base,KS50,kestrel\nPROGRAM_OPTION_PACKAGE = base,KS50,kestrel\n"
                        "IDCODE = KS50,0xX4104FB7\n";
    EXPECT_THAT(codes(files), ElementsAre("P206"));
    files["kestrel.acd"] += "PROPERTIES = VERIFY,1,BS\n";
    EXPECT_THAT(codes(files), IsEmpty());
}

TEST(AgreementRules, AModeIsUsedByPropertiesToo) {
    const std::string modes = "BS = outputs,USB2:families,kestrel\nPFF = outputs,SVF:families,kestrel\n";
    EXPECT_THAT(
        codes(withModes(modes, "OPERATION = PROGRAM,Bscan,USB2\nPROPERTIES = PROGRAM,2,BS,PFF\n[KS50]\n")),
        IsEmpty());
    EXPECT_THAT(
        codes(withModes(modes, "OPERATION = PROGRAM,Bscan,USB2\nPROPERTIES = PROGRAM,1,BS\n[KS50]\n")),
        ElementsAre("M106"));
}

TEST(AgreementRules, OptionsForAllModesNeedOneModeThatAllowsThem) {
    const std::string text =
        "PROGRAM_OPTION = VERIFY,Bscan,USB2:ERASE,Smap,USB2\nPROPERTIES = PROGRAM,2,BS,SM:";
    EXPECT_THAT(codes(withFamily(text + "OP_PROGRAM,2,VERIFY,ERASE\n[KS50]\n")), IsEmpty());
    EXPECT_THAT(codes(withFamily(text + "OP_PROGRAM,1,UES\n[KS50]\n")), ElementsAre("P208"));
    EXPECT_THAT(codes(withFamily(text + "OP_PROGRAM_SM,0\n[KS50]\n")), IsEmpty());
}

TEST(ConsistencyRules, ANameIsRareOnlyBesideACommonOne) {
    EXPECT_THAT(codes(family(1, "PROPERTY = PNIS,1\n")), IsEmpty());
    EXPECT_THAT(codes(family(5, "PROPERTY = PNIS,1\n")), ElementsAre("C101"));
    EXPECT_THAT(codes(family(5, "PROPERTY = PINS,1:PNIS,1\n")), IsEmpty());
    EXPECT_THAT(codes(family(5, "PROPERTY = PINS,1:SPINS2,1\n")), IsEmpty());
}

TEST(ConsistencyRules, ADeviceWithoutAnyPropertiesLacksNone) {
    EXPECT_THAT(codes(family(5, "")), IsEmpty());
    EXPECT_THAT(codes(family(5, "PROPERTY = GRADE,5\n")), ElementsAre("C102"));
}

TEST(ConsistencyRules, AValueIsUnusualOnlyWhereMostAreAlike) {
    EXPECT_THAT(codes(family(5, "PROPERTY = PINS,many\n")), ElementsAre("C103"));
    EXPECT_THAT(codes(family(5, "PROPERTY = PINS,-1.5\n")), IsEmpty());
    EXPECT_THAT(codes(family(2, "PROPERTY = PINS,many\n")), IsEmpty());
}

TEST(ConsistencyRules, WordsOfAnotherScriptAreTexts) {
    EXPECT_THAT(codes(withFamily(
                    "[KS50]\nPROPERTY = TITLE,\u039a\u03b9\u03c1\u03ba\u03b9\u03bd\u03ad\u03b6\u03b9\n")),
                IsEmpty());
    EXPECT_THAT(codes(withFamily("[KS50]\nPROPERTY = TITLE,5 \u03bcs 50\u03a9\n")), IsEmpty());
    EXPECT_THAT(codes(withFamily("\ufeff[KS50]\n")), IsEmpty());
    EXPECT_THAT(codes(withFamily("[KS50]\nPROPERTY = TITLE,A\u200bB\n")), ElementsAre("C105"));
}

TEST(CommentsAfterValues, AreFoundWithoutBlanks) {
    for (const char* const value : {"140# in all", "140 #in all", "140#", "TRUE# yes", "many # of them"}) {
        EXPECT_THAT(codes(withFamily(std::string("[KS50]\nPROPERTY = PINS,") + value + "\n")),
                    ElementsAre("F106"))
            << value;
    }
    for (const char* const value : {"Kestrel #1", "Number# one"}) {
        EXPECT_THAT(codes(withFamily(std::string("[KS50]\nPROPERTY = TITLE,") + value + "\n")), IsEmpty())
            << value;
    }
}

TEST(ExcludedParts, InSpiModeAreThoseOfSpi) {
    Files files = cleanDatabase();
    files["base.acd"] += "NOT_SUPPORTED_PART_IN_MODE = SPI_spi_SO8\n";
    EXPECT_THAT(codes(files), IsEmpty());
}

TEST(Spi, IsAFamilyWithoutAFile) {
    Files files = cleanDatabase();
    files["base.acd"] += "DEVICE_SUPPORTED += ,spi\nPROGRAM_OPTION_PACKAGE += ,spi\n";
    EXPECT_THAT(codes(files), IsEmpty());
    EXPECT_THAT(codes(withModes("SPI = outputs,USB2:families,spi\n", "[KS50]\n")),
                ElementsAre("B105", "B106"));
}

TEST(Suggestions, AreNamesThatThePlaceLacks) {
    Files files = withFamily("[KS50]\n[KS51]\n");
    files["base.acd"] = "DEVICE_SUPPORTED = base,kestrel\nPROGRAM_OPTION_PACKAGE = base,kestrel\n"
                        "IDCODE = KS51,0xX4104FB7:KS150,0xX4108FB7\n";
    EXPECT_THAT(lint(files).output, HasSubstr("unknown device \"KS150\"; did you mean \"KS50\"? [D104]"));
    EXPECT_THAT(lint(withFamily("OPERATION = VERFIY,Bscan,USB2\n[KS50]\n")).output,
                HasSubstr("did you mean \"VERIFY\"?"));
}

TEST(Suggestions, AreOperationsThatTheModeLacks) {
    EXPECT_THAT(lint(withFamily("OPERATION = VERIFY,Bscan,USB2:VERIFI,Bscan,USB2\n[KS50]\n")).output,
                HasSubstr("unknown operation \"VERIFI\" [T101]"));
    EXPECT_THAT(lint(withFamily("OPERATION = VERIFY,Bscan,USB2:VERIFI,Smap,USB2\n[KS50]\n")).output,
                HasSubstr("did you mean \"VERIFY\"? [T101]"));
    EXPECT_THAT(lint(withFamily("OPERATION = VERIFY,Bscan,USB2,USB\n[KS50]\n")).output,
                HasSubstr("unknown output \"USB\" [T106]"));
    EXPECT_THAT(lint(withFamily("PROGRAM_OPTION = ERASE,Bscan,USB2:ERAS,Bscan,USB2\n[KS50]\n")).output,
                HasSubstr("unknown option \"ERAS\" [T102]"));
}

TEST(Suggestions, AreKeysThatTheSectionLacks) {
    EXPECT_THAT(lint(withFamily("PROPERTYS = A,1\n[KS50]\nPROPERTY = A,1\n")).output,
                HasSubstr("did you mean \"PROPERTY\"? [K102]"));
    EXPECT_THAT(lint(withFamily("PROPERTYS = A,1\nPROPERTY = A,1\n[KS50]\n")).output,
                HasSubstr("did you mean \"PROPERTIES\"? [K102]"));
    EXPECT_THAT(lint(withFamily("[KS50]\nPROPERTYS = A,1\nPROPERTY = A,1\n")).output,
                HasSubstr("did you mean \"PROPERTIES\"? [K102]"));
}

TEST(Suggestions, ArePropertiesOfOperationsThatTheSectionLacks) {
    const std::string text = "PROPERTIES = PROGRAM,1,BS:OP_PROGRM,1,VERIFY";
    EXPECT_THAT(lint(withFamily(text + "\n[KS50]\n")).output,
                HasSubstr("did you mean \"OP_PROGRAM\"? [P203]"));
    EXPECT_THAT(lint(withFamily(text + ":OP_PROGRAM,1,VERIFY\n[KS50]\n")).output,
                testing::Not(HasSubstr("did you mean \"OP_PROGRAM\"? [P203]")));
}

TEST(Suggestions, ArePartsThatAreNotExcluded) {
    Files files = withFamily("[KS50]\nPROPERTIES = PACKAGES,2,TQ144,TQ146\n");
    files["base.acd"] += "SM = outputs,USB2:families,kestrel\nSS = outputs,USB2:families,kestrel\n";
    const auto found = [&files](const std::string& parts) {
        Files all = files;
        all["base.acd"] += "NOT_SUPPORTED_PART_IN_MODE = " + parts + "\n";
        return lint(all, {"--select", "M2"}).output;
    };
    EXPECT_THAT(found("SM_KS50_TQ14"), HasSubstr("did you mean \"TQ144\"? [M204]"));
    EXPECT_THAT(found("SM_KS50_TQ14,SM_KS50_TQ144"), HasSubstr("did you mean \"TQ146\"? [M204]"));
    EXPECT_THAT(found("SM_KS60_TQ144"), HasSubstr("did you mean \"KS50\"? [M203]"));
    EXPECT_THAT(found("SM_KS60_TQ144,SM_KS50_TQ144"), HasSubstr("\"SM_KS60_TQ144\" [M203]"));
    EXPECT_THAT(found("SN_KS50_TQ144,SM_KS50_TQ144"), HasSubstr("did you mean \"SS\"? [M202]"));
}

TEST(Suggestions, AreFlashesThatTheClassLacks) {
    Files files = cleanDatabase();
    files["spi.acd"] = "DEVICE_FAMILY = NV1\nNV1_DEVICES = MRS1M,MRS2M\nST1_DEVICES = MRS1M,MRS3M\n";
    EXPECT_THAT(lint(files, {"--select", "S106"}).output, HasSubstr("did you mean \"MRS2M\"? [S106]"));
}

TEST(LintOptions, AFileIsLintedWithinItsDirectory) {
    const DatabaseDirectory directory(withFamily("NONSENSE = 1\nOPERATION = PROGRM,Bscan,USB2\n[KS60]\n"));
    const ProcessResult outcome = runLint({directory.path("kestrel.acd")});
    EXPECT_THAT(outcome.output, HasSubstr(directory.path("kestrel.acd") + ":2:13: error: unknown operation"));
    EXPECT_THAT(outcome.output, testing::Not(HasSubstr("base.acd:")));
}

TEST(LintOptions, MaxLimitsWhatIsShownAndCountsAll) {
    const DatabaseDirectory directory(
        withFamily("NONSENSE = 1\nNONSENS = 1\nOPERATION = PROGRM,Bscan,USB2\n[KS50]\n"));
    const ProcessResult outcome = runLint({directory.path(), "--max", "1"});
    EXPECT_THAT(outcome.output, HasSubstr(":1:1: warning"));
    EXPECT_THAT(outcome.output, testing::Not(HasSubstr("T101")));
    EXPECT_EQ(outcome.error, "tarvik: 1 error, 2 warnings; 1 shown\nK102: 2, T101: 1\n");
    EXPECT_EQ(outcome.status, 1);
}

TEST(LintOptions, ABaselineHidesFormerFindings) {
    const DatabaseDirectory directory(withFamily("OPERATION = PROGRM,Bscan,USB2\n[KS50]\n"));
    const DatabaseDirectory reports;
    std::ofstream(reports.path("old.json")) << runLint({directory.path(), "--format", "json"}).output;
    EXPECT_EQ(runLint({directory.path(), "--baseline", reports.path("old.json")}).status, 0);
    std::ofstream(directory.path("kestrel.acd"), std::ios::app) << "NONSENSE\n";
    EXPECT_THAT(runLint({directory.path(), "--baseline", reports.path("old.json")}).output,
                HasSubstr("[L101]"));
    EXPECT_EQ(runLint({directory.path(), "--baseline", reports.path("no.json")}).status, 2);
}

TEST(LintOptions, GithubShowsFindingsAsCommands) {
    const DatabaseDirectory directory(withFamily("OPERATION = PROGRM%,Bscan,USB2\n[KS50]\n"));
    EXPECT_EQ(runLint({directory.path(), "--format", "github"}).output,
              "::error file=" + directory.path("kestrel.acd") +
                  ",line=1,col=13,title=T101::unknown operation \"PROGRM%25\"; did you mean \"PROGRAM\"?\n");
}

TEST(Consequences, ANameThatIsMisspeltWhereItIsDefinedIsReportedThereOnly) {
    Files files = withFamily("[\u041aS50]\n");
    EXPECT_THAT(codes(files), ElementsAre("C105"));
    files["kestrel.acd"] = "[KS500]\n";
    EXPECT_THAT(codes(files), ElementsAre("D104")) << "and not that KS500 has no IDCODE";
}

TEST(Consequences, OfASelectedFindingAreLeftOutOnly) {
    const Files files = withModes("BS = outputs,USB2:families,spi\n",
                                  "OPERATION = PROGRAM,Bscan,USB2:VERIFY,Bscan,USB2\n[KS50]\n");
    EXPECT_THAT(codes(files, {"--select", "T112,M2"}), ElementsAre("T112"))
        << "the second record follows from it";
    const Files excluded =
        withModes("BS = outputs,USB2:families,spi\nNOT_SUPPORTED_PART_IN_MODE = BS_KS50_TQ144\n",
                  "OPERATION = PROGRAM,Bscan,USB2\n[KS50]\n");
    EXPECT_THAT(codes(excluded, {"--select", "T112,M205"}), ElementsAre("T112"));
    EXPECT_THAT(codes(excluded, {"--select", "M205"}), ElementsAre("M205"));
    EXPECT_THAT(codes(excluded, {"--ignore", "T112"}), testing::Contains("M205"));
}

TEST(Consequences, OfOneLineAreReportedWithoutTheOther) {
    const DatabaseDirectory directory(
        withModes("BS = outputs,USB2:families,spi\nNOT_SUPPORTED_PART_IN_MODE = BS_KS50_TQ144\n",
                  "OPERATION = PROGRAM,Bscan,USB2\n[KS50]\n"));
    EXPECT_THAT(runLint({directory.path("base.acd")}).output, HasSubstr("[M205]"));
    EXPECT_THAT(runLint({directory.path("base.acd")}).output, testing::Not(HasSubstr("[T112]")));
}

TEST(Consequences, ACommentThatIgnoresTheCauseShowsThem) {
    Files files = withModes("BS = outputs,USB2:families,spi\nNOT_SUPPORTED_PART_IN_MODE = BS_KS50_TQ144\n",
                            "# lint: ignore T112\nOPERATION = PROGRAM,Bscan,USB2\n[KS50]\n");
    EXPECT_THAT(codes(files, {"--select", "T112,M205"}), ElementsAre("M205"));
}

TEST(Consequences, OfAMisspeltNameInAListAreNotReported) {
    Files files = withFamily("[KS50]\n[KS51]\n");
    files["base.acd"] =
        "DEVICE_SUPPORTED = base,kestrel\nPROGRAM_OPTION_PACKAGE = base,kestrel\n"
        "IDCODE = KS5O,0xX4104FB7:KS51,0x14204FB7\nNOT_SUPPORTED_PART_IN_MODE = BS_KS50_TQ144\n";
    EXPECT_THAT(codes(files), ElementsAre("D104"));
}
