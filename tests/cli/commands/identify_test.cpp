// `identify`, and the search of `devices` by IDCODE.
#include "cli/support/DatabaseDirectory.h"
#include "cli/support/SmallDatabase.h"

#include <gmock/gmock.h>

namespace {

using nlohmann::json;
using testing::HasSubstr;
using Words = std::vector<std::string>;

/// Three devices, two of them with the same code in some versions.
class Identify : public testing::Test {
protected:
    [[nodiscard]] ProcessResult run(Words words, const std::string& input = {}) const {
        words.insert(words.begin(), {"--database", m_directory.path()});
        return runTool(ProcessOptions{std::move(words), input, {}, {}});
    }

private:
    DatabaseDirectory m_directory{
        {{"base.acd", "DEVICE_SUPPORTED = finch\n"
                      "IDCODE = FN10,0xX4104FB7:FN20,0x04108FB7:FN30,0x1410XFB7:FN40,none\n"},
         {"finch.acd", "[FN10]\n[FN20]\n[FN30]\n[FN40]\n[FN50]\n"}}};
};

TEST_F(Identify, KnownCodes) {
    const ProcessResult outcome =
        run({"identify", "0x24104fb7", "0x4108FB7", "00000100000100001000111110110111"});
    EXPECT_EQ(outcome.status, 0);
    EXPECT_EQ(outcome.error, "");
    EXPECT_EQ(outcome.output, "0x24104fb7                        FN10  finch  0xX4104FB7\n"
                              "0x4108FB7                         FN20  finch  0x04108FB7\n"
                              "00000100000100001000111110110111  FN20  finch  0x04108FB7\n");
}

TEST_F(Identify, CodeOfSeveralDevices) {
    EXPECT_EQ(run({"identify", "0x14104FB7"}).output, "0x14104FB7  FN10  finch  0xX4104FB7\n"
                                                      "0x14104FB7  FN30  finch  0x1410XFB7\n");
}

TEST_F(Identify, UnknownCodeGivesNearestDevicesAndManufacturer) {
    const ProcessResult outcome = run({"identify", "0x24104FB7", "0x24104FB5", "0x04103FB3"});
    EXPECT_EQ(outcome.status, 1);
    EXPECT_EQ(outcome.output,
              "0x24104FB7  FN10  finch  0xX4104FB7\n"
              "0x24104FB5  -     -      unknown: manufacturer 0x7DA, nearest FN10 (1 bit differs)\n"
              "0x04103FB3  -     -      unknown: manufacturer 0x7D9, nearest FN30 (2 bits differ)\n");
}

TEST_F(Identify, FewOfManyNearestDevicesAreNamed) {
    std::string codes;
    std::string sections;
    for (int device = 10; device < 17; ++device) {
        const std::string name = "FN" + std::to_string(device);
        codes += ":" + name + ",0x04104FB7";
        sections += "[" + name + "]\n";
    }
    const DatabaseDirectory database(
        {{"base.acd", "DEVICE_SUPPORTED = finch\nIDCODE = " + codes.substr(1) + "\n"},
         {"finch.acd", sections}});
    EXPECT_EQ(
        runTool({"--database", database.path(), "identify", "0x04104FB5"}).output,
        "0x04104FB5  -  -  unknown: manufacturer 0x7DA, nearest FN10, FN11, FN12, FN13, FN14, 2 more (1 bit "
        "differs)\n");
}

TEST_F(Identify, ReadsStandardInput) {
    const ProcessResult outcome = run({"identify", "-"}, "0x24104FB7\n\n0x04108FB7 0x24104FB7\n");
    EXPECT_EQ(outcome.status, 0);
    EXPECT_EQ(outcome.output, "0x24104FB7  FN10  finch  0xX4104FB7\n"
                              "0x04108FB7  FN20  finch  0x04108FB7\n"
                              "0x24104FB7  FN10  finch  0xX4104FB7\n");
}

TEST_F(Identify, OtherTextsAreMistakes) {
    const ProcessResult outcome = run({"identify", "0x24104FB7", "24104FB7"});
    EXPECT_EQ(outcome.status, 2);
    EXPECT_EQ(outcome.output, "");
    EXPECT_EQ(outcome.error,
              "tarvik: \"24104FB7\" is not an IDCODE: it takes 0x and up to 8 hexadecimal digits, or 32 "
              "binary digits\n");
    EXPECT_EQ(run({"identify", "-"}, "FN10\n").status, 2);
    EXPECT_EQ(run({"identify"}).status, 2);
}

TEST_F(Identify, Json) {
    EXPECT_EQ(json::parse(run({"identify", "--json", "0x24104FB7", "0x24104FB5"}).output), json::parse(R"({
        "version": 1, "messages": [], "codes": [
            {"code": "0x24104FB7", "manufacturer": "0x7DB",
             "devices": [{"name": "FN10", "family": "finch", "idcode": "0xX4104FB7"}]},
            {"code": "0x24104FB5", "manufacturer": "0x7DA", "devices": [],
             "nearest": [{"name": "FN10", "family": "finch", "idcode": "0xX4104FB7"}], "differingBits": 1}]})"));
}

TEST_F(Identify, DatabaseWithoutCodes) {
    const DatabaseDirectory::Files files{{"base.acd", "DEVICE_SUPPORTED = finch\n"}};
    const DatabaseDirectory empty(files);
    const ProcessResult outcome = runTool({"--database", empty.path(), "identify", "0x1"});
    EXPECT_EQ(outcome.status, 1);
    EXPECT_EQ(outcome.error, "tarvik: the database has no IDCODEs\n");
}

TEST_F(Identify, DevicesAreFoundByCode) {
    EXPECT_EQ(run({"devices", "--names", "0x14104FB7"}).output, "FN10\nFN30\n");
    EXPECT_EQ(run({"devices", "--names", "0xX4104fb7"}).output, "FN10\nFN30\n");
    EXPECT_EQ(run({"devices", "--names", "0x?4108*"}).output, "FN20\n");
    const ProcessResult none = run({"devices", "0x24108FB7"});
    EXPECT_EQ(none.status, 1);
    EXPECT_THAT(none.error, HasSubstr("no device matches \"0x24108FB7\""));
}

// Every device of the demonstration is found by its own code.
TEST(IdentifyDemonstration, EveryDevice) {
    Words codes{"identify", "--json"};
    std::vector<std::string> names;
    const json listed = json::parse(runTool({"devices", "--json"}).output);
    for (const json& device : listed["devices"]) {
        if (device["idcode"].is_string()) {
            codes.push_back(device["idcode"]);
            names.push_back(device["name"]);
        }
    }
    const json answer = json::parse(runTool(codes).output);
    ASSERT_EQ(answer["codes"].size(), names.size());
    for (std::size_t i = 0; i < names.size(); ++i) {
        ASSERT_EQ(answer["codes"][i]["devices"].size(), 1U);
        EXPECT_EQ(answer["codes"][i]["devices"][0]["name"], names[i]);
    }
}

} // namespace
