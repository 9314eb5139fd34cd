// Holds the verdict of every explanation against the manager's, over random databases.
#include "RandomQuestion.h"
#include "WhyFixtures.h"

#include "model/Vocabulary.h"

#include "reference/DatabaseGenerator.h"

#include <gtest/gtest.h>

#include <cstdlib>

namespace {

using namespace reference;
using why::Question;
using why::Verdict;
using Kind = Question::Kind;

constexpr int DATABASES = 200;
constexpr int QUESTIONS = 20;

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
    for (int number = 0; number < DATABASES; ++number) {
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
    EXPECT_GT(tally.yes, 320);
    EXPECT_GT(tally.no, 800);
}

TEST(WhyAgreement, OverDamagedDatabases) {
    const Tally tally = compareOverRandomDatabases(Health::DAMAGED, 2);
    EXPECT_GT(tally.yes, 200);
    EXPECT_GT(tally.no, 800);
    EXPECT_GT(tally.fault, 10);
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
