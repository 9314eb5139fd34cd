// What an explanation of a "no" offers instead.
#include "StepsFixtures.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace {

using namespace TARVIKNS;
using explanation::Conclusion;
using explanation::Question;
using Kind = Question::Kind;

TEST(WhyAlternatives, AllOtherDevicesOfTheFamilyAreCounted) {
    const Databases databases(
        Files{{"base.acd", "DEVICE_SUPPORTED = D1,fam\n"},
              {"fam.acd", "OPERATION = PROGRAM,Bscan,USB2\n[D1]\nOPERATION = ERASE,Bscan,USB2\n"
                          "[D2]\n[D3]\n"}});
    EXPECT_EQ(
        stepAbout(explanation::alternatives(programming("D1", MODE_TYPE::BS, OUTPUT_TYPE::USB2)), "differs")
            .text,
        "yes for the other 2 devices of fam");
}

TEST(WhyAlternatives, TheRecordsThatAllowItElsewhere) {
    const Databases databases(family("OPERATION = PROGRAM,Bscan,PARALLEL,USB2:PROGRAM,SS,SVF"));
    const std::vector<explanation::Step> steps =
        explanation::alternatives(programming("D1", MODE_TYPE::SM, OUTPUT_TYPE::USB2));
    ASSERT_EQ(steps.size(), 2U);
    EXPECT_EQ(steps[0].text, "yes in mode BS through PARALLEL, USB2");
    EXPECT_EQ(place(steps[0]), "fam.acd:1:13: PROGRAM,Bscan,PARALLEL,USB2");
    EXPECT_EQ(steps[1].text, "yes in mode SS through SVF");
}

TEST(WhyAlternatives, SeveralRecordsOfOneMode) {
    const Databases databases(family("OPERATION = PROGRAM,Bscan,PARALLEL:PROGRAM,Bscan,USB2,SVF"));
    const std::vector<explanation::Step> steps =
        explanation::alternatives(programming("D1", MODE_TYPE::SM, OUTPUT_TYPE::USB2));
    ASSERT_EQ(steps.size(), 2U);
    EXPECT_EQ(steps[0].text, "yes in mode BS through PARALLEL");
    EXPECT_EQ(place(steps[0]), "fam.acd:1:13: PROGRAM,Bscan,PARALLEL");
    EXPECT_EQ(steps[1].text, "yes in mode BS through USB2, SVF");
    EXPECT_EQ(place(steps[1]), "fam.acd:1:36: PROGRAM,Bscan,USB2,SVF");
}

TEST(WhyAlternatives, WhatElseIsAllowedThere) {
    const Databases databases(family("OPERATION = VERIFY,Bscan,USB2:ERASE,Bscan,USB2"));
    const std::vector<explanation::Step> steps =
        explanation::alternatives(programming("D1", MODE_TYPE::BS, OUTPUT_TYPE::USB2));
    ASSERT_EQ(steps.size(), 1U);
    EXPECT_EQ(steps[0].text, "allowed there: VERIFY, ERASE");
}

TEST(WhyAlternatives, DevicesOfTheFamilyThatDiffer) {
    Files files = family("PROPERTY = A,1\n[D2]\nPROPERTY = A,2");
    const Databases databases(std::move(files));
    Question question = about(Kind::PROPERTY, "D1");
    question.property = "A";
    question.value = "2";
    EXPECT_EQ(stepAbout(explanation::alternatives(question), "differs").text, "in family fam, yes for D2");
}

TEST(WhyAlternatives, ADeviceWithATableOfItsOwnDiffers) {
    Files files;
    files["base.acd"] = "DEVICE_SUPPORTED = D2,fam\n";
    files["fam.acd"] = "[D1]\n[D2]\nOPERATION = PROGRAM,Bscan,USB2\n";
    const Databases databases(std::move(files));
    EXPECT_EQ(
        stepAbout(explanation::alternatives(programming("D1", MODE_TYPE::BS, OUTPUT_TYPE::USB2)), "differs")
            .text,
        "in family fam, yes for D2");
}

TEST(WhyAlternatives, ThePackageThatHasTheOption) {
    Files files;
    files["base.acd"] = "DEVICE_SUPPORTED = fam\nPROGRAM_OPTION_PACKAGE = D1PQ,fam\n";
    files["fam.acd"] = "[D1]\nPROGRAM_OPTION = VERIFY,Bscan,PARALLEL\n";
    const Databases databases(std::move(files));
    Question question = about(Kind::OPTION, "D1");
    question.option = PROGRAM_OPTION::VERIFY;
    question.package = "VS20";
    EXPECT_EQ(explained(question).verdict, Conclusion::NO);
    EXPECT_EQ(stepAbout(explanation::alternatives(question), "differs").text, "yes in package PQ");
}

TEST(WhyAlternatives, TheFamilyItselfMayDiffer) {
    Files files;
    files["base.acd"] = "DEVICE_SUPPORTED = D1,fam\n";
    files["fam.acd"] = "OPERATION = PROGRAM,Bscan,USB2\n[D1]\nOPERATION = ERASE,Bscan,USB2\n";
    const Databases databases(std::move(files));
    EXPECT_EQ(
        stepAbout(explanation::alternatives(programming("D1", MODE_TYPE::BS, OUTPUT_TYPE::USB2)), "differs")
            .text,
        "in family fam, yes for the family itself");
}

TEST(WhyAlternatives, SpiModeAnswersForEveryDevice) {
    Files files = family("");
    files["base.acd"] = "DEVICE_SUPPORTED = fam,spi\n";
    files["spi.acd"] = "OPERATION = PROGRAM,SPI,USB2\n";
    const Databases databases(std::move(files));
    EXPECT_EQ(
        stepAbout(explanation::alternatives(programming("D1", MODE_TYPE::BS, OUTPUT_TYPE::USB2)), "instead")
            .text,
        "yes in mode SPI through USB2, for every device");
}

TEST(WhyAlternatives, TheKeyThatWasMeant) {
    const Databases databases(family("PROPERTY = VENDOR,Korvel"));
    Question question = about(Kind::PROPERTY, "D1");
    question.property = "VENDER";
    EXPECT_EQ(stepAbout(explanation::alternatives(question), "instead").text, "there is a property VENDOR");
}

} // namespace
