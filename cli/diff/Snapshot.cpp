// A manager can't be made twice, so each database is asked in a process of its own.
#include "diff/Snapshot.h"

#include "diff/Serialization.h"
#include "diff/SnapshotCollector.h"
#include "query/Apart.h"
#include "query/Database.h"
#include "term/ExitCode.h"
#include "term/Progress.h"

#include <Port_MsgManData.h>
#include <TarvikException.h>
#include <tarvik/ConstraintsManager.h>

namespace diff {

namespace {

// What the bytes from the other process are: the last one tells.
constexpr char FACTS = 'f';
constexpr char FAULT = 'x';

ConstraintsManager& manager() {
    ConstraintsManager* const made = ConstraintsManager::getConstraintsManager();
    if (made == nullptr) {
        throw std::bad_alloc();
    }
    made->setExceptions(false);
    return *made;
}

std::string work(const std::vector<std::string>& layers, const Interview::Reached& reached) {
    std::string said;
    Port_MsgManData::setSink([&said](const Port_MsgManData::Message& message) {
        if (message.channel == Port_MsgManData::Channel::INFO) {
            said += message.text;
        }
    });
    try {
        openDatabase(layers);
        return packed(Interview(manager()).facts(reached)) + FACTS;
    } catch (const CommandError& failure) {
        return said + failure.what() + FAULT;
    } catch (const TarvikException& fault) {
        return said + "the database can't be read: " + fault.typeName() + FAULT;
    }
}

Facts result(why::Apart& apart) {
    const std::string bytes = apart.result();
    const std::string_view rest = std::string_view(bytes).substr(0, bytes.size() - 1);
    if (bytes.back() == FAULT) {
        throw CommandError(ExitCode::FAULT, std::string(rest));
    }
    return unpackedFacts(rest);
}

} // namespace

const Texts& Facts::answer(const Answers& own, const std::vector<std::size_t>& commonOnes,
                           const Question& question) const {
    static const Texts none;
    if (const auto found = own.find(question); found != own.end()) {
        return found->second;
    }
    for (const std::size_t index : commonOnes) {
        const Answers& answers = shared[index];
        if (const auto found = answers.find(question); found != answers.end()) {
            return found->second;
        }
    }
    return none;
}

std::pair<Facts, Facts> factsOf(const std::vector<std::string>& oldLayers,
                                const std::vector<std::string>& newLayers) {
    // Both go on side by side and take about the same: one of them tells how far they are.
    why::Apart oldWork([&] {
        Progress progress("asking for each device");
        return work(oldLayers,
                    [&progress](std::size_t done, std::size_t total) { progress.reach(done, total); });
    });
    why::Apart newWork([&] { return work(newLayers, [](std::size_t /*done*/, std::size_t /*total*/) {}); });
    Facts oldFacts = result(oldWork);
    return {std::move(oldFacts), result(newWork)};
}

} // namespace diff
