#include "measure/Results.h"
#include "peers/ManagerPeer.h"
#include "peers/MapPeers.h"

#include <cstdio>
#include <cstdlib>
#include <fstream>
#include <functional>
#include <optional>
#include <string>

#include <malloc.h>
#include <sys/resource.h>

// One contender fills itself with all facts, in a process of its own: how long it works for that, and how much
// memory it comes to at most.

namespace {

using namespace bench;

double processorSeconds() {
    rusage usage{};
    getrusage(RUSAGE_SELF, &usage);
    const auto seconds = [](const timeval& time) {
        return static_cast<double>(time.tv_sec) + static_cast<double>(time.tv_usec) / 1e6;
    };
    return seconds(usage.ru_utime) + seconds(usage.ru_stime);
}

/// A line of the process's status, in kibibytes.
double kibibytes(const std::string& name) {
    std::ifstream status("/proc/self/status");
    for (std::string line; std::getline(status, line);) {
        if (line.compare(0, name.size(), name) == 0) {
            return std::strtod(line.c_str() + name.size() + 1, nullptr);
        }
    }
    return 0;
}

/// From now on the peak counts from what is in use now; what was used before is given back.
void resetPeak() {
    malloc_trim(0);
    std::ofstream("/proc/self/clear_refs") << "5";
}

void measure(const Size& size, const char* contender, const std::function<void()>& fill) {
    resetPeak();
    const double before = kibibytes("VmRSS");
    const double start = processorSeconds();
    fill();
    const double seconds = processorSeconds() - start;
    report("loading", size.name, contender, "ms", seconds * 1e3);
    report("loading, peak memory", size.name, contender, "MiB", (kibibytes("VmHWM") - before) / 1024);
}

} // namespace

int main(int argumentCount, char** arguments) {
    const Size* const size = argumentCount == 4 ? sizeNamed(arguments[2]) : nullptr;
    if (size == nullptr) {
        std::fputs("usage: loading manager|map XS|S|M|L DATABASE\n", stderr);
        return EXIT_FAILURE;
    }
    const Facts facts = makeFacts(*size, USUAL_SEED);
    if (std::string(arguments[1]) == "manager") {
        std::optional<ManagerPeer> manager;
        measure(*size, ManagerPeer::NAME, [&] {
            manager.emplace(arguments[3]);
            manager->load(facts);
        });
    } else {
        std::optional<HashMapPeer> map;
        measure(*size, HashMapPeer::NAME, [&] { map.emplace(facts); });
    }
    return EXIT_SUCCESS;
}
