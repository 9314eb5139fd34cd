// The census asks for all devices; each answer is that of a manager that was asked for this device alone.
#include "cli/explain/WhyFixtures.h"
#include "query/Census.h"

#include "reference/DatabaseGenerator.h"
#include "reference/Words.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace {

using reference::Health;
using reference::Picker;
using why::Question;
using why::Verdict;
using Kind = Question::Kind;

std::vector<why::Entry> census(const Question& question) {
    return why::askForAll(Databases::freshManager(), question, why::ask);
}

std::vector<std::string> namesOf(const std::vector<why::Entry>& entries) {
    std::vector<std::string> names;
    for (const why::Entry& entry : entries) {
        if (entry.verdict == Verdict::YES) {
            names.push_back(entry.name);
        }
    }
    return names;
}

/// @return the number of answers compared
std::size_t expectFreshAnswers(Question question) {
    const std::vector<why::Entry> entries = census(question);
    for (const why::Entry& entry : entries) {
        question.device = entry.name;
        EXPECT_EQ(entry.verdict, why::ask(Databases::freshManager(), question)) << why::inWords(question);
        EXPECT_EQ(entry.family, plain(Databases::freshManager().getPartFamily(entry.name.c_str())))
            << entry.name;
    }
    return entries.size();
}

TEST(WhichCensus, OverTheDemonstration) {
    const Databases databases(demonstration());
    Question question;
    question.kind = Kind::OPERATION;
    question.output = TARVIKNS::OUTPUT_TYPE::USB2;
    EXPECT_GT(expectFreshAnswers(question), 150U);
    question.mode = TARVIKNS::MODE_TYPE::SPI;
    EXPECT_GT(expectFreshAnswers(question), 150U);
    question.kind = Kind::OPERATION_IN_MODE;
    EXPECT_GT(expectFreshAnswers(question), 150U);
    question.kind = Kind::PROPERTY;
    question.property = "VENDOR";
    question.value = "Orveth";
    EXPECT_GT(expectFreshAnswers(question), 150U);
}

void expectFreshAnswersOverRandomDatabases(Health health, std::uint64_t seed) {
    for (std::uint64_t number = 0; number < 60; ++number) {
        Picker pick(rc::Random(seed + number));
        const Databases databases(reference::makeDatabases(pick, health));
        Question question;
        question.mode = static_cast<TARVIKNS::MODE_TYPE>(pick.below(6));
        question.output = static_cast<TARVIKNS::OUTPUT_TYPE>(pick.below(5));
        question.operation = static_cast<TARVIKNS::OP_TYPE>(pick.below(5));
        question.property = pick.from(reference::words::PROPERTIES);
        question.value = pick.from(reference::words::VALUES);
        for (const Kind kind : {Kind::OPERATION, Kind::OPERATION_IN_MODE, Kind::PROPERTY}) {
            question.kind = kind;
            expectFreshAnswers(question);
        }
        if (testing::Test::HasFailure()) {
            return;
        }
    }
}

TEST(WhichCensus, OverSoundDatabases) { expectFreshAnswersOverRandomDatabases(Health::SOUND, 100); }

TEST(WhichCensus, OverDamagedDatabases) { expectFreshAnswersOverRandomDatabases(Health::DAMAGED, 900); }

TEST(WhichCensus, DevicesOfAFamilyAreAskedForOnce) {
    const Databases databases(Files{{"base.acd", "DEVICE_SUPPORTED = D3,fam\n"},
                                    {"fam.acd", "OPERATION = PROGRAM,Bscan,USB2\n[D1]\n[D2]\n[D3]\n"
                                                "OPERATION = ERASE,Bscan,USB2\n[D4]\n"}});
    Question question;
    question.kind = Kind::OPERATION;
    question.output = TARVIKNS::OUTPUT_TYPE::USB2;
    int asked = 0;
    const std::vector<why::Entry> entries = why::askForAll(
        Databases::freshManager(), question, [&](ConstraintsManager& manager, const Question& one) {
            ++asked;
            return why::ask(manager, one);
        });
    EXPECT_EQ(asked, 2);
    EXPECT_THAT(namesOf(entries), testing::ElementsAre("D1", "D2", "D4"));
}

TEST(WhichCensus, AnUnknownOptionIsAFaultForEachDeviceThatReadsIt) {
    const Databases databases(
        Files{{"base.acd", "DEVICE_SUPPORTED = fam\n"},
              {"fam.acd", "PROPERTY = A,1\n[D1]\n[D2]\nPROGRAM_OPTION = OTP,Bscan,USB2\n[D3]\n"}});
    Question question;
    question.kind = Kind::PROPERTY;
    question.property = "A";
    question.value = "1";
    const std::vector<why::Entry> entries = census(question);
    ASSERT_EQ(entries.size(), 3U);
    EXPECT_EQ(entries[0].verdict, Verdict::YES);
    EXPECT_EQ(entries[1].verdict, Verdict::FAULT);
    EXPECT_EQ(entries[2].verdict, Verdict::YES);
}

} // namespace
