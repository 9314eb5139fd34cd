#include "measure/Results.h"
#include "peers/Question.h"

#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <exception>
#include <functional>
#include <stdexcept>
#include <string>
#include <thread>
#include <vector>

#include <fcntl.h>
#include <spawn.h>
#include <sys/resource.h>
#include <sys/wait.h>
#include <unistd.h>

// Small requests through a pipe to `tarvik batch`, their answers through another one.

namespace {

using namespace bench;

constexpr std::size_t REQUESTS = 200'000;

std::string requestsAbout(const Facts& facts) {
    std::string requests;
    for (const Question& question : makeQuestions(facts, REQUESTS, 3)) {
        requests += R"({"call":"getDeviceOperations","args":[")" + question.device + "\"," +
                    std::to_string(question.mode) + "," + std::to_string(question.output) + "]}\n";
    }
    return requests;
}

void writeAll(int descriptor, const std::string& text) {
    for (std::size_t done = 0; done < text.size();) {
        const ssize_t count = ::write(descriptor, text.data() + done, text.size() - done);
        if (count <= 0) {
            break;
        }
        done += static_cast<std::size_t>(count);
    }
    ::close(descriptor);
}

struct Rate {
    double byTheClock;
    double ofAProcessor;
};

/// Requests a second, in all and of the tool's own time on a processor.
Rate run(const char* tool, const char* database, const std::string& requests) {
    int input[2];
    int output[2];
    if (::pipe2(input, O_CLOEXEC) != 0 || ::pipe2(output, O_CLOEXEC) != 0) {
        throw std::runtime_error("no pipe");
    }
    const char* const command[] = {tool, "--database", database, "batch", nullptr};
    posix_spawn_file_actions_t actions;
    posix_spawn_file_actions_init(&actions);
    posix_spawn_file_actions_adddup2(&actions, input[0], STDIN_FILENO);
    posix_spawn_file_actions_adddup2(&actions, output[1], STDOUT_FILENO);
    pid_t process = 0;
    const auto start = std::chrono::steady_clock::now();
    const int fault =
        posix_spawn(&process, tool, &actions, nullptr, const_cast<char* const*>(command), environ);
    posix_spawn_file_actions_destroy(&actions);
    ::close(input[0]);
    ::close(output[1]);
    if (fault != 0) {
        throw std::runtime_error(std::string("can't run ") + tool);
    }
    std::thread writer(writeAll, input[1], std::cref(requests));
    std::string answers(std::size_t{1} << 16, '\0');
    std::size_t lines = 0;
    for (ssize_t count; (count = ::read(output[0], answers.data(), answers.size())) > 0;) {
        for (ssize_t place = 0; place < count; ++place) {
            lines += answers[static_cast<std::size_t>(place)] == '\n' ? 1U : 0U;
        }
    }
    writer.join();
    ::close(output[0]);
    rusage usage{};
    int status = 0;
    wait4(process, &status, 0, &usage);
    const std::chrono::duration<double> seconds = std::chrono::steady_clock::now() - start;
    if (lines != REQUESTS || status != 0) {
        throw std::runtime_error("not every request was answered");
    }
    const auto asSeconds = [](const timeval& time) {
        return static_cast<double>(time.tv_sec) + static_cast<double>(time.tv_usec) / 1e6;
    };
    return {static_cast<double>(REQUESTS) / seconds.count(),
            static_cast<double>(REQUESTS) / (asSeconds(usage.ru_utime) + asSeconds(usage.ru_stime))};
}

} // namespace

int main(int argumentCount, char** arguments) {
    const Size* const size = argumentCount == 4 ? sizeNamed(arguments[1]) : nullptr;
    if (size == nullptr) {
        std::fputs("usage: batch XS|S|M|L DATABASE TOOL\n", stderr);
        return EXIT_FAILURE;
    }
    try {
        const std::string requests = requestsAbout(makeFacts(*size, USUAL_SEED));
        std::vector<double> byTheClock;
        std::vector<double> ofAProcessor;
        for (int round = 0; round < ROUNDS; ++round) {
            const Rate rate = run(arguments[3], arguments[2], requests);
            byTheClock.push_back(rate.byTheClock);
            ofAProcessor.push_back(rate.ofAProcessor);
        }
        report("batch", size->name, "requests a second", "", median(byTheClock));
        report("batch", size->name, "requests a processor second", "", median(ofAProcessor));
        return EXIT_SUCCESS;
    } catch (const std::exception& exception) {
        std::fprintf(stderr, "%s\n", exception.what());
        return EXIT_FAILURE;
    }
}
