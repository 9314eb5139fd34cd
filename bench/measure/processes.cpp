#include "generate/Facts.h"
#include "measure/Results.h"

#include <array>
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <stdexcept>
#include <string>
#include <vector>

#include <fcntl.h>
#include <spawn.h>
#include <sys/resource.h>
#include <sys/wait.h>
#include <unistd.h>

// Whole processes, in rounds: what a program costs that does nothing, one that makes the manager, and one that asks a
// question; and the tool over the whole database.

namespace {

using namespace bench;

struct Program {
    std::string measure;
    std::vector<std::string> command;
    int lastStatus = 1; ///< that is no failure
};

/// What a run of a program took, of itself and of the processes that it started.
struct Cost {
    double processor; ///< ms
    double elapsed;   ///< ms by the clock: what works side by side takes less of it
    double memory;    ///< MiB at the peak of the largest process
};

/// Runs a program to its end, its output thrown away.
Cost run(const Program& program) {
    std::vector<char*> arguments;
    for (const std::string& argument : program.command) {
        arguments.push_back(const_cast<char*>(argument.c_str()));
    }
    arguments.push_back(nullptr);
    posix_spawn_file_actions_t actions;
    posix_spawn_file_actions_init(&actions);
    posix_spawn_file_actions_addopen(&actions, STDOUT_FILENO, "/dev/null", O_WRONLY, 0);
    posix_spawn_file_actions_addopen(&actions, STDERR_FILENO, "/dev/null", O_WRONLY, 0);
    pid_t process = 0;
    const auto start = std::chrono::steady_clock::now();
    const int fault = posix_spawn(&process, arguments.front(), &actions, nullptr, arguments.data(), environ);
    posix_spawn_file_actions_destroy(&actions);
    int status = 0;
    rusage usage{};
    if (fault != 0 || wait4(process, &status, 0, &usage) != process || !WIFEXITED(status) ||
        WEXITSTATUS(status) > program.lastStatus) {
        throw std::runtime_error("can't run " + program.command.front());
    }
    const auto milliseconds = [](const timeval& time) {
        return static_cast<double>(time.tv_sec) * 1e3 + static_cast<double>(time.tv_usec) / 1e3;
    };
    const std::chrono::duration<double, std::milli> elapsed = std::chrono::steady_clock::now() - start;
    return {milliseconds(usage.ru_utime) + milliseconds(usage.ru_stime), elapsed.count(),
            static_cast<double>(usage.ru_maxrss) / 1024};
}

void compare(std::string_view size, const std::vector<Program>& programs, int rounds) {
    std::vector<std::vector<double>> times(programs.size());
    for (int round = 0; round < rounds; ++round) {
        for (std::size_t place = 0; place < programs.size(); ++place) {
            times[place].push_back(run(programs[place]).processor);
        }
    }
    for (std::size_t place = 0; place < programs.size(); ++place) {
        report(programs[place].measure, size, "process", "ms", median(times[place]));
    }
}

/// A copy of a database with an index of its own, beside it.
std::string copyWithIndex(const std::string& tool, const std::string& database, const std::string& name) {
    std::string copy = database + "-" + name;
    std::filesystem::remove_all(copy);
    std::filesystem::copy(database, copy);
    run({"index", {tool, "index", copy}});
    return copy;
}

/// A copy of a database, beside it, in which an option of base.acd is unknown.
std::string copyWithFault(const std::string& database) {
    std::string copy = database + "-faulty";
    std::filesystem::remove_all(copy);
    std::filesystem::copy(database, copy);
    std::ofstream(copy + "/base.acd", std::ios::app) << "PROGRAM_OPTION = NOSUCH,Bscan,USB2\n";
    return copy;
}

/// What works through a whole database: its time by the clock, and its memory.
void measureWhole(std::string_view size, const Program& program) {
    std::vector<double> elapsed;
    std::vector<double> memory;
    for (int round = 0; round < ROUNDS; ++round) {
        const Cost cost = run(program);
        elapsed.push_back(cost.elapsed);
        memory.push_back(cost.memory);
    }
    report(program.measure + ", by the clock", size, "process", "ms", median(elapsed));
    report(program.measure + ", peak memory", size, "process", "MiB", median(memory));
}

} // namespace

int main(int argumentCount, char** arguments) {
    const Size* const size = argumentCount == 5 ? sizeNamed(arguments[1]) : nullptr;
    if (size == nullptr) {
        std::fputs("usage: processes XS|S|M|L DATABASE PROGRAM_DIRECTORY TOOL\n", stderr);
        return EXIT_FAILURE;
    }
    const std::string database = arguments[2];
    const std::string programs = arguments[3];
    const std::string tool = arguments[4];
    const std::string device = makeFacts(*size, USUAL_SEED).families.back().devices.back().name;
    try {
        // A copy with an index, and one whose index is not current any more.
        const std::string indexed = copyWithIndex(tool, database, "indexed");
        const std::string stale = copyWithIndex(tool, database, "stale");
        std::ofstream(stale + "/base.acd", std::ios::app) << "# changed\n";
        const std::string question = programs + "/tarvik_bench_first_question";
        const auto check = [&](const std::string& directory) -> std::vector<std::string> {
            return {tool, "--database", directory, "check", device, "--mode", "BS"};
        };
        // Short ones, so many rounds.
        compare(size->name,
                {{"nothing", {programs + "/tarvik_bench_nothing"}},
                 {"start-up", {programs + "/tarvik_bench_start_up", database}},
                 {"first question", {question, database, device}},
                 {"first question, with an index", {question, indexed, device}},
                 {"first question, with a stale index", {question, stale, device}},
                 {"tarvik check", check(database)},
                 {"tarvik check, with an index", check(indexed)}},
                4 * ROUNDS);
        compare(size->name, {{"dump operations", {tool, "--database", database, "dump", "operations"}}},
                ROUNDS);
        measureWhole(size->name, {"lint", {tool, "lint", database}});
        for (const auto& [directory, suffix] :
             {std::pair(database, std::string()), {copyWithFault(database), std::string(", with a fault")}}) {
            const int lastStatus = suffix.empty() ? 1 : 2; // some devices have no answer
            const auto measure = [&](const std::string& name, std::vector<std::string> command) {
                measureWhole(size->name, {name + suffix, std::move(command), lastStatus});
            };
            measure("which, property",
                    {tool, "--database", directory, "which", "--property", "VENDOR=Korvel"});
            measure("diff", {tool, "diff", directory, directory});
            measure("report", {tool, "--database", directory, "report", "--file", "-"});
        }
        return EXIT_SUCCESS;
    } catch (const std::exception& exception) {
        std::fprintf(stderr, "%s\n", exception.what());
        return EXIT_FAILURE;
    }
}
