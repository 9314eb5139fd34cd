#include "generate/Facts.h"
#include "measure/Results.h"

#include <array>
#include <cstdio>
#include <cstdlib>
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
};

/// Runs a program to its end, its output thrown away.
/// @return the milliseconds that it took of a processor
double run(const Program& program) {
    std::vector<char*> arguments;
    for (const std::string& argument : program.command) {
        arguments.push_back(const_cast<char*>(argument.c_str()));
    }
    arguments.push_back(nullptr);
    posix_spawn_file_actions_t actions;
    posix_spawn_file_actions_init(&actions);
    posix_spawn_file_actions_addopen(&actions, STDOUT_FILENO, "/dev/null", O_WRONLY, 0);
    pid_t process = 0;
    const int fault = posix_spawn(&process, arguments.front(), &actions, nullptr, arguments.data(), environ);
    posix_spawn_file_actions_destroy(&actions);
    int status = 0;
    rusage usage{};
    if (fault != 0 || wait4(process, &status, 0, &usage) != process || !WIFEXITED(status) ||
        WEXITSTATUS(status) > 1) {
        throw std::runtime_error("can't run " + program.command.front());
    }
    const auto milliseconds = [](const timeval& time) {
        return static_cast<double>(time.tv_sec) * 1e3 + static_cast<double>(time.tv_usec) / 1e3;
    };
    return milliseconds(usage.ru_utime) + milliseconds(usage.ru_stime);
}

void compare(std::string_view size, const std::vector<Program>& programs, int rounds) {
    std::vector<std::vector<double>> times(programs.size());
    for (int round = 0; round < rounds; ++round) {
        for (std::size_t place = 0; place < programs.size(); ++place) {
            times[place].push_back(run(programs[place]));
        }
    }
    for (std::size_t place = 0; place < programs.size(); ++place) {
        report(programs[place].measure, size, "process", "ms", median(times[place]));
    }
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
        // Short ones, so many rounds.
        compare(size->name,
                {{"nothing", {programs + "/tarvik_bench_nothing"}},
                 {"start-up", {programs + "/tarvik_bench_start_up", database}},
                 {"first question", {programs + "/tarvik_bench_first_question", database, device}}},
                4 * ROUNDS);
        compare(size->name, {{"dump operations", {tool, "--database", database, "dump", "operations"}}},
                ROUNDS);
        return EXIT_SUCCESS;
    } catch (const std::exception& exception) {
        std::fprintf(stderr, "%s\n", exception.what());
        return EXIT_FAILURE;
    }
}
