// Feeds lines to `tarvik batch`, by its own code in this process, on the demonstration database: every request
// must get one answer, in a form that can be read, and no fault may end the run.
#include "Input.h"

#include "batch/Batch.h"
#include "query/Tool.h"
#include "support/TarvikTestPeer.h"
#include "text/Json.h"

#include <sys/mman.h>
#include <unistd.h>

namespace {

/// A file in memory that stands for one of the standard streams.
class Stream {
public:
    explicit Stream(int descriptor) : m_descriptor(descriptor) {
        const int file = ::memfd_create("stream", 0);
        if (file < 0 || ::dup2(file, descriptor) < 0) {
            fuzz::fail("can't put a file in place of a standard stream");
        }
        ::close(file);
    }

    void fill(std::string_view text) const {
        if (::ftruncate(m_descriptor, 0) != 0 ||
            ::pwrite(m_descriptor, text.data(), text.size(), 0) != static_cast<ssize_t>(text.size())) {
            fuzz::fail("can't fill a standard stream");
        }
        ::lseek(m_descriptor, 0, SEEK_SET);
    }

    [[nodiscard]] std::string content() const {
        const off_t size = ::lseek(m_descriptor, 0, SEEK_END);
        std::string text(static_cast<std::size_t>(size), '\0');
        if (::pread(m_descriptor, text.data(), text.size(), 0) != size) {
            fuzz::fail("can't read a standard stream");
        }
        return text;
    }

private:
    int m_descriptor;
};

std::vector<std::string> linesOf(std::string_view text) {
    std::vector<std::string> lines;
    while (!text.empty()) {
        const std::string_view line = text.substr(0, text.find('\n'));
        lines.emplace_back(line);
        text.remove_prefix(std::min(text.size(), line.size() + 1));
    }
    return lines;
}

std::vector<std::string> requestsIn(std::string_view text) {
    std::vector<std::string> requests = linesOf(text);
    std::erase_if(requests, [](const std::string& line) {
        return line.find_first_not_of(" \t\r") == std::string::npos;
    });
    return requests;
}

bool removesTheManager(const std::string& request) {
    const Json json = Json::parse(request, nullptr, false);
    return json.is_object() && json.value("call", Json()) == "RemoveConstraintsManager";
}

void expectAnswer(const std::string& line) {
    const Json answer = Json::parse(line, nullptr, false);
    if (!answer.is_object() || !answer.contains("id")) {
        fuzz::fail("no answer: " + line);
    }
    const bool refused = answer.contains("error");
    const auto results = answer.count("result") + answer.count("exception");
    if (results != (refused ? 0U : 1U) || answer.contains("messages") == refused) {
        fuzz::fail("half an answer: " + line);
    }
}

void run() {
    TarvikTestPeer::reset();
    Tool tool({{TARVIK_SOURCE_DIRECTORY "/database"}, false, false});
    static_cast<void>(batch::run(tool, {}));
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    static const Stream INPUT(STDIN_FILENO);
    static const Stream OUTPUT(STDOUT_FILENO);
    const std::string_view text = fuzz::Input(data, size).rest();
    INPUT.fill(text);
    OUTPUT.fill("");
    run();
    const std::vector<std::string> requests = requestsIn(text);
    const std::vector<std::string> answers = linesOf(OUTPUT.content());
    const bool ended = !answers.empty() && answers.size() <= requests.size() &&
                       removesTheManager(requests[answers.size() - 1]);
    if (ended) {
        TarvikTestPeer::forgetManager();
    } else if (answers.size() != requests.size()) {
        fuzz::fail(std::to_string(requests.size()) + " requests, " + std::to_string(answers.size()) +
                   " answers");
    }
    for (const std::string& answer : answers) {
        expectAnswer(answer);
    }
    return 0;
}
