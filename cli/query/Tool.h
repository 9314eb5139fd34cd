#pragma once

#include "term/ExitCode.h"
#include "term/Messages.h"
#include "term/Output.h"
#include "term/Terminal.h"
#include "text/Json.h"

#include <functional>
#include <string>
#include <vector>

class ConstraintsManager;

/// The session of a command: the database, the manager, and the one place where answers are shown.
class Tool {
public:
    struct Settings {
        std::vector<std::string> databases;
        bool json = false;
        bool verbose = false;
        bool literal = false;
        Terminal::Colours colours = Terminal::Colours::AUTOMATIC;
    };

    explicit Tool(Settings settings);

    /// Opens the database; a second call has no effect.
    /// @throw CommandError (FAULT) if it is missing or cannot be read
    void openDatabase();

    /// From now on answers and errors are JSON objects.
    void useJson() noexcept { m_settings.json = true; }

    /// Chooses the directories of a database to be changed, which may have no base.acd yet.
    /// @return them, the uppermost layer first
    /// @throw CommandError (FAULT) if there are none, or one cannot be read
    [[nodiscard]] std::vector<std::string> openDirectories() const;

    /// The manager, with exceptions off, on the database.
    /// @throw CommandError (FAULT) as `openDatabase`
    [[nodiscard]] ConstraintsManager& manager();

    /// The databases that the command line names.
    [[nodiscard]] const std::vector<std::string>& databases() const noexcept { return m_settings.databases; }

    [[nodiscard]] Messages& messages() noexcept { return m_messages; }
    [[nodiscard]] Output& output() noexcept { return m_output; }

    /// Shows what a command found, as text or as a JSON object, after the messages that came with it.
    /// @param facts anything with `std::string asText(facts, const Terminal&)` and `Json asJson(facts)`
    /// @return the status
    template <typename Facts>
    [[nodiscard]] ExitCode answer(const Facts& facts, ExitCode status = ExitCode::YES) {
        if (m_settings.json) {
            showJson(asJson(facts));
        } else {
            showText(asText(facts, m_terminal));
        }
        return status;
    }

    /// Are names passed to the manager as they were typed?
    [[nodiscard]] bool isLiteral() const noexcept { return m_settings.literal; }

    /// Shows the user something besides the answer, on standard error.
    void note(const std::string& text) const;

    /// The same, and adds a member to the JSON object of the answer.
    void note(const std::string& text, const char* member, Json value);

    /// Adds a member to the JSON object of the answer that follows.
    void addMember(const char* member, Json value);

    /// Runs a command and returns the JSON object that it would write with `--json`, instead of writing it. Its notes
    /// are dropped.
    /// @throw CommandError if there is no answer
    [[nodiscard]] Json answerOf(const std::function<ExitCode(Tool&)>& command);

    /// Shows why there is no answer.
    /// @return the status
    [[nodiscard]] ExitCode fail(const CommandError& failure);

private:
    void showText(const std::string& text);
    void showJson(const Json& facts);
    void writeJson(const Json& facts, const std::vector<Messages::Message>& messages);

    /// Info and debug messages go to standard error; status messages go where text answers go, while in JSON
    /// they are in the object only. Debug messages are shown only with `--verbose`.
    std::vector<Messages::Message> showMessages();
    void noteStartUpFault(const std::string& message) const;

    Settings m_settings;
    Messages m_messages;
    Output m_output;
    Terminal m_terminal;
    bool m_opened = false;
    Json m_remarks = Json::object(); ///< further members of the JSON object
    Json* m_captured = nullptr;      ///< takes the JSON object in place of standard output
};
