// Answers requests for the whole exported interface: one a line in, one answer a line out.
#include "batch/Batch.h"

#include "batch/Calls.h"
#include "batch/InputLines.h"
#include "batch/RequestReader.h"
#include "query/Tool.h"

#include <TarvikException.h>
#include <tarvik/ConstraintsManager.h>

#include <fmt/format.h>

namespace {

bool isBlank(std::string_view text) { return text.find_first_not_of(" \t\r") == std::string_view::npos; }

/// The result of a call, or the exception that it raised.
std::pair<const char*, Json> invoke(const PreparedCall& prepared, ConstraintsManager& manager) {
    try {
        return {"result", prepared.call->invoke(manager, prepared.arguments)};
    } catch (const TarvikException& exception) {
        return {"exception", {{"type", exception.what()}, {"line", exception.line()}}};
    }
}

/// Answers requests from the one manager, which the first of them makes.
class RequestHandler {
public:
    explicit RequestHandler(Messages& messages) : m_messages(messages) {}

    [[nodiscard]] Json answer(const InputLines::Line& line) {
        if (line.tooLong) {
            return error({}, fmt::format("a line longer than {} bytes", InputLines::LONGEST));
        }
        Request request = readRequest(line.text);
        if (!request.fault.empty()) {
            return error(std::move(request.id), request.fault);
        }
        const PreparedCall prepared = prepare(request);
        if (prepared.call == nullptr) {
            return error(std::move(request.id), prepared.fault);
        }
        m_ended = isShutdown(*prepared.call);
        Json answer{{"id", std::move(request.id)}};
        auto [kind, value] = invoke(prepared, manager());
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

} // namespace

namespace batch {

ExitCode run(Tool& tool) {
    tool.openDatabase();
    Output& output = tool.output();
    InputLines lines(output);
    RequestHandler handler(tool.messages());
    while (!handler.ended() && !output.closed()) {
        const std::optional<InputLines::Line> line = lines.next();
        if (!line) {
            break;
        }
        if (line->tooLong || !isBlank(line->text)) {
            output.write(oneLine(handler.answer(*line)) + '\n');
        }
    }
    output.flush();
    return ExitCode::YES;
}

} // namespace batch
