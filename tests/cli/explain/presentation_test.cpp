// Explanations as text and as JSON.
#include "StepsFixtures.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace {

using namespace TARVIKNS;
using explanation::Conclusion;
using explanation::Question;
using testing::HasSubstr;

TEST(WhyPresentation, StepsReadAsATableWithPlaces) {
    const Databases databases(family("OPERATION = PROGRAM,Bscan,USB2"));
    const Question question = programming("D1", MODE_TYPE::BS, OUTPUT_TYPE::USB2);
    EXPECT_EQ(asPlainText({question, Conclusion::YES, explained(question)}),
              "yes: PROGRAM of D1 in mode BS through USB2\n"
              "  family    fam: section [D1] of fam.acd\n"
              "  table     OPERATION of fam\n"
              "            fam.acd:1:13: PROGRAM,Bscan,USB2\n"
              "  record    PROGRAM is allowed in mode BS through USB2\n"
              "            fam.acd:1:13: PROGRAM,Bscan,USB2\n");
}

TEST(WhyPresentation, LongTextsAreBrokenAndLongFragmentsCut) {
    const Question question = programming("D1", MODE_TYPE::BS, OUTPUT_TYPE::USB2);
    std::string words;
    for (int number = 0; number < 30; ++number) {
        words += "word ";
    }
    const std::string fragment = std::string(64, 'x') + "\xC3\xBC" + std::string(9, 'y');
    explanation::Explanation explanation{
        Conclusion::NO,
        {{"absent", words + "end", explanation::SourceText{fragment, {std::string(60, 'f'), 12, 3}}}}};
    const std::string text = asPlainText({question, Conclusion::NO, explanation});
    EXPECT_THAT(text, HasSubstr("\n            " + std::string(60, 'f') + ":12:3:\n            "));
    EXPECT_THAT(text, HasSubstr("xxx...\n"));
    EXPECT_THAT(text, testing::Not(HasSubstr("\xC3")));
    EXPECT_THAT(text, testing::Not(HasSubstr("\xBC")));
}

TEST(WhyPresentation, JsonTellsPlacesAndWhetherTheStepsAgree) {
    const Databases databases(family("OPERATION = PROGRAM,Bscan,USB2"));
    const Question question = programming("D1", MODE_TYPE::BS, OUTPUT_TYPE::USB2);
    const Json object = explanation::asJson({question, Conclusion::NO, explained(question)});
    EXPECT_EQ(object["allowed"], false);
    EXPECT_EQ(object["agrees"], false);
    EXPECT_EQ(object["steps"][2], (Json{{"topic", "record"},
                                        {"text", "PROGRAM is allowed in mode BS through USB2"},
                                        {"file", "fam.acd"},
                                        {"line", 1},
                                        {"column", 13},
                                        {"fragment", "PROGRAM,Bscan,USB2"}}));
}

} // namespace
