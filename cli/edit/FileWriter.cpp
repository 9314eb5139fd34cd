// Writes the files of an edit. If one of them fails, those before it are put back.
#include "edit/FileWriter.h"

#include "database/FileNames.h"
#include "edit/SourceFile.h"
#include "platform/Platform.h"
#include "term/AtomicFile.h"
#include "term/ExitCode.h"
#include "term/Terminal.h"

#include <fmt/format.h>

#include <filesystem>
#include <functional>

namespace edit {

namespace {

namespace fs = std::filesystem;

/// Where a removed file is until all is done. The readers ignore names that begin with a dot.
std::string hiddenPath(std::string path) {
    return path.insert(path.size() - acd::fileNameOf(path).size(), 1, '.');
}

bool exists(const std::string& path) { return fs::exists(acd::toPath(path)); }

void requireAccess(const std::string& path) {
    if (const std::error_code failure = accessFailure(path)) {
        throw CommandError(ExitCode::FAULT, fmt::format("nothing is written, since \"{}\" is locked: {}",
                                                        printable(path), failure.message()));
    }
}

std::string directoryOf(const std::string& path) {
    const std::string directory(acd::directoryOf(path));
    return directory.empty() ? "." : directory;
}

class Transaction {
public:
    void apply(const Rewrite& rewrite) {
        if (!rewrite.text) {
            move(rewrite.path, hiddenPath(rewrite.path));
            m_hidden.push_back(hiddenPath(rewrite.path));
            return;
        }
        if (!rewrite.formerPath.empty()) {
            move(rewrite.formerPath, rewrite.path);
        }
        const bool isNew = !exists(rewrite.path);
        const std::string former = isNew ? std::string() : readFile(rewrite.path);
        // Before it is written: a file that has no room may be written in part.
        m_undo.emplace_back(rewrite.path, [path = rewrite.path, isNew, former] {
            if (isNew) {
                fs::remove(acd::toPath(path));
            } else if (readFile(path) != former) {
                writeFile(path, former);
            }
        });
        writeFile(rewrite.path, *rewrite.text);
    }

    void commit() {
        for (const std::string& path : m_hidden) {
            fs::remove(acd::toPath(path));
        }
    }

    /// @return what could not be put back
    [[nodiscard]] std::string rollBack() {
        std::string rest;
        for (auto undo = m_undo.rbegin(); undo != m_undo.rend(); ++undo) {
            try {
                undo->second();
            } catch (const std::exception& fault) {
                rest += fmt::format("\n\"{}\" is not as it was: {}", printable(undo->first), fault.what());
            }
        }
        return rest;
    }

private:
    void move(const std::string& from, const std::string& to) {
        if (fs::exists(fs::symlink_status(acd::toPath(to)))) {
            throw CommandError(ExitCode::FAULT, fmt::format("\"{}\" exists", printable(to)));
        }
        fs::rename(acd::toPath(from), acd::toPath(to));
        m_undo.emplace_back(from, [from, to] { fs::rename(acd::toPath(to), acd::toPath(from)); });
    }

    std::vector<std::pair<std::string, std::function<void()>>> m_undo; ///< with the path of the file
    std::vector<std::string> m_hidden;
};

} // namespace

void requireWritable(const std::vector<Rewrite>& rewrites) {
    for (const Rewrite& rewrite : rewrites) {
        const bool isMoved = !rewrite.text || !rewrite.formerPath.empty() || !exists(rewrite.path);
        if (isMoved) {
            requireAccess(directoryOf(rewrite.path));
        }
        if (rewrite.text && !rewrite.formerPath.empty()) {
            requireAccess(rewrite.formerPath);
        } else if (exists(rewrite.path)) {
            requireAccess(rewrite.path);
        }
    }
}

void writeAll(const std::vector<Rewrite>& rewrites) {
    Transaction transaction;
    try {
        for (const Rewrite& rewrite : rewrites) {
            transaction.apply(rewrite);
        }
    } catch (const std::exception& fault) {
        throw CommandError(ExitCode::FAULT, fault.what() + transaction.rollBack());
    }
    transaction.commit();
}

} // namespace edit
