// Holds the verdict of every explanation against the manager's, over random databases.
#include "WhyFixtures.h"

#include "model/Vocabulary.h"

#include "reference/DatabaseGenerator.h"
#include "reference/Words.h"

#include <gtest/gtest.h>

#include <cstdlib>

namespace {

using namespace reference;
using why::Question;
using why::Verdict;
using Kind = Question::Kind;

constexpr int DATABASES = 1000;
constexpr int QUESTIONS = 20;

std::string randomName(Picker& pick) {
    switch (pick.below(10)) {
    case 0:
        return pick.from(words::FAMILIES);
    case 1:
    case 2:
        return pick.from(words::SPI_NAMES);
    case 3:
        return pick.from(words::NOISE);
    case 4:
        return pick.from(words::DEVICES) + "_" + pick.from(words::PACKAGES);
    default:
        return pick.from(words::DEVICES);
    }
}

template <typename Type>
Type below(Picker& pick, int count) {
    return static_cast<Type>(pick.below(count));
}

Question randomQuestion(Picker& pick) {
    Question question;
    question.kind = below<Kind>(pick, 8);
    question.device = randomName(pick);
    // What has a cell comes more often.
    question.mode = below<TARVIKNS::MODE_TYPE>(pick, pick.chance(70) ? 6 : 9);
    question.output = below<TARVIKNS::OUTPUT_TYPE>(pick, pick.chance(80) ? 5 : 10);
    question.operation = below<TARVIKNS::OP_TYPE>(pick, pick.chance(80) ? 5 : 32);
    question.option = below<TARVIKNS::PROGRAM_OPTION>(pick, 24);
    const bool takesPackage = question.kind == Kind::DEVICE || question.kind == Kind::DEVICE_THROUGH ||
                              question.kind == Kind::OPTION;
    if (takesPackage && pick.chance(50)) {
        question.package = pick.from(words::PACKAGES);
    }
    question.property = pick.from(pick.chance(20)   ? words::OPERATION_PROPERTIES
                                  : pick.chance(40) ? words::SPI_PROPERTIES
                                                    : words::PROPERTIES);
    if (question.kind == Kind::PROPERTY && pick.chance(60)) {
        question.value = pick.from(pick.chance(70) ? words::VALUES : words::SPI_VALUES);
    }
    return question;
}

/// How often each verdict came up: a test that saw no "yes" proves little.
struct Tally {
    int yes = 0;
    int no = 0;
    int fault = 0;

    void count(Verdict verdict) { ++(verdict == Verdict::YES ? yes : verdict == Verdict::NO ? no : fault); }
};

std::string shown(const Files& files) {
    std::string text;
    for (const auto& [name, content] : files) {
        text += "---- " + name + "\n" + content + "\n";
    }
    return text;
}

Tally compareOverRandomDatabases(Health health, int seed) {
    Tally tally;
    for (int number = 0; number < DATABASES / 2; ++number) {
        Picker pick(rc::Random(static_cast<std::uint64_t>(seed * DATABASES + number)));
        const Files files = makeDatabases(pick, health);
        const Databases databases(files);
        for (int asked = 0; asked < QUESTIONS; ++asked) {
            const Question question = randomQuestion(pick);
            const Verdict verdict = why::ask(Databases::freshManager(), question);
            const why::Explanation explanation = why::explain(question);
            tally.count(verdict);
            if (verdict != explanation.verdict || explanation.steps.empty()) {
                ADD_FAILURE() << asPlainText({question, verdict, explanation}) << shown(files);
                return tally;
            }
        }
    }
    return tally;
}

TEST(WhyAgreement, OverSoundDatabases) {
    const Tally tally = compareOverRandomDatabases(Health::SOUND, 1);
    EXPECT_GT(tally.yes, 800);
    EXPECT_GT(tally.no, 2000);
}

TEST(WhyAgreement, OverDamagedDatabases) {
    const Tally tally = compareOverRandomDatabases(Health::DAMAGED, 2);
    EXPECT_GT(tally.yes, 500);
    EXPECT_GT(tally.no, 2000);
    EXPECT_GT(tally.fault, 25);
}

/// What an explanation offers instead of a no is a yes of the manager too.
TEST(WhyAgreement, AlternativesAreAllowed) {
    int compared = 0;
    for (int number = 0; number < 30; ++number) {
        Picker pick(rc::Random(static_cast<std::uint64_t>(5000 + number)));
        const Databases databases(makeDatabases(pick, Health::SOUND));
        for (int asked = 0; asked < 10; ++asked) {
            Question question = randomQuestion(pick);
            question.kind = Kind::DEVICE;
            const why::Step instead = stepAbout(why::alternatives(question), "instead");
            for (int mode = 0; mode < static_cast<int>(vocabulary::modes().size()); ++mode) {
                question.mode = static_cast<TARVIKNS::MODE_TYPE>(mode);
                const std::string key = plain(ConstraintsManager::modeType2String(question.mode));
                const std::string words = " " + instead.text.substr(instead.text.rfind("mode ") + 5) + ",";
                EXPECT_EQ(words.find(" " + key + ",") != std::string::npos,
                          why::ask(Databases::freshManager(), question) == Verdict::YES)
                    << question.device << ' ' << key << " in" << words;
                ++compared;
            }
        }
    }
    EXPECT_EQ(compared, 2700);
}

} // namespace
