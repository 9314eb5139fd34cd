#include "measure/Clock.h"
#include "measure/Results.h"

#include <AcdReader.h>
#include <AcdStore.h>
#include <PM_DEVKEY.h>

#include <cstdio>
#include <cstdlib>
#include <iterator>
#include <string>
#include <vector>

// Reading lists item by item: what an item costs in a short list and in the longest one that an index reaches.

namespace {

using namespace bench;

constexpr int LONGEST = 32'767;

std::string listOf(int items) {
    std::string list;
    for (int item = 0; item < items; ++item) {
        list += (item == 0 ? "" : ",") + ("ITEM" + std::to_string(10'000 + item));
    }
    return list;
}

/// The nanoseconds that an item takes when a list is read from its beginning to its end.
double readAll(PM_DEVKEY& accessor, const std::string& key, int items) {
    const int repeats = LONGEST / items;
    const double start = processorNanoseconds();
    for (int repeat = 0; repeat < repeats; ++repeat) {
        for (int item = 0; item < items; ++item) {
            if (accessor.getstringbykey(key.c_str(), ",", static_cast<short>(item), nullptr, 0) == nullptr) {
                std::abort();
            }
        }
    }
    return (processorNanoseconds() - start) / (static_cast<double>(items) * repeats);
}

} // namespace

int main() {
    constexpr int SIZES[] = {100, 1000, 10'000, LONGEST};
    std::string text;
    for (const int size : SIZES) {
        text += "LIST" + std::to_string(size) + " = " + listOf(size) + "\n";
    }
    AcdStore::setMemoryFiles({{"base.acd", text}});
    const AcdReader reader;
    std::vector<std::vector<double>> times(std::size(SIZES));
    for (int round = 0; round < ROUNDS; ++round) {
        for (std::size_t place = 0; place < std::size(SIZES); ++place) {
            times[place].push_back(
                readAll(*reader.getDevkey(), "LIST" + std::to_string(SIZES[place]), SIZES[place]));
        }
    }
    for (std::size_t place = 0; place < std::size(SIZES); ++place) {
        report("item of a list", std::to_string(SIZES[place]), "manager", "ns", median(times[place]));
    }
    return EXIT_SUCCESS;
}
