// `batch`: one request a line in, one answer a line out, for the whole exported interface.
#include "commands/Commands.h"

#include "batch/Calls.h"
#include "batch/LineReader.h"
#include "batch/RequestReader.h"
#include "query/Tool.h"

#include <TarvikException.h>
#include <tarvik/ConstraintsManager.h>

#include <CLI/CLI.hpp>

#include <fmt/format.h>

namespace {

bool isBlank(std::string_view text) { return text.find_first_not_of(" \t\r") == std::string_view::npos; }

/// The result of a call, or the exception that it raised.
std::pair<const char*, Json> made(const PreparedCall& prepared, ConstraintsManager& manager) {
    try {
        return {"result", prepared.call->invoke(manager, prepared.arguments)};
    } catch (const TarvikException& exception) {
        return {"exception", {{"type", exception.typeName()}, {"line", exception.line()}}};
    }
}

/// Answers requests from the one manager, which the first of them makes.
class Answerer {
public:
    explicit Answerer(Messages& messages) : m_messages(messages) {}

    [[nodiscard]] Json answer(const LineReader::Line& line) {
        if (line.tooLong) {
            return error({}, fmt::format("a line longer than {} bytes", LineReader::LONGEST));
        }
        Request request = readRequest(line.text);
        if (!request.fault.empty()) {
            return error(std::move(request.id), request.fault);
        }
        const PreparedCall prepared = prepare(request);
        if (prepared.call == nullptr) {
            return error(std::move(request.id), prepared.fault);
        }
        m_ended = endsTheRun(*prepared.call);
        Json answer{{"id", std::move(request.id)}};
        auto [kind, value] = made(prepared, manager());
        answer[kind] = std::move(value);
        answer["messages"] = asJson(m_messages.take());
        return answer;
    }

    /// Has the manager been removed?
    [[nodiscard]] bool ended() const noexcept { return m_ended; }

private:
    static Json error(Json id, const std::string& fault) { return {{"id", std::move(id)}, {"error", fault}}; }

    static ConstraintsManager& manager() {
        ConstraintsManager* const manager = ConstraintsManager::getConstraintsManager();
        if (manager == nullptr) {
            throw std::bad_alloc();
        }
        return *manager;
    }

    Messages& m_messages;
    bool m_ended = false;
};

ExitCode run(Tool& tool) {
    tool.openDatabase();
    Output& output = tool.output();
    LineReader lines(output);
    Answerer answerer(tool.messages());
    while (!answerer.ended() && !output.closed()) {
        const std::optional<LineReader::Line> line = lines.next();
        if (!line) {
            break;
        }
        if (line->tooLong || !isBlank(line->text)) {
            output.write(oneLine(answerer.answer(*line)) + '\n');
        }
    }
    output.flush();
    return ExitCode::YES;
}

} // namespace

Action declareBatch(CLI::App&) { return run; }
