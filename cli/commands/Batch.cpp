// `batch`: answers JSON requests, line by line.
#include "batch/Batch.h"

#include "commands/Commands.h"

namespace {

ExitCode run(Tool& tool) { return batch::run(tool, {}); }

} // namespace

const Command command::BATCH{
    "batch",
    "Answer JSON requests for the whole interface, line by line",
    "Reads one JSON object a line and writes one a line. The call \"help\" lists all calls with their "
    "arguments.",
    R"(echo '{"id": 1, "call": "getPartFamily", "args": ["KS50"]}' | tarvik batch)"
    "\n"
    R"(echo '{"call": "help"}' | tarvik batch)",
    [](ArgumentList& /*none*/) -> Action { return run; },
};
