// Which differences are losses, on random pairs of databases against a plain definition; and the statuses of the command.
// TARVIK_PROPERTY_DATABASES says how many pairs, TARVIK_PROPERTY_SEED which.
#include "cli/support/Answers.h"
#include "cli/support/DatabaseDirectory.h"
#include "cli/support/SmallDatabase.h"
#include "cli/support/ToolProcess.h"
#include "reference/DatabaseGenerator.h"
#include "support/Setting.h"

#include "diff/Comparison.h"

#include <gmock/gmock.h>

#include <map>
#include <optional>

using testing::HasSubstr;

namespace {

using reference::Files;
using Facts = std::set<std::tuple<std::string, diff::Question, std::string>>;

/// Loses a piece of a line somewhere, or doubles one.
void mutate(reference::RandomSource& pick, Files& files) {
    auto file = std::next(files.begin(), pick.below(static_cast<int>(files.size())));
    std::string& text = file->second;
    const auto at = static_cast<std::size_t>(pick.below(static_cast<int>(text.size()) + 1));
    const std::size_t begin = text.find_first_of(",:\n", at);
    const std::size_t end = begin == text.npos ? begin : text.find_first_of(",:\n", begin + 1);
    if (end != text.npos && pick.chance(70)) {
        text.erase(begin, end - begin);
    } else if (end != text.npos) {
        text.insert(begin, text.substr(begin, end - begin) + "X");
    }
}

/// The answers about each name.
struct Named {
    bool isFamily;
    diff::Answers answers;
};
using Answered = std::map<std::string, Named>;

/// A device that becomes a family is still there.
Answered answered(const diff::Snapshot& database) {
    Answered all{{"in general", {false, database.general()}}};
    for (const auto& [name, device] : database.devices()) {
        Named& named = all["of " + std::string(name)];
        named = {device.isFamily, diff::deserialized(device.own)};
        named.answers.insert(device.shared->begin(), device.shared->end());
        named.answers[{"", "is there"}] = {"yes"};
    }
    return all;
}

/// The answers of a database one by one, to its own questions and to those of another database. What is not said of a
/// package is as without a package. Whether there is a family is among the general answers.
Facts factsOf(const Answered& database, const Answered& other) {
    Facts facts;
    for (const auto& [device, named] : database) {
        const auto same = other.find(device);
        if (named.isFamily && same == other.end()) {
            continue;
        }
        const auto addAll = [&facts, &device = device, &answers = named.answers](const diff::Answers& asked) {
            for (const auto& [question, ignored] : asked) {
                diff::Question general = question;
                general.package.clear();
                const auto own = answers.find(question);
                const auto found = own == answers.end() ? answers.find(general) : own;
                for (const std::string& answer : found == answers.end() ? diff::StringSet() : found->second) {
                    facts.emplace(device, question, answer);
                }
            }
        };
        addAll(named.answers);
        if (same != other.end()) {
            addAll(same->second.answers);
        }
    }
    return facts;
}

bool isFault(const Facts::value_type& fact) { return std::get<1>(fact).topic == diff::FAULTS; }

/// Is there an answer that only the old database gives, or a fault that only the new one has for what both have?
bool loses(const Facts& before, const Facts& after) {
    const auto isNew = [&before](const Facts::value_type& fault) {
        return !before.contains({std::get<0>(fault), diff::Question{"", "is there"}, "yes"});
    };
    return std::any_of(before.begin(), before.end(),
                       [&after](const auto& fact) { return !isFault(fact) && !after.contains(fact); }) ||
           std::any_of(after.begin(), after.end(), [&](const auto& fact) {
               return isFault(fact) && !isNew(fact) && !before.contains(fact);
           });
}

} // namespace

TEST(Losses, AreAnswersThatTheNewDatabaseDoesNotGive) {
    const std::uint64_t seed = setting("TARVIK_PROPERTY_SEED", 1);
    reference::RandomSource pick{rc::Random(seed)};
    std::size_t losing = 0;
    std::size_t gaining = 0;
    for (std::uint64_t i = setting("TARVIK_PROPERTY_DATABASES", 40); i > 0 && !HasFailure(); --i) {
        const Files before =
            makeDatabases(pick, pick.chance(20) ? reference::Health::DAMAGED : reference::Health::SOUND);
        Files after = before;
        for (int changes = pick.below(3); changes >= 0; --changes) {
            mutate(pick, after);
        }
        const bool isSwapped = pick.chance(50);
        std::optional<std::string> first = answersOf(isSwapped ? after : before);
        std::optional<std::string> second = answersOf(isSwapped ? before : after);
        if (!first || !second) {
            continue;
        }
        const diff::Snapshot old(*std::move(first));
        const diff::Snapshot recent(*std::move(second));
        const diff::Comparison comparison = diff::compare(old, recent);
        const Answered oldAnswers = answered(old);
        const Answered newAnswers = answered(recent);
        const bool isLoss = loses(factsOf(oldAnswers, newAnswers), factsOf(newAnswers, oldAnswers));
        EXPECT_EQ(comparison.hasLosses(), isLoss) << i << " pairs before the end of seed " << seed;
        losing += isLoss ? 1U : 0U;
        gaining += !isLoss && !comparison.isEmpty() ? 1U : 0U;
    }
    EXPECT_GT(losing, 0U);
    EXPECT_GT(gaining, 0U);
}

TEST(DiffFailOn, LostIgnoresWhatIsNew) {
    const DatabaseDirectory::Files files{{"base.acd", "DEVICE_SUPPORTED = base,kestrel\n"
                                                      "PROGRAM_OPTION_PACKAGE = base,kestrel\n"
                                                      "IDCODE = KS50,0xX4104FB7\n"},
                                         {"kestrel.acd", "PROPERTY = VENDOR,Korvel\n[KS50]\n"}};
    DatabaseDirectory::Files more = files;
    more["kestrel.acd"] += "PROPERTY = PINS,140\n[KS75]\n";
    const DatabaseDirectory less(files);
    const DatabaseDirectory recent(more);
    const auto status = [](const DatabaseDirectory& before, const DatabaseDirectory& after,
                           const char* failOn) {
        return runTool(std::vector<std::string>{"diff", "--fail-on", failOn, before.path(), after.path()})
            .status;
    };
    EXPECT_EQ(status(less, recent, "lost"), 0);
    EXPECT_EQ(status(less, recent, "any"), 1);
    EXPECT_EQ(status(recent, less, "lost"), 1);
    EXPECT_EQ(status(less, less, "any"), 0);
    EXPECT_EQ(status(less, less, "none"), 2);
}

TEST(DiffAgainst, NeedsARepository) {
    const SmallDatabase database;
    const ProcessResult outcome =
        runTool(std::vector<std::string>{"diff", "--against", "HEAD", database.path()});
    EXPECT_EQ(outcome.status, 2);
    EXPECT_THAT(outcome.error, HasSubstr("is not in a git repository"));
    EXPECT_EQ(runTool(std::vector<std::string>{"diff", "--against", "HEAD", database.path(), "more"}).status,
              2);
}
