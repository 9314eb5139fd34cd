// What the steps of an explanation say: the record that decides, and the oddities on the way.
#include "StepsFixtures.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace {

using namespace TARVIKNS;
using explanation::Conclusion;
using explanation::Question;
using testing::HasSubstr;
using Kind = Question::Kind;

TEST(WhySteps, TheDecidingRecordIsNamedWithItsPlace) {
    const Databases databases(family("# first\nOPERATION = ERASE,Bscan,SVF:PROGRAM,Bscan,SVF,USB2"));
    const explanation::Explanation found = explained(programming("D1", MODE_TYPE::BS, OUTPUT_TYPE::USB2));
    EXPECT_EQ(found.verdict, Conclusion::YES);
    EXPECT_EQ(place(stepAbout(found.steps, "record")), "fam.acd:2:29: PROGRAM,Bscan,SVF,USB2");
    EXPECT_EQ(place(stepAbout(found.steps, "table")), "fam.acd:2:13: ERASE,Bscan,SVF");
    EXPECT_EQ(stepAbout(found.steps, "family").text, "fam: section [D1] of fam.acd");
}

TEST(WhySteps, APackageIsTakenOffTheName) {
    const Databases databases(family("OPERATION = PROGRAM,Bscan,USB2"));
    const explanation::Explanation found = explained(programming("D1_PQ", MODE_TYPE::BS, OUTPUT_TYPE::USB2));
    EXPECT_EQ(stepAbout(found.steps, "name").text, "\"D1_PQ\" is treated as \"D1\", without its package");
}

TEST(WhySteps, UnknownModeTextIsReadAsBoundaryScan) {
    const Databases databases(family("OPERATION = PROGRAM,Parallel,USB2"));
    const explanation::Explanation found = explained(programming("D1", MODE_TYPE::BS, OUTPUT_TYPE::USB2));
    EXPECT_EQ(found.verdict, Conclusion::YES);
    EXPECT_EQ(stepAbout(found.steps, "note").text,
              "\"Parallel\" is not a mode, and is read as Boundary Scan");
}

TEST(WhySteps, BoundaryScanByItsKeyIsNoOddity) {
    const Databases databases(family("OPERATION = PROGRAM,BS,USB2"));
    const explanation::Explanation found = explained(programming("D1", MODE_TYPE::BS, OUTPUT_TYPE::USB2));
    EXPECT_EQ(stepAbout(found.steps, "note").text, "");
}

Question optionsOf(const std::string& device, MODE_TYPE mode) {
    Question question = about(Kind::OPERATION_OPTIONS, device);
    question.mode = mode;
    question.operation = OP_TYPE::PROGRAM;
    return question;
}

// Options that the device or family has for all modes take precedence over those for one mode.
TEST(WhySteps, OptionsOfAnOperation) {
    const Databases databases(
        Files{{"base.acd", "DEVICE_SUPPORTED = fam\n"},
              {"fam.acd", "PROPERTIES = PROGRAM,2,BS,SM:OP_PROGRAM_BS,1,ERASE:OP_PROGRAM_SM,0\n"
                          "[D1]\n"
                          "[D2]\n"
                          "PROPERTIES = OP_PROGRAM,1,VERIFY\n"}});
    const explanation::Explanation forMode = explained(optionsOf("D1", MODE_TYPE::BS));
    EXPECT_EQ(forMode.verdict, Conclusion::YES);
    EXPECT_EQ(catalogue::asText(forMode.decidingRecord()->origin), "fam.acd:1:30");
    EXPECT_EQ(forMode.steps.back().text, "OP_PROGRAM_BS of the family is ERASE");
    const explanation::Explanation forAll = explained(optionsOf("D2", MODE_TYPE::BS));
    EXPECT_EQ(forAll.steps.back().text, "OP_PROGRAM of the device is VERIFY");
    const explanation::Explanation empty = explained(optionsOf("D1", MODE_TYPE::SM));
    EXPECT_EQ(empty.verdict, Conclusion::NO);
    EXPECT_EQ(empty.steps.back().text,
              "neither \"D1\" nor its family has a property OP_PROGRAM or OP_PROGRAM_SM with a value");
    const explanation::Explanation unlisted = explained(optionsOf("D1", MODE_TYPE::SS));
    EXPECT_EQ(unlisted.steps.back().text, "PROGRAM of the family is BS, SM, not SS");
    Question other = optionsOf("D2", MODE_TYPE::BS);
    other.value = "ERASE";
    EXPECT_EQ(explained(other).steps.back().text, "OP_PROGRAM of the device is VERIFY, not ERASE");
}

TEST(WhySteps, MultibootArrangement) {
    const Databases databases(
        Files{{"base.acd", "DEVICE_SUPPORTED = spi\n"},
              {"spi.acd", "DEVICE_FAMILY = ST1\nST1_DEVICES = FLA,FLB\nTYPE_MB_SPI_NONE_LEAD = FLB,FLA\n"}});
    Question question = about(Kind::MULTIBOOT, "FLA");
    question.multibootType = "TYPE_MB_SPI";
    question.width = "NONE";
    question.isLead = true;
    const explanation::Explanation yes = explained(question);
    EXPECT_EQ(yes.verdict, Conclusion::YES);
    EXPECT_EQ(place(stepAbout(yes.steps, "record")), "spi.acd:3:29: FLA");
    question.isLead = false;
    EXPECT_EQ(explained(question).steps.back().text, "spi.acd has no list TYPE_MB_SPI_NONE_CHAIN");
    EXPECT_EQ(explanation::alternatives(question).front().text, "yes as lead device of TYPE_MB_SPI NONE");
    question.width = "SERIAL";
    EXPECT_EQ(explained(question).steps.back().text, "there is no arrangement TYPE_MB_SPI_SERIAL_CHAIN");
    question = about(Kind::MULTIBOOT, "D1");
    question.multibootType = "TYPE_MB_SPI";
    question.width = "NONE";
    question.isLead = true;
    EXPECT_EQ(place(explained(question).steps.back()), "spi.acd:3:25: FLB");
}

TEST(WhySteps, CompleteQuestionIsExplainedPartByPart) {
    const Databases databases(family("OPERATION = PROGRAM,Bscan,USB2", "BS = outs,USB2:fams,other\n"));
    Question question = programming("D1", MODE_TYPE::BS, OUTPUT_TYPE::USB2);
    question.kind = Kind::COMPLETE;
    question.package = "PQ";
    const explanation::Explanation found = explained(question);
    EXPECT_EQ(found.verdict, Conclusion::NO);
    std::vector<std::string> parts;
    for (const explanation::Step& step : found.steps) {
        if (step.topic == "part") {
            parts.push_back(step.text);
        }
    }
    EXPECT_EQ(parts, (std::vector<std::string>{"yes: mode BS through USB2", "no: D1 in package PQ in mode BS",
                                               "yes: PROGRAM of D1 in mode BS through USB2"}));
}

TEST(WhySteps, PromFileFormatterAcceptsEveryOutput) {
    const Databases databases(family(""));
    Question question = about(Kind::OUTPUT, "");
    question.mode = MODE_TYPE::PFF;
    question.output = OUTPUT_TYPE::NULLCABLE;
    const explanation::Explanation found = explained(question);
    EXPECT_EQ(found.verdict, Conclusion::YES);
    EXPECT_THAT(stepAbout(found.steps, "rule").text, HasSubstr("accepts every output"));
}

TEST(WhySteps, AnOutputWithoutACellAllowsNothing) {
    const Databases databases(family("OPERATION = PROGRAM,Bscan,EXPRESSSVF"));
    const explanation::Explanation found =
        explained(programming("D1", MODE_TYPE::BS, OUTPUT_TYPE::EXPRESSSVF));
    EXPECT_EQ(found.verdict, Conclusion::NO);
    EXPECT_THAT(stepAbout(found.steps, "rule").text, HasSubstr("EXPRESSSVF has none"));
}

TEST(WhySteps, AWordWithoutACellIsNotedBesideANo) {
    const Databases databases(family("OPERATION = PROGRAM,Bscan,EXPRESSSVF,usb2"));
    const explanation::Explanation found = explained(programming("D1", MODE_TYPE::BS, OUTPUT_TYPE::USB2));
    ASSERT_EQ(found.steps.size(), 5U);
    EXPECT_EQ(found.steps[2].text, "the one record for PROGRAM does not allow it in mode BS through USB2");
    EXPECT_EQ(found.steps[3].text, "EXPRESSSVF has no cell in the tables, so its word allows nothing");
    EXPECT_EQ(found.steps[4].text, "\"usb2\" is not an output, and allows nothing");
    EXPECT_EQ(place(found.steps[4]), "fam.acd:1:38: usb2");
}

TEST(WhySteps, UnknownOutputWordIsReadAsNone) {
    const Databases databases(family("", "BS = outs,usb2:fams,fam\n"));
    Question question = about(Kind::OUTPUT, "");
    question.output = OUTPUT_TYPE::NONE;
    const explanation::Explanation found = explained(question);
    EXPECT_EQ(found.verdict, Conclusion::YES);
    EXPECT_EQ(place(stepAbout(found.steps, "record")), "base.acd:3:11: usb2");
    EXPECT_THAT(stepAbout(found.steps, "note").text, HasSubstr("\"usb2\" is not an output"));
}

TEST(WhySteps, TheExcludedPartIsNamed) {
    const Databases databases(
        family("", "SS = outs:fams,fam\nNOT_SUPPORTED_PART_IN_MODE = SM_D1_PQ,SS_D1_PQ\n"));
    Question question = about(Kind::DEVICE, "D1");
    question.mode = MODE_TYPE::SS;
    question.package = "PQ";
    const explanation::Explanation found = explained(question);
    EXPECT_EQ(found.verdict, Conclusion::NO);
    EXPECT_EQ(place(stepAbout(found.steps, "record")), "base.acd:4:39: SS_D1_PQ");
}

TEST(WhySteps, AFamilyThatTheModeLacksIsToldWithThoseItHas) {
    const Databases databases(family("", "SS = outs:fams,one,two\n"));
    Question question = about(Kind::DEVICE, "D1");
    question.mode = MODE_TYPE::SS;
    const explanation::Explanation found = explained(question);
    EXPECT_EQ(stepAbout(found.steps, "absent").text, "mode SS takes the families one, two, not fam");
    EXPECT_EQ(place(stepAbout(found.steps, "absent")), "base.acd:3:11: fams,one,two");
}

TEST(WhySteps, ATableOfItsOwnIsNotFoundByANameWithPackage) {
    Files files = family("");
    files["base.acd"] = "DEVICE_SUPPORTED = D1,fam\n";
    files["fam.acd"] = "[D1]\nOPERATION = PROGRAM,Bscan,USB2\n";
    const Databases databases(std::move(files));
    EXPECT_EQ(explained(programming("D1", MODE_TYPE::BS, OUTPUT_TYPE::USB2)).verdict, Conclusion::YES);
    const explanation::Explanation found = explained(programming("D1_PQ", MODE_TYPE::BS, OUTPUT_TYPE::USB2));
    EXPECT_EQ(found.verdict, Conclusion::NO);
    EXPECT_THAT(stepAbout(found.steps, "absent").text, HasSubstr("the whole name \"D1_PQ\""));
}

TEST(WhySteps, AnUnknownOptionIsAFault) {
    const Databases databases(family("PROGRAM_OPTION = OTP,Bscan,USB2"));
    Question question = about(Kind::OPTION, "D1");
    const explanation::Explanation found = explained(question);
    EXPECT_EQ(found.verdict, Conclusion::FAULT);
    EXPECT_EQ(place(stepAbout(found.steps, "fault")), "fam.acd:1:18: OTP");
    EXPECT_EQ(explanation::ask(Databases::freshManager(), question), Conclusion::FAULT);
}

TEST(WhySteps, AFlashGoesBeforeItsSection) {
    Files files = family("");
    files["spi.acd"] = "DEVICE_FAMILY = AT1\nAT1_DEVICES = D1\nAT1_PROPERTY = VENDOR,Orveth\n";
    const Databases databases(std::move(files));
    Question question = about(Kind::PROPERTY, "D1");
    question.property = "VENDOR";
    const explanation::Explanation found = explained(question);
    EXPECT_EQ(found.verdict, Conclusion::YES);
    EXPECT_EQ(stepAbout(found.steps, "family").text,
              "\"D1\" is listed as a flash: family spi, before what fam.acd says");
    EXPECT_EQ(place(stepAbout(found.steps, "table")), "spi.acd:2:15: D1");
    EXPECT_EQ(place(stepAbout(found.steps, "record")), "spi.acd:3:16: VENDOR,Orveth");
}

TEST(WhySteps, APropertyOfTheFamilyIsToldAsSuch) {
    const Databases databases(family("PROPERTIES = COLOURS,2,red,blue"));
    Question question = about(Kind::PROPERTY, "D1");
    question.property = "COLOURS";
    question.value = "green";
    const explanation::Explanation found = explained(question);
    EXPECT_EQ(stepAbout(found.steps, "absent").text, "COLOURS of the family is blue, red, not green");
}

TEST(WhySteps, ANoLeadsToTheKeyThatWasConsulted) {
    const Databases databases(family("# first\nOPERATION = ERASE,Bscan,USB2:VERIFY,Bscan,USB2"));
    const explanation::Step absent =
        stepAbout(explained(programming("D1", MODE_TYPE::BS, OUTPUT_TYPE::USB2)).steps, "absent");
    EXPECT_EQ(absent.text, "no record of fam names PROGRAM");
    EXPECT_EQ(place(absent), "fam.acd:2:13: ERASE,Bscan,USB2");
}

TEST(WhySteps, AMissingKeyIsNamed) {
    const Databases databases(family(""));
    EXPECT_EQ(stepAbout(explained(programming("D1", MODE_TYPE::BS, OUTPUT_TYPE::USB2)).steps, "absent").text,
              "no record of fam names PROGRAM: fam.acd has no OPERATION");
}

TEST(WhySteps, AMissingSectionIsNamed) {
    const Databases databases(Files{{"base.acd", "DEVICE_SUPPORTED = D9\n"}});
    EXPECT_EQ(stepAbout(explained(programming("D9", MODE_TYPE::BS, OUTPUT_TYPE::USB2)).steps, "absent").text,
              "no record of D9 names PROGRAM: there is no section [D9]");
}

TEST(WhySteps, ThePackageTableIsReadFromTheSectionOfTheDevice) {
    const Databases databases(
        Files{{"base.acd", "DEVICE_SUPPORTED = fam\nPROGRAM_OPTION_PACKAGE = D1PQ,fam\n"},
              {"fam.acd", "[D1]\nPROGRAM_OPTION = VERIFY,Bscan,PARALLEL\n"}});
    Question question = about(Kind::OPTION, "D1");
    question.option = PROGRAM_OPTION::VERIFY;
    question.package = "PQ";
    const explanation::Explanation found = explained(question);
    EXPECT_EQ(found.verdict, Conclusion::YES);
    EXPECT_EQ(stepAbout(found.steps, "table").text, "PROGRAM_OPTION of D1PQ, read from [D1]");
}

TEST(WhySteps, AListedDeviceHidesTheOptionsOfItsPackage) {
    const Databases databases(
        Files{{"base.acd", "DEVICE_SUPPORTED = D1,fam\nPROGRAM_OPTION_PACKAGE = D1PQ,fam\n"},
              {"fam.acd", "[D1]\nPROGRAM_OPTION = VERIFY,Bscan,PARALLEL\n"}});
    Question question = about(Kind::OPTION, "D1");
    question.option = PROGRAM_OPTION::VERIFY;
    question.package = "PQ";
    const explanation::Explanation found = explained(question);
    EXPECT_EQ(found.verdict, Conclusion::NO);
    EXPECT_EQ(stepAbout(found.steps, "rule").text,
              "DEVICE_SUPPORTED lists \"D1\", so options are read for \"D1\" alone, and \"D1PQ\" has none");
    EXPECT_EQ(explanation::ask(Databases::freshManager(), question), Conclusion::NO);
}

TEST(WhySteps, ACountOfZeroHidesTheValuesOfTheFamily) {
    const Databases databases(
        Files{{"base.acd", "DEVICE_SUPPORTED = fam\nPROGRAM_OPTION_PACKAGE = fam\n"},
              {"fam.acd", "PROPERTIES = PROGRAM,2,BS,SS\n[D1]\nPROPERTIES = PROGRAM,0\n"}});
    Question question = about(Kind::PROPERTY, "D1");
    question.property = "PROGRAM";
    for (const std::optional<std::string>& value :
         {std::optional<std::string>(), std::optional<std::string>("BS")}) {
        question.value = value;
        const explanation::Explanation found = explained(question);
        EXPECT_EQ(found.verdict, Conclusion::NO);
        EXPECT_EQ(explanation::ask(Databases::freshManager(), question), Conclusion::NO);
        EXPECT_EQ(place(stepAbout(found.steps, "absent")), "fam.acd:3:14: PROGRAM,0");
        EXPECT_EQ(stepAbout(found.steps, "note").text,
                  "getDeviceStringProperty answers \"BS\": it asks the family once more");
    }
}

TEST(WhySteps, APropertyOfTheFamilyMayReplaceThatOfTheDevice) {
    // "zor" and "x_PINS" are joined to the same text as "zor_x" and "PINS".
    const Databases databases(Files{{"base.acd", "DEVICE_SUPPORTED = other\nPROGRAM_OPTION_PACKAGE = zor\n"},
                                    {"zor.acd", "PROPERTY = x_PINS,7\n[zor_x]\nPROPERTY = PINS,5\n"}});
    Question question = about(Kind::PROPERTY, "zor_x");
    question.property = "PINS";
    question.value = "7";
    const explanation::Explanation found = explained(question);
    EXPECT_EQ(explanation::ask(Databases::freshManager(), question), Conclusion::YES);
    EXPECT_EQ(place(stepAbout(found.steps, "record")), "zor.acd:1:12: x_PINS,7");
}

} // namespace
