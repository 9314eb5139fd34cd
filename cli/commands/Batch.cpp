// `batch`: answers JSON requests, line by line.
#include "batch/Batch.h"

#include "commands/Commands.h"

const Command command::BATCH{
    "batch",
    "Answer JSON requests for the whole interface, line by line",
    "",
    R"(echo '{"id": 1, "call": "getPartFamily", "args": ["KS50"]}' | tarvik batch)",
    [](ArgumentList& /*none*/) -> Action { return batch::run; },
};
