#include "generate/DatabaseText.h"

#include <cstdio>
#include <cstdlib>
#include <exception>

// Writes a database of a given size, the same one for the same seed.

int main(int argumentCount, char** arguments) {
    const bench::Size* const size = argumentCount >= 3 ? bench::sizeNamed(arguments[1]) : nullptr;
    if (size == nullptr || argumentCount > 4) {
        std::fputs("usage: generate XS|S|M|L DIRECTORY [SEED]\n", stderr);
        return EXIT_FAILURE;
    }
    try {
        const std::uint64_t seed =
            argumentCount == 4 ? std::strtoull(arguments[3], nullptr, 10) : bench::USUAL_SEED;
        bench::writeDatabase(bench::makeFacts(*size, seed), arguments[2]);
        return EXIT_SUCCESS;
    } catch (const std::exception& exception) {
        std::fprintf(stderr, "%s\n", exception.what());
        return EXIT_FAILURE;
    }
}
