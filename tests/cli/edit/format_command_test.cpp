// The command `format`: what it writes, and what it leaves alone.
#include "cli/support/DatabaseDirectory.h"
#include "cli/support/ToolProcess.h"

#include <gmock/gmock.h>

#include <nlohmann/json.hpp>

using testing::HasSubstr;

namespace {

const DatabaseDirectory::Files UNTIDY{{"base.acd", "DEVICE_SUPPORTED=base,kestrel\n"
                                                   "PROGRAM_OPTION_PACKAGE = base,kestrel\n"},
                                      {"kestrel.acd", "# kestrel\n[KS50]\nPROPERTY=A,1\n"}};
const std::string BASE = "DEVICE_SUPPORTED       = base,kestrel\nPROGRAM_OPTION_PACKAGE = base,kestrel\n";
const std::string KESTREL = "# kestrel\n[KS50]\nPROPERTY = A,1\n";

std::string read(const std::string& path) {
    std::ostringstream text;
    text << std::ifstream(path, std::ios::binary).rdbuf();
    return text.str();
}

ProcessResult format(std::vector<std::string> arguments) {
    arguments.insert(arguments.begin(), "format");
    return runTool(arguments);
}

} // namespace

TEST(FormatCommand, WritesTheCanonicalFormAndListsTheFiles) {
    const DatabaseDirectory directory(UNTIDY);
    const ProcessResult outcome = format({directory.path()});
    EXPECT_EQ(outcome.status, 0) << outcome.error;
    EXPECT_EQ(outcome.output, directory.path("base.acd") + '\n' + directory.path("kestrel.acd") + '\n');
    EXPECT_EQ(read(directory.path("base.acd")), BASE);
    EXPECT_EQ(read(directory.path("kestrel.acd")), KESTREL);
    EXPECT_EQ(format({directory.path()}).output, "");
}

TEST(FormatCommand, ChecksWithoutWriting) {
    const DatabaseDirectory directory(UNTIDY);
    const ProcessResult outcome = format({"--check", directory.path()});
    EXPECT_EQ(outcome.status, 1);
    EXPECT_EQ(outcome.output, directory.path("base.acd") + '\n' + directory.path("kestrel.acd") + '\n');
    EXPECT_EQ(read(directory.path("base.acd")), UNTIDY.at("base.acd"));
    EXPECT_EQ(format({"--check", TARVIK_SOURCE_DIRECTORY "/database"}).status, 0);
}

TEST(FormatCommand, ShowsTheDifference) {
    const DatabaseDirectory directory(UNTIDY);
    const std::string path = directory.path("kestrel.acd");
    const ProcessResult outcome = format({"--diff", path});
    EXPECT_EQ(outcome.status, 0);
    EXPECT_EQ(outcome.output, "--- " + path + "\n+++ " + path +
                                  "\n@@ -1,3 +1,3 @@\n # kestrel\n [KS50]\n-PROPERTY=A,1\n+PROPERTY = A,1\n");
    EXPECT_EQ(read(path), UNTIDY.at("kestrel.acd"));
    EXPECT_EQ(format({"--diff", "--check", path}).status, 1);
}

TEST(FormatCommand, WritesSingleFiles) {
    const DatabaseDirectory directory(UNTIDY);
    EXPECT_EQ(format({directory.path("kestrel.acd")}).output, directory.path("kestrel.acd") + '\n');
    EXPECT_EQ(read(directory.path("base.acd")), UNTIDY.at("base.acd"));
    EXPECT_EQ(read(directory.path("kestrel.acd")), KESTREL);
}

TEST(FormatCommand, WritesALayerWithoutABase) {
    const DatabaseDirectory layer(DatabaseDirectory::Files{{"kestrel.acd", "[KS50]\nPROPERTY+=:A,1\n"}});
    EXPECT_EQ(format({layer.path()}).status, 0);
    EXPECT_EQ(read(layer.path("kestrel.acd")), "[KS50]\nPROPERTY += :A,1\n");
}

TEST(FormatCommand, WritesNothingWhenOneFileCannotBeRead) {
    const DatabaseDirectory directory(UNTIDY);
    std::filesystem::create_directory(directory.path("osprey.acd"));
    const ProcessResult outcome = format({directory.path()});
    EXPECT_EQ(outcome.status, 2);
    EXPECT_THAT(outcome.error, HasSubstr("osprey.acd"));
    EXPECT_EQ(read(directory.path("base.acd")), UNTIDY.at("base.acd"));
}

TEST(FormatCommand, NeedsADatabaseOfFiles) {
    const ProcessResult outcome = format({});
    EXPECT_EQ(outcome.status, 2);
    EXPECT_THAT(outcome.error, HasSubstr("no database given"));
    EXPECT_EQ(format({"/nowhere/at/all"}).status, 2);
}

TEST(FormatCommand, AnswersInJson) {
    const DatabaseDirectory directory(UNTIDY);
    const nlohmann::json answer =
        nlohmann::json::parse(format({"--check", "--json", directory.path()}).output);
    EXPECT_EQ(answer.at("files").size(), 2U);
    EXPECT_EQ(answer.at("written"), false);
}

TEST(FormatCommand, SortsWhatHasNoOrder) {
    const DatabaseDirectory directory(DatabaseDirectory::Files{
        {"base.acd", "DEVICE_SUPPORTED = kestrel,base\nPROGRAM_OPTION_PACKAGE = kestrel,base\n"
                     "BS = outs,USB2,PARALLEL:fams,kestrel\nIDCODE = KS100,0x00000003:KS50,0x00000001\n"},
        {"kestrel.acd",
         "# kestrel\n\nOPERATION = VERIFY,Bscan,USB2,PARALLEL:PROGRAM,Bscan,USB2\n"
         "PROPERTIES = VERIFY,1,BS:PROGRAM,1,BS\n# the large one\n[KS100]\n# below\n\n[KS50]\n"}});
    const ProcessResult outcome = format({"--sort", directory.path()});
    EXPECT_EQ(outcome.status, 0) << outcome.error;
    EXPECT_EQ(read(directory.path("base.acd")),
              "DEVICE_SUPPORTED       = base,kestrel\nPROGRAM_OPTION_PACKAGE = base,kestrel\n"
              "BS                     = outs,PARALLEL,USB2: \\\n"
              "                         fams,kestrel\n"
              "IDCODE                 = KS50,0x00000001:KS100,0x00000003\n");
    EXPECT_EQ(
        read(directory.path("kestrel.acd")),
        "# kestrel\n\nOPERATION  = PROGRAM,Bscan,USB2: \\\n             VERIFY,Bscan,PARALLEL,USB2\n"
        "PROPERTIES = VERIFY,1,BS: \\\n             PROGRAM,1,BS\n\n[KS50]\n\n# the large one\n[KS100]\n"
        "# below\n");
    EXPECT_EQ(format({"--sort", directory.path()}).output, "");
}

TEST(FormatCommand, SortsNothingWithoutAnswersToCompare) {
    const DatabaseDirectory layer(DatabaseDirectory::Files{{"kestrel.acd", "[KS50]\n\n[KS10]\n"}});
    const ProcessResult outcome = format({"--sort", layer.path()});
    EXPECT_EQ(outcome.status, 2);
    EXPECT_THAT(outcome.error, HasSubstr("name the directories of the layers below"));
    EXPECT_EQ(read(layer.path("kestrel.acd")), "[KS50]\n\n[KS10]\n");
}
