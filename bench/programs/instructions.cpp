#include "generate/DatabaseText.h"
#include "measure/Ask.h"
#include "peers/ManagerPeer.h"

#include <AcdStore.h>

#include <cstdio>
#include <cstdlib>
#include <string>

// Asks one kind of question, warm, so and so often. Two runs that differ only in how often tell what one question
// costs: `scripts/check-instructions` counts them.

namespace {

using namespace bench;

template <typename Ask>
std::uint64_t ask(ManagerPeer& manager, const std::vector<Question>& questions) {
    std::uint64_t sum = 0;
    for (const Question& question : questions) {
        sum += Ask::ask(manager, question);
    }
    return sum;
}

std::uint64_t ask(const std::string& kind, ManagerPeer& manager, const std::vector<Question>& questions) {
    if (kind == AskOperations::NAME) {
        return ask<AskOperations>(manager, questions);
    }
    if (kind == AskOptions::NAME) {
        return ask<AskOptions>(manager, questions);
    }
    if (kind == AskAllows::NAME) {
        return ask<AskAllows>(manager, questions);
    }
    return ask<AskProperty>(manager, questions);
}

} // namespace

int main(int argumentCount, char** arguments) {
    if (argumentCount != 3) {
        std::fputs("usage: instructions operations|options|check|property ROUNDS\n", stderr);
        return EXIT_FAILURE;
    }
    constexpr std::size_t QUESTIONS = 1000;
    const Facts facts = makeFacts(*sizeNamed("S"), USUAL_SEED);
    const std::vector<Question> questions = makeQuestions(facts, QUESTIONS, 2);
    AcdStore::setMemoryFiles(databaseText(facts));
    ManagerPeer manager(*ConstraintsManager::getConstraintsManager());
    std::uint64_t sum = 0;
    for (long round = std::strtol(arguments[2], nullptr, 10); round >= 0; --round) {
        sum = ask(arguments[1], manager, questions);
    }
    return sum == 0 ? EXIT_FAILURE : EXIT_SUCCESS;
}
