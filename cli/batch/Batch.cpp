// Answers requests for the whole exported interface: one a line in, one answer a line out.
#include "batch/Batch.h"

#include "batch/Calls.h"
#include "batch/InputLines.h"
#include "batch/RequestReader.h"
#include "query/Tool.h"
#include "text/Suggest.h"

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
        return {"exception", {{"type", exception.typeName()}, {"line", exception.line()}}};
    }
}

/// Answers requests from the one manager, which the first of them makes.
class RequestHandler {
public:
    RequestHandler(Messages& messages, const std::vector<batch::Handler>& handlers)
        : m_messages(messages), m_handlers(handlers) {}

    /// The answer on one line.
    [[nodiscard]] std::string answerText(const InputLines::Line& line) {
        m_idText.clear();
        const Json object = answer(line);
        std::string text = oneLine(object);
        if (!m_idText.empty()) {
            // The id is the first member.
            constexpr std::size_t START = std::string_view(R"({"id":)").size();
            text.replace(START, oneLine(object["id"]).size(), m_idText);
        }
        return text;
    }

    /// Has the manager been removed?
    [[nodiscard]] bool ended() const noexcept { return m_ended; }

private:
    [[nodiscard]] Json answer(const InputLines::Line& line) {
        if (line.tooLong) {
            return error({}, fmt::format("a line longer than {} bytes", InputLines::MAX_LENGTH));
        }
        Request request = readRequest(line.text);
        m_idText = request.idText;
        if (!request.fault.empty()) {
            return error(std::move(request.id), request.fault);
        }
        const PreparedCall prepared = prepare(request);
        if (prepared.isUnknown) {
            return answerBesides(std::move(request));
        }
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

    /// Answers what is no method of the interface.
    [[nodiscard]] Json answerBesides(Request request) {
        std::vector<std::string> names = callNames();
        names.emplace_back(HELP);
        for (const batch::Handler& handler : m_handlers) {
            names.push_back(handler.name);
            if (handler.name == request.call) {
                return answerBy(handler, std::move(request));
            }
        }
        if (request.call != HELP) {
            return error(std::move(request.id), fmt::format("there is no call \"{}\"{}", request.call,
                                                            didYouMean(request.call, names)));
        }
        if (!request.arguments.empty()) {
            return error(std::move(request.id), "help takes ()");
        }
        return {{"id", std::move(request.id)}, {"result", help()}, {"messages", Json::array()}};
    }

    [[nodiscard]] Json answerBy(const batch::Handler& handler, Request request) {
        try {
            Json result = handler.invoke(request.arguments);
            return {{"id", std::move(request.id)},
                    {"result", std::move(result)},
                    {"messages", asJson(m_messages.take())}};
        } catch (const CommandError& fault) {
            return error(std::move(request.id), fault.what());
        }
    }

    [[nodiscard]] Json help() const {
        Json calls = describeCalls();
        for (const batch::Handler& handler : m_handlers) {
            calls.push_back(handler.description);
        }
        calls.push_back({{"call", HELP}, {"args", Json::array()}, {"result", "array of calls"}});
        return calls;
    }

    static Json error(Json id, const std::string& fault) { return {{"id", std::move(id)}, {"error", fault}}; }

    static ConstraintsManager& manager() {
        ConstraintsManager* const manager = ConstraintsManager::getConstraintsManager();
        if (manager == nullptr) {
            throw std::bad_alloc();
        }
        return *manager;
    }

    static constexpr const char* HELP = "help";

    Messages& m_messages;
    const std::vector<batch::Handler>& m_handlers;
    std::string m_idText; ///< of the request, as it was written
    bool m_ended = false;
};

} // namespace

namespace batch {

ExitCode run(Tool& tool, const std::vector<Handler>& handlers) {
    tool.openDatabase();
    Output& output = tool.output();
    InputLines lines(output);
    RequestHandler handler(tool.messages(), handlers);
    while (!handler.ended() && !output.closed()) {
        const std::optional<InputLines::Line> line = lines.next();
        if (!line) {
            break;
        }
        if (line->tooLong || !isBlank(line->text)) {
            output.write(handler.answerText(*line) + '\n');
        }
    }
    output.flush();
    return ExitCode::YES;
}

} // namespace batch
