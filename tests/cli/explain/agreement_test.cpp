// Holds the verdict of every explanation against the manager's, over random databases.
#include "RandomQuestion.h"
#include "WhyFixtures.h"

#include "model/Vocabulary.h"

#include "reference/DatabaseGenerator.h"
#include "support/Sanitizers.h"

#include <gtest/gtest.h>

#include <cstdlib>

namespace {

using namespace reference;
using explanation::Conclusion;
using explanation::Question;
using Kind = Question::Kind;

/// Each question starts several managers, which takes long under the sanitizers.
constexpr int DATABASES = isSanitized() ? 40 : 200;
constexpr int QUESTIONS = 20;

/// How often each verdict came up: a test that saw no "yes" proves little.
struct Tally {
    int yes = 0;
    int no = 0;
    int fault = 0;

    void count(Conclusion verdict) {
        ++(verdict == Conclusion::YES ? yes : verdict == Conclusion::NO ? no : fault);
    }
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
        RandomSource pick(rc::Random(static_cast<std::uint64_t>(seed * DATABASES + number)));
        const Files files = makeDatabases(pick, health);
        const Databases databases(files);
        for (int asked = 0; asked < QUESTIONS; ++asked) {
            const Question question = randomQuestion(pick);
            const Conclusion verdict = explanation::ask(Databases::freshManager(), question);
            const explanation::Explanation explanation = explanation::explain(question);
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
    EXPECT_GT(tally.yes, DATABASES * 8 / 5);
    EXPECT_GT(tally.no, 4 * DATABASES);
}

TEST(WhyAgreement, OverDamagedDatabases) {
    const Tally tally = compareOverRandomDatabases(Health::DAMAGED, 2);
    EXPECT_GT(tally.yes, DATABASES);
    EXPECT_GT(tally.no, 4 * DATABASES);
    EXPECT_GT(tally.fault, DATABASES / 20);
}

/// What an explanation offers instead of a no is a yes of the manager too.
TEST(WhyAgreement, AlternativesAreAllowed) {
    int compared = 0;
    for (int number = 0; number < 30; ++number) {
        RandomSource pick(rc::Random(static_cast<std::uint64_t>(5000 + number)));
        const Databases databases(makeDatabases(pick, Health::SOUND));
        for (int asked = 0; asked < 10; ++asked) {
            Question question = randomQuestion(pick);
            question.kind = Kind::DEVICE;
            const explanation::Step instead = stepAbout(explanation::alternatives(question), "instead");
            for (int mode = 0; mode < static_cast<int>(vocabulary::modes().size()); ++mode) {
                question.mode = static_cast<TARVIKNS::MODE_TYPE>(mode);
                const std::string key = toStdString(ConstraintsManager::modeType2String(question.mode));
                const std::string words = " " + instead.text.substr(instead.text.rfind("mode ") + 5) + ",";
                EXPECT_EQ(words.find(" " + key + ",") != std::string::npos,
                          explanation::ask(Databases::freshManager(), question) == Conclusion::YES)
                    << question.device << ' ' << key << " in" << words;
                ++compared;
            }
        }
    }
    EXPECT_EQ(compared, 2700);
}

} // namespace
