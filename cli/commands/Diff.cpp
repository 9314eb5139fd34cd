// `diff`: which answers two databases give differently.
#include "commands/Commands.h"

#include "diff/CompareDatabases.h"
#include "diff/Presentation.h"
#include "diff/Revision.h"
#include "platform/Platform.h"
#include "query/ApplicationFault.h"
#include "query/Database.h"
#include "query/DeviceTables.h"
#include "query/Tool.h"
#include "term/Progress.h"

#include <fmt/format.h>
#include <fmt/ranges.h>

#include <exception>
#include <memory>

namespace {

struct Arguments {
    std::vector<std::string> databases;
    std::string against;
    std::string failOn = "any";
    std::string format = "text";
};

/// A comparison as release notes show it.
struct ReleaseNotes {
    const diff::Comparison& comparison;
};

std::string asText(const ReleaseNotes& notes, const Terminal& /*any*/) {
    return diff::asMarkdown(notes.comparison);
}
Json asJson(const ReleaseNotes& notes) { return diff::asJson(notes.comparison); }

/// A snapshot, or why there is none.
struct Written {
    std::string snapshot;
};

std::string asText(const Written& written, const Terminal& /*any*/) { return written.snapshot; }
Json asJson(const Written& /*written*/) { return {}; }

std::string snapshotOrFault(Tool& tool, const std::string& database) {
    try {
        openDatabase(directoriesOf({database}));
        Progress progress("asking about each device");
        const std::string snapshot = diff::takeSnapshot(
            [&progress](std::size_t done, std::size_t total) { progress.reach(done, total); });
        std::string text;
        diff::putBlock(text, oneLine(findApplicationFaults()));
        text += snapshot;
        static_cast<void>(tool.messages().take());
        return text;
    } catch (const std::exception& fault) {
        std::string reason(1, diff::FAULT_MARK);
        for (const Messages::Message& message : tool.messages().take()) {
            reason += message.channel == Port_MsgManData::Channel::INFO ? message.text : "";
        }
        return reason +
               (dynamic_cast<const CommandError*>(&fault) != nullptr ? fault.what() : faultText(fault));
    }
}

diff::Comparison compare(const Arguments& arguments) {
    const std::size_t wanted = arguments.against.empty() ? 2 : 1;
    if (arguments.databases.size() != wanted) {
        throw CommandError(ExitCode::FAULT, wanted == 2 ? "diff needs two databases: tarvik diff OLD NEW"
                                                        : "diff --against REVISION needs one database");
    }
    if (wanted == 2) {
        return diff::compareDatabases(arguments.databases[0], arguments.databases[1]);
    }
    const diff::Revision revision(arguments.against, directoriesOf({arguments.databases[0]}));
    return diff::compareDatabases(
        fmt::format("{}", fmt::join(revision.directories(), std::string{acd::platform::listSeparator()})),
        arguments.databases[0]);
}

ExitCode run(Tool& tool, const Arguments& arguments) {
    if (arguments.format == diff::SNAPSHOT_FORMAT) {
        return tool.answer(Written{snapshotOrFault(tool, arguments.databases.front())});
    }
    if (arguments.format != "text" && arguments.format != "markdown") {
        throw CommandError(ExitCode::FAULT,
                           fmt::format("unknown format \"{}\"\nformats: text, markdown", arguments.format));
    }
    const diff::Comparison comparison = compare(arguments);
    const bool isRefused = arguments.failOn == "lost" ? comparison.hasLosses() : !comparison.isEmpty();
    ExitCode status = isRefused ? ExitCode::NO : ExitCode::YES;
    if (!comparison.unanswered.empty()) {
        tool.note(fmt::format(
            "answers about {} devices are missing in both databases, the first \"{}\": see tarvik why",
            comparison.unanswered.size(), comparison.unanswered.front()));
        status = ExitCode::FAULT;
    }
    noteApplicationFaults(tool, comparison.applicationFaults);
    return arguments.format == "markdown" ? tool.answer(ReleaseNotes{comparison}, status)
                                          : tool.answer(comparison, status);
}

Action declare(ArgumentList& list) {
    auto arguments = std::make_shared<Arguments>();
    list = {
        {.name = "DATABASE",
         .description = "The old database and the new one; with --against the new one only",
         .kind = ValueKind::PATH,
         .required = true,
         .target = &arguments->databases},
        {.name = "--against",
         .value = "REVISION",
         .description = "Take the old database from this revision of its git repository",
         .target = &arguments->against},
        {.name = "--fail-on",
         .value = "CHANGES",
         .description = "Which differences give exit status 1: any, or only answers that are lost",
         .kind = ValueKind::CHOICE,
         .choices = {"lost", "any"},
         .target = &arguments->failOn},
        {.name = "--format",
         .value = "FORMAT",
         .description = "The form of the result; markdown is for release notes",
         .choices = {"text", "markdown"},
         .target = &arguments->format},
    };
    return [arguments](Tool& tool) { return run(tool, *arguments); };
}

} // namespace

const Command command::DIFF{
    "diff",
    "Compare the answers of two databases",
    "Lists the answers that differ. The layers of a database are separated by \":\". With --against, the old "
    "database is "
    "taken from git; the work tree is not touched.",
    "tarvik diff database changed\n"
    "tarvik diff company site:company --json\n"
    "tarvik diff --against HEAD --fail-on lost database\n"
    "tarvik diff released database --format markdown",
    declare,
};
