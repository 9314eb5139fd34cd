// Shows the answers, messages and errors of all commands alike, as text or as JSON.
#include "query/Tool.h"

#include "query/ApplicationFault.h"
#include "query/Database.h"
#include "term/Streams.h"

#include <tarvik/ConstraintsManager.h>

#include <fmt/format.h>

#include <utility>

using Channel = Port_MsgManData::Channel;

Tool::Tool(Settings settings)
    : m_settings(std::move(settings)), m_terminal(streams::OUTPUT, m_settings.colours) {}

void Tool::openDatabase() {
    if (!m_opened) {
        ::openDatabase(directoriesOf(m_settings.databases));
        m_opened = true;
    }
}

std::vector<std::string> Tool::openDirectories() const {
    return ::openDirectories(directoriesOf(m_settings.databases));
}

ConstraintsManager& Tool::manager() {
    openDatabase();
    ConstraintsManager* const manager = ConstraintsManager::getConstraintsManager();
    if (manager == nullptr) {
        throw std::bad_alloc();
    }
    manager->setExceptions(false);
    return *manager;
}

void Tool::note(const std::string& text) const {
    if (m_captured == nullptr) {
        writeError("tarvik: " + text);
    }
}

void Tool::note(const std::string& text, const char* member, Json value) {
    note(text);
    addMember(member, std::move(value));
}

void Tool::addMember(const char* member, Json value) { m_remarks[member] = std::move(value); }

Json Tool::answerOf(const std::function<ExitCode(Tool&)>& command) {
    Json answer;
    const bool json = std::exchange(m_settings.json, true);
    m_captured = &answer;
    m_remarks = Json::object();
    const auto restore = [&] {
        m_captured = nullptr;
        m_settings.json = json;
    };
    try {
        static_cast<void>(command(*this));
    } catch (...) {
        restore();
        throw;
    }
    restore();
    return answer;
}

ExitCode Tool::fail(const CommandError& failure) {
    const std::vector<Messages::Message> messages = showMessages();
    note(failure.what());
    try {
        if (m_settings.json) {
            writeJson({{"error", failure.what()}}, messages);
        }
        m_output.flush();
    } catch (const CommandError&) {
        // The output itself failed, which is reported already.
        return ExitCode::FAULT;
    }
    return failure.status();
}

void Tool::showText(const std::string& text) {
    showMessages();
    m_output.write(text);
    m_output.flush();
}

void Tool::showJson(const Json& facts) {
    writeJson(facts, showMessages());
    if (m_captured == nullptr) {
        m_output.flush();
    }
}

void Tool::writeJson(const Json& facts, const std::vector<Messages::Message>& messages) {
    Json document{{"version", 1}};
    document.update(facts);
    document.update(m_remarks);
    document["messages"] = asJson(messages);
    if (m_captured != nullptr) {
        *m_captured = std::move(document);
    } else {
        m_output.write(oneLine(document) + '\n');
    }
}

/// The manager's own message does not say where the start-up ended.
void Tool::noteStartUpFault(const std::string& message) const {
    if (!isStartUpFault(message)) {
        return;
    }
    if (const std::optional<catalogue::SourceText> fault = findStartUpFault()) {
        note(fmt::format("{}: \"{}\" ends the start-up, in applications, too: nothing after it is read",
                         catalogue::asText(fault->origin), fault->text));
    }
}

std::vector<Messages::Message> Tool::showMessages() {
    std::vector<Messages::Message> shown;
    for (Messages::Message& message : m_messages.take()) {
        if (message.channel == Channel::DEBUG && !m_settings.verbose) {
            continue;
        }
        if (message.channel != Channel::STATUS) {
            if (m_captured == nullptr) {
                writeError(message.text);
            }
            noteStartUpFault(message.text);
        } else if (!m_settings.json) {
            m_output.write(m_terminal.isTerminal() ? printableLines(message.text) : message.text);
        }
        shown.push_back(std::move(message));
    }
    return shown;
}
