// `tarvik batch` as a program of its own: its calls need a small part of the tool, which is compiled soon.
//   tarvik_batch DIRECTORY
#include "batch/Batch.h"
#include "query/Tool.h"
#include "term/Streams.h"

#include <TarvikException.h>

int main(int argc, char** argv) {
    Tool::Settings settings;
    settings.databases = streams::prepare(argc, argv);
    Tool tool(settings);
    ExitCode status = ExitCode::FAULT;
    try {
        status = batch::run(tool, {});
    } catch (const CommandError& error) {
        status = tool.fail(error);
    } catch (const TarvikException& fault) {
        status = tool.fail({ExitCode::FAULT, std::string("the database cannot be read: ") + fault.what()});
    }
    return static_cast<int>(status);
}
