// Reads the command line and runs one command.
#include "app/Help.h"
#include "app/ManualPage.h"
#include "app/Parser.h"
#include "app/completion/Completion.h"
#include "term/Streams.h"

#include <TarvikException.h>

#include <fmt/format.h>

#include <algorithm>

namespace {

Terminal::Colours coloursOf(const std::string& when) {
    if (when == "auto") {
        return Terminal::Colours::AUTOMATIC;
    }
    return when == "always" ? Terminal::Colours::ALWAYS : Terminal::Colours::NEVER;
}

ExitCode show(const std::string& text) {
    Output output;
    output.write(text);
    output.flush();
    return ExitCode::YES;
}

ExitCode runCommand(const CommandLine& line, const DeclaredCommand& command) {
    Tool tool(line.settings);
    try {
        return command.action(tool);
    } catch (const CommandError& error) {
        return tool.fail(error);
    } catch (const TarvikException& fault) {
        return tool.fail({ExitCode::FAULT, fmt::format("the database cannot be read: {}", fault.what())});
    }
}

ExitCode run(const std::vector<std::string>& words) {
    CommandLine line;
    // Not for people: the completions of the shells ask for the words that may continue an unfinished command line,
    // and scripts/update-manual for the manual page.
    if (!words.empty() && words.front() == "complete") {
        return completion::complete(line, {words.begin() + 1, words.end()});
    }
    if (words == std::vector<std::string>{"manual"}) {
        return show(manualSections(line));
    }
    if (words.empty()) {
        return show(helpText(line, nullptr));
    }
    const DeclaredCommand* command = nullptr;
    try {
        command = parse(line, words);
    } catch (const CommandError& error) {
        // What comes after the mistake was not parsed.
        line.settings.json = std::find(words.begin(), words.end(), "--json") != words.end();
        return Tool(line.settings).fail(error);
    }
    if (line.help) {
        return show(helpText(line, command));
    }
    if (line.version) {
        return show("tarvik " TARVIK_VERSION "\n");
    }
    line.settings.colours = coloursOf(line.colours);
    return runCommand(line, *command);
}

} // namespace

int main(int argc, char** argv) {
    ExitCode status = ExitCode::FAULT;
    try {
        status = run(streams::prepare(argc, argv));
    } catch (const std::exception& error) {
        writeError(std::string("tarvik: ") + error.what());
    }
    return static_cast<int>(status);
}
