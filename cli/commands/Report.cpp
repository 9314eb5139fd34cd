// `report`: a page about all devices, to look at in a browser.
#include "commands/Commands.h"

#include "query/ApplicationFault.h"
#include "query/DeviceSurvey.h"
#include "query/Tool.h"
#include "report/Page.h"
#include "term/AtomicFile.h"
#include "term/Progress.h"

#include <fmt/format.h>

#include <memory>

namespace {

/// In place of a path: standard output.
constexpr const char* STANDARD_OUTPUT = "-";

struct Written {
    std::string file;
    std::size_t devices;
    std::size_t families;
    const std::vector<std::string>& faults; ///< devices at which the manager raises
};

std::string asText(const Written& written, const Terminal& /*any*/) {
    return fmt::format("{}: {} devices in {} families\n", written.file, written.devices, written.families);
}

Json asJson(const Written& written) {
    return {{"file", written.file},
            {"devices", written.devices},
            {"families", written.families},
            {"faults", written.faults}};
}

/// The page itself as the answer.
struct Shown {
    const report::Page& page;
};

std::string asText(const Shown& shown, const Terminal& /*any*/) { return shown.page.html(); }

Json asJson(const Shown& /*shown*/) {
    throw CommandError(ExitCode::FAULT,
                       "with --json, report takes a file: --file - and the JSON object both go to "
                       "standard output\nsee: tarvik report --help");
}

ExitCode run(Tool& tool, const std::string& file) {
    tool.openDatabase();
    report::Page page;
    std::vector<std::string> faults;
    Progress progress("asking about each device");
    DeviceSurvey({.operations = true, .options = true, .facts = true})
        .run(
            [&](const DeviceDetails& details) {
                page.add(details);
                if (!details.whyIncomplete().empty()) {
                    faults.push_back(details.name);
                }
            },
            [&progress](std::size_t done, std::size_t total) { progress.reach(done, total); });
    noteApplicationFaults(tool, findApplicationFaults());
    if (file == STANDARD_OUTPUT || isStandardOutput(file)) {
        static_cast<void>(tool.answer(Shown{page}));
    } else {
        writeFile(file, page.html());
        static_cast<void>(tool.answer(Written{file, page.devices(), page.families(), faults}));
    }
    if (faults.empty()) {
        return ExitCode::YES;
    }
    tool.note(unansweredText(faults));
    return ExitCode::FAULT;
}

Action declare(ArgumentList& list) {
    auto file = std::make_shared<std::string>();
    list = {
        {.name = "--file",
         .value = "FILE",
         .description = "The file to write; - is standard output",
         .kind = ValueKind::PATH,
         .required = true,
         .target = file.get()},
    };
    return [file](Tool& tool) { return run(tool, *file); };
}

} // namespace

const Command command::REPORT{
    "report", "Write an HTML page about all devices", "", "tarvik report --file report.html", declare,
};
