#include "measure/Allocations.h"
#include "measure/Ask.h"
#include "measure/Clock.h"
#include "measure/Results.h"
#ifdef TARVIK_BENCHMARK_HWDB
#include "peers/HwdbPeer.h"
#endif
#include "peers/JsonPeers.h"
#include "peers/LmdbPeer.h"
#include "peers/ManagerPeer.h"
#include "peers/MapPeers.h"
#include "peers/SqlitePeer.h"

#include <cstdio>
#include <cstdlib>
#include <exception>
#include <limits>
#include <span>
#include <stdexcept>
#include <tuple>

// Warm questions: all contenders filled with the same facts in one process, their answers held against each other,
// then asked in turn.

namespace {

using namespace bench;

constexpr std::size_t QUESTIONS = 20'000;
constexpr std::uint64_t QUESTION_SEED = 2;

/// An answer that no question has. The compiler must not know.
volatile std::uint64_t impossibleAnswer = std::numeric_limits<std::uint64_t>::max();

volatile std::uint64_t answersTaken = 0;

template <typename Action>
double nanoseconds(Action action) {
    const double start = processorNanoseconds();
    action();
    return processorNanoseconds() - start;
}

using Questions = std::span<const Question>;

/// The questions that a contender is timed with.
template <typename Peer>
Questions asked(Questions questions) {
    if constexpr (requires { Peer::QUESTIONS; }) {
        return questions.first(Peer::QUESTIONS);
    } else {
        return questions;
    }
}

template <typename Ask, typename Peer>
void askAll(Peer& peer, Questions questions) {
    std::uint64_t sum = 0;
    for (const Question& question : questions) {
        sum += Ask::ask(peer, question);
    }
    answersTaken = sum;
}

/// The place of the next question depends on the answer to the one before.
template <typename Ask, typename Peer>
void askInTurn(Peer& peer, Questions questions) {
    const std::uint64_t impossible = impossibleAnswer;
    std::size_t place = 0;
    while (place < questions.size()) {
        const std::uint64_t answer = Ask::ask(peer, questions[place]);
        place += std::size_t{1} + static_cast<std::size_t>(answer == impossible);
    }
    answersTaken = place;
}

template <typename Ask, typename Expected, typename Peer>
void requireSameAnswers(Expected& expected, Peer& peer, Questions questions) {
    for (const Question& question : questions) {
        if (Ask::ask(expected, question) != Ask::ask(peer, question)) {
            throw std::runtime_error(std::string(Peer::NAME) + " answers otherwise: " + Ask::NAME + " of " +
                                     question.device + " " + question.key);
        }
    }
}

template <typename Expected, typename Peer>
void requireSameAnswers(Expected& expected, Peer& peer, Questions questions) {
    requireSameAnswers<AskOperations>(expected, peer, questions);
    requireSameAnswers<AskOptions>(expected, peer, questions);
    requireSameAnswers<AskAllows>(expected, peer, questions);
    requireSameAnswers<AskProperty>(expected, peer, questions);
    for (const Question& question : questions) {
        if (expected.property(question) != peer.property(question)) {
            throw std::runtime_error(std::string(Peer::NAME) + " has another text for " + question.device +
                                     " " + question.key);
        }
    }
}

template <typename Ask, typename Peer>
double allocationsEach(Peer& peer, Questions questions) {
    const std::size_t before = allocationsSoFar();
    askAll<Ask>(peer, questions);
    return static_cast<double>(allocationsSoFar() - before) / static_cast<double>(questions.size());
}

/// Asks all contenders one kind of question, in rounds, and reports the medians.
template <typename Ask, typename... Peers>
void compare(std::string_view size, Questions questions, std::tuple<Peers&...> peers) {
    const std::size_t count = sizeof...(Peers);
    std::vector<std::vector<double>> independent(count);
    std::vector<std::vector<double>> dependent(count);
    for (int round = 0; round < ROUNDS; ++round) {
        std::size_t contender = 0;
        const auto time = [&](auto& peer) {
            const Questions own = asked<std::remove_reference_t<decltype(peer)>>(questions);
            const auto each = static_cast<double>(own.size());
            askAll<Ask>(peer, own); // the caches are this contender's again
            independent[contender].push_back(nanoseconds([&] { askAll<Ask>(peer, own); }) / each);
            dependent[contender].push_back(nanoseconds([&] { askInTurn<Ask>(peer, own); }) / each);
            ++contender;
        };
        std::apply([&](auto&... peer) { (time(peer), ...); }, peers);
    }
    std::size_t contender = 0;
    const auto tell = [&](auto& peer) {
        const char* const name = std::remove_reference_t<decltype(peer)>::NAME;
        report(std::string(Ask::NAME) + ", independent", size, name, "ns", median(independent[contender]));
        report(std::string(Ask::NAME) + ", dependent", size, name, "ns", median(dependent[contender]));
        report(std::string(Ask::NAME) + ", allocations", size, name, "",
               allocationsEach<Ask>(peer, questions));
        ++contender;
    };
    std::apply([&](auto&... peer) { (tell(peer), ...); }, peers);
}

void run(const Size& size, const std::string& directory, const std::string& scratch) {
    const Facts facts = makeFacts(size, USUAL_SEED);
    const std::vector<Question> questions = makeQuestions(facts, QUESTIONS, QUESTION_SEED);
    ManagerPeer manager(directory);
    manager.load(facts);
    OrderedMapPeer orderedMap(facts);
    HashMapPeer hashMap(facts);
    SqlitePeer sqlite(facts, scratch);
    LmdbPeer lmdb(facts, scratch);
    JsonPeer json(facts);
    OnDemandPeer onDemand(facts);

    requireSameAnswers(orderedMap, manager, questions);
    requireSameAnswers(orderedMap, hashMap, questions);
    requireSameAnswers(orderedMap, sqlite, questions);
    requireSameAnswers(orderedMap, lmdb, questions);
    requireSameAnswers(orderedMap, json, questions);
    requireSameAnswers(orderedMap, onDemand, questions);

#ifdef TARVIK_BENCHMARK_HWDB
    HwdbPeer hwdb(facts, scratch);
    requireSameAnswers(orderedMap, hwdb, questions);
    const auto peers = std::tie(manager, orderedMap, hashMap, sqlite, lmdb, json, onDemand, hwdb);
#else
    const auto peers = std::tie(manager, orderedMap, hashMap, sqlite, lmdb, json, onDemand);
#endif
    compare<AskOperations>(size.name, questions, peers);
    compare<AskOptions>(size.name, questions, peers);
    compare<AskAllows>(size.name, questions, peers);
    compare<AskProperty>(size.name, questions, peers);
}

} // namespace

int main(int argumentCount, char** arguments) {
    const Size* const size = argumentCount == 4 ? sizeNamed(arguments[1]) : nullptr;
    if (size == nullptr) {
        std::fputs("usage: queries XS|S|M|L DATABASE SCRATCH_DIRECTORY\n", stderr);
        return EXIT_FAILURE;
    }
    try {
        run(*size, arguments[2], arguments[3]);
        return EXIT_SUCCESS;
    } catch (const std::exception& exception) {
        std::fprintf(stderr, "%s\n", exception.what());
        return EXIT_FAILURE;
    }
}
