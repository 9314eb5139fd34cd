#include "measure/Ask.h"
#include "measure/Clock.h"
#include "measure/Results.h"
#include "peers/ManagerPeer.h"

#include <tarvik/tarvik.h>

#include <cstdio>
#include <cstdlib>
#include <exception>
#include <stdexcept>
#include <string>
#include <vector>

// The same warm questions through C++ and through C, in one process: both ask the same manager.

namespace {

using namespace bench;

constexpr std::size_t QUESTIONS = 20'000;

/// The manager through the C interface.
class CPeer {
public:
    [[nodiscard]] std::uint64_t operations(const Question& question) {
        std::uint32_t mask = 0;
        check(tarvik_get_device_operations(question.device.c_str(), static_cast<int>(question.mode),
                                           static_cast<int>(question.output), &mask));
        return mask;
    }
    [[nodiscard]] std::string_view property(const Question& question) {
        const char* value = nullptr;
        check(tarvik_get_device_string_property(question.device.c_str(), question.key.c_str(), &value));
        return value;
    }

private:
    static void check(tarvik_status status) {
        if (status != TARVIK_OK) {
            throw std::runtime_error(tarvik_last_error()->text);
        }
    }
};

volatile std::uint64_t answersTaken = 0;

template <typename Ask, typename Peer>
double nanosecondsEach(Peer& peer, const std::vector<Question>& questions) {
    std::uint64_t sum = 0;
    const double start = processorNanoseconds();
    for (const Question& question : questions) {
        sum += Ask::ask(peer, question);
    }
    const double taken = processorNanoseconds() - start;
    answersTaken = sum;
    return taken / static_cast<double>(questions.size());
}

template <typename Ask>
void compare(const Size& size, const std::vector<Question>& questions, ManagerPeer& manager,
             CPeer& throughC) {
    std::vector<double> cpp;
    std::vector<double> c;
    for (int round = 0; round < ROUNDS; ++round) {
        for (const Question& question : questions) {
            if (Ask::ask(manager, question) != Ask::ask(throughC, question)) {
                throw std::runtime_error("C and C++ answer differently");
            }
        }
        cpp.push_back(nanosecondsEach<Ask>(manager, questions));
        c.push_back(nanosecondsEach<Ask>(throughC, questions));
    }
    const std::string measure = std::string("call, ") + Ask::NAME;
    report(measure, size.name, "C++", "ns", median(cpp));
    report(measure, size.name, "C", "ns", median(c));
}

} // namespace

int main(int argumentCount, char** arguments) {
    const Size* const size = argumentCount == 3 ? sizeNamed(arguments[1]) : nullptr;
    if (size == nullptr) {
        std::fputs("usage: bindings XS|S|M|L DATABASE\n", stderr);
        return EXIT_FAILURE;
    }
    try {
        const Facts facts = makeFacts(*size, USUAL_SEED);
        const std::vector<Question> questions = makeQuestions(facts, QUESTIONS, 4);
        ManagerPeer manager(arguments[2]);
        manager.load(facts);
        CPeer throughC;
        compare<AskOperations>(*size, questions, manager, throughC);
        compare<AskProperty>(*size, questions, manager, throughC);
        return EXIT_SUCCESS;
    } catch (const std::exception& exception) {
        std::fprintf(stderr, "%s\n", exception.what());
        return EXIT_FAILURE;
    }
}
