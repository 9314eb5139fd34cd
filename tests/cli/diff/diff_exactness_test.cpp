// "The same" means that all questions have the same answers: random questions of every form are asked about random
// pairs of databases, each of a fresh manager, and whenever one answer differs `diff` must list something.
#include "cli/support/DatabaseDirectory.h"
#include "cli/support/OpenDatabase.h"
#include "cli/support/ToolProcess.h"
#include "model/Catalogue.h"
#include "query/FreshManager.h"

#include "reference/DatabaseGenerator.h"
#include "reference/Words.h"

#include <TarvikException.h>

#include <gtest/gtest.h>

#include <cstdlib>
#include <functional>

namespace {

using reference::Files;
using reference::RandomSource;
using TARVIKNS::MODE_TYPE;
using TARVIKNS::OP_TYPE;
using TARVIKNS::OUTPUT_TYPE;

/// A question with its arguments; the answer as text.
struct RandomQuestion {
    std::string words;
    std::function<std::string(ConstraintsManager&)> ask;
};

/// What a name may be followed by.
std::string listed(const std::string& text, std::size_t from) {
    return text.substr(std::min(from, text.size()));
}

/// Picks names that the databases hold, whole or cut anywhere, so that packages are joined in every way.
class QuestionPicker {
public:
    QuestionPicker(RandomSource& pick, std::vector<std::string> names)
        : m_pick(pick), m_names(std::move(names)) {}

    [[nodiscard]] RandomQuestion next() {
        const std::string whole = m_pick.from(m_names);
        const auto cut = static_cast<std::size_t>(m_pick.below(static_cast<int>(whole.size()) + 1));
        const bool isCut = m_pick.chance(30);
        const std::string device = isCut ? whole.substr(0, cut) : whole;
        const std::string other = m_pick.from(m_names);
        const std::string package = isCut ? listed(whole, cut) : listed(other, other.rfind('_') + 1);
        const bool hasPackage = isCut || m_pick.chance(30);
        const auto mode = static_cast<MODE_TYPE>(m_pick.below(9));
        const auto output = static_cast<OUTPUT_TYPE>(m_pick.below(10));
        const auto operation = static_cast<OP_TYPE>(m_pick.below(32));
        const std::string key = m_pick.from(reference::words::PROPERTIES);
        const int form = m_pick.below(9);
        const std::string words = std::to_string(form) + " \"" + device + "\" \"" +
                                  (hasPackage ? package : "-") + "\" mode " +
                                  std::to_string(static_cast<int>(mode)) + " output " +
                                  std::to_string(static_cast<int>(output)) + " key " + key;
        return {words, [=](ConstraintsManager& manager) {
                    const char* const name = device.c_str();
                    const char* const in = hasPackage ? package.c_str() : nullptr;
                    const auto cell = static_cast<OUTPUT_TYPE>(static_cast<int>(output) % 5);
                    switch (form) {
                    case 0:
                        return std::to_string(manager.checkConstraints(mode, output));
                    case 1:
                        return std::to_string(manager.checkConstraints(mode, name, in));
                    case 2:
                        return std::to_string(manager.checkConstraints(mode, output, name, in));
                    case 3:
                        return std::to_string(manager.getDeviceOperations(name, mode, cell));
                    case 4:
                        return std::to_string(manager.getProgramOptions(name, mode, cell, in));
                    case 5:
                        return std::to_string(manager.getBsdlOperations(name, cell));
                    case 6: {
                        std::string values;
                        for (const StringBase& value : manager.getDeviceStringProperties(name, key.c_str())) {
                            values += toStdString(value) + '\n';
                        }
                        return values;
                    }
                    case 7: {
                        const char* const value = manager.getDeviceStringProperty(name, key.c_str());
                        return std::string(value == nullptr ? "none" : value);
                    }
                    default:
                        return std::to_string(
                            manager.checkConstraints(mode, output, name, operation, nullptr));
                    }
                }};
    }

private:
    RandomSource& m_pick;
    std::vector<std::string> m_names;
};

std::string answer(const RandomQuestion& question) {
    try {
        return question.ask(*freshManager());
    } catch (const TarvikException& fault) {
        return std::string("raises ") + fault.what();
    }
}

/// All names of devices, families, packages and parts that a database holds.
void addNames(std::vector<std::string>& names, const Files& files) {
    const OpenDatabase database(files);
    for (const std::string& name : catalogue::names()) {
        names.push_back(name);
    }
    for (const char* const key : {"DEVICE_SUPPORTED", "PROGRAM_OPTION_PACKAGE"}) {
        for (const std::string& name : catalogue::list("base.acd", key)) {
            names.push_back(name);
        }
    }
    for (const std::string& part : catalogue::list("base.acd", "NOT_SUPPORTED_PART_IN_MODE")) {
        names.push_back(part.substr(part.find('_') + 1));
    }
    std::erase(names, "");
}

/// A small change somewhere: a line is lost, or a piece of one is.
void mutate(RandomSource& pick, Files& files) {
    auto file = std::next(files.begin(), pick.below(static_cast<int>(files.size())));
    std::string& text = file->second;
    const auto at = static_cast<std::size_t>(pick.below(static_cast<int>(text.size()) + 1));
    const std::size_t begin = text.find_first_of(",:\n", at);
    if (begin != text.npos) {
        const std::size_t end = text.find_first_of(",:\n", begin + 1);
        text.erase(begin, end == text.npos ? end : end - begin);
    }
}

constexpr int PAIRS = 25;

TEST(DiffExactness, ListsSomethingWheneverAnAnswerDiffers) {
    const char* const wanted = std::getenv("TARVIK_PROPERTY_CALLS");
    const int calls = (wanted == nullptr ? 10000 : std::atoi(wanted)) / PAIRS;
    int differing = 0;
    int same = 0;
    for (std::uint64_t number = 0; number < std::uint64_t{PAIRS}; ++number) {
        RandomSource pick(rc::Random(8800 + number));
        const Files before = reference::makeDatabases(pick, reference::Health::SOUND);
        Files after = before;
        for (int changes = pick.below(6); changes >= 0; --changes) {
            mutate(pick, after);
        }
        std::vector<std::string> names{"NOSUCH", "spi", "base", "spi_SO8"};
        addNames(names, before);
        addNames(names, after);
        QuestionPicker picker(pick, names);
        std::vector<RandomQuestion> questions;
        for (int i = 0; i < calls; ++i) {
            questions.push_back(picker.next());
        }
        const auto answers = [&questions](const Files& files) {
            const OpenDatabase database(files);
            std::vector<std::string> all;
            for (const RandomQuestion& question : questions) {
                all.push_back(answer(question));
            }
            return all;
        };
        const std::vector<std::string> oldAnswers = answers(before);
        const std::vector<std::string> newAnswers = answers(after);
        const DatabaseDirectory oldDatabase(before);
        const DatabaseDirectory newDatabase(after);
        const ProcessResult outcome =
            runTool(std::vector<std::string>{"diff", oldDatabase.path(), newDatabase.path()});
        const auto [oldOne, newOne] = std::mismatch(oldAnswers.begin(), oldAnswers.end(), newAnswers.begin());
        if (oldOne != oldAnswers.end()) {
            ++differing;
            EXPECT_NE(outcome.status, 0)
                << number << ": " << questions[static_cast<std::size_t>(oldOne - oldAnswers.begin())].words
                << ": " << *oldOne << " becomes " << *newOne;
        } else {
            same += outcome.status == 0 ? 1 : 0;
        }
    }
    EXPECT_GT(differing, 3);
    EXPECT_GT(same, 0);
}

} // namespace
