// Compares two databases by the answers that two further runs of this program give.
#include "diff/CompareDatabases.h"

#include "term/ExitCode.h"
#include "term/Subprocess.h"

#include <vector>

namespace diff {

namespace {

std::string outputOf(Subprocess& process) {
    std::string text = process.output();
    if (text.starts_with(FAULT_MARK)) {
        throw CommandError(ExitCode::FAULT, text.substr(1));
    }
    return text;
}

} // namespace

Comparison compareDatabases(const std::string& oldDatabase, const std::string& newDatabase,
                            const Renaming& renamed) {
    const auto snapshotOf = [](const std::string& database) {
        return std::vector<std::string>{"diff", "--format", SNAPSHOT_FORMAT, "--", database, database};
    };
    // Both take about the same time, so one of them shows the progress.
    Subprocess oldProcess(snapshotOf(oldDatabase), false);
    Subprocess newProcess(snapshotOf(newDatabase), true);
    Snapshot before(outputOf(oldProcess));
    before.rename(renamed);
    const Snapshot after(outputOf(newProcess));
    return compare(before, after);
}

} // namespace diff
