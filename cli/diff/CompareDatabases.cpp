// Compares two databases by the answers that two further runs of this program give.
#include "diff/CompareDatabases.h"

#include "term/ExitCode.h"
#include "term/Subprocess.h"

#include <string_view>
#include <utility>
#include <vector>

namespace diff {

namespace {

/// What such a process wrote.
/// @param side which of the two databases it is
/// @param faults gets what an application meets in it
std::string snapshotOf(Subprocess& process, const char* side, Json& faults) {
    const std::string text = process.output();
    if (text.starts_with(FAULT_MARK)) {
        throw CommandError(ExitCode::FAULT, text.substr(1));
    }
    std::string_view rest = text;
    for (Json& fault : Json::parse(takeBlock(rest))) {
        fault["database"] = side;
        faults.push_back(std::move(fault));
    }
    return std::string(rest);
}

} // namespace

Comparison compareDatabases(const std::string& oldDatabase, const std::string& newDatabase,
                            const Renaming& renamed) {
    const auto command = [](const std::string& database) {
        return std::vector<std::string>{"diff", "--format", SNAPSHOT_FORMAT, "--", database, database};
    };
    // Both take about the same time, so one of them shows the progress.
    Subprocess oldProcess(command(oldDatabase), false);
    Subprocess newProcess(command(newDatabase), true);
    Json faults = Json::array();
    Snapshot before(snapshotOf(oldProcess, "old", faults));
    before.rename(renamed);
    const Snapshot after(snapshotOf(newProcess, "new", faults));
    Comparison comparison = compare(before, after);
    comparison.applicationFaults = std::move(faults);
    return comparison;
}

} // namespace diff
