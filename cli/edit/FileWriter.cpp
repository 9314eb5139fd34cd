// Writes the files of an edit. If one of them fails, those before it are put back.
#include "edit/FileWriter.h"

#include "edit/SourceFile.h"
#include "term/AtomicFile.h"
#include "term/ExitCode.h"
#include "term/Terminal.h"

#include <fmt/format.h>

#include <cerrno>
#include <cstring>
#include <filesystem>
#include <functional>
#include <unistd.h>

namespace edit {

namespace {

namespace fs = std::filesystem;

/// Where a removed file is until all is done. The readers ignore names that begin with a dot.
fs::path hiddenPath(const fs::path& path) { return path.parent_path() / ("." + path.filename().string()); }

void requireAccess(const fs::path& path) {
    if (::access(path.c_str(), W_OK) != 0) {
        throw CommandError(ExitCode::FAULT, fmt::format("nothing is written, since \"{}\" is locked: {}",
                                                        printable(path.string()), std::strerror(errno)));
    }
}

fs::path directoryOf(const fs::path& path) { return path.has_parent_path() ? path.parent_path() : "."; }

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
        const bool exists = fs::exists(rewrite.path);
        const std::string former = exists ? readFile(rewrite.path) : std::string();
        // Before it is written: a file that has no room may be written in part.
        m_undo.emplace_back(rewrite.path, [path = rewrite.path, exists, former] {
            if (!exists) {
                fs::remove(path);
            } else if (readFile(path) != former) {
                writeFile(path, former);
            }
        });
        writeFile(rewrite.path, *rewrite.text);
    }

    void commit() {
        for (const fs::path& path : m_hidden) {
            fs::remove(path);
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
    void move(const fs::path& from, const fs::path& to) {
        if (fs::exists(fs::symlink_status(to))) {
            throw CommandError(ExitCode::FAULT, fmt::format("\"{}\" exists", printable(to.string())));
        }
        fs::rename(from, to);
        m_undo.emplace_back(from.string(), [from, to] { fs::rename(to, from); });
    }

    std::vector<std::pair<std::string, std::function<void()>>> m_undo; ///< with the path of the file
    std::vector<fs::path> m_hidden;
};

} // namespace

void requireWritable(const std::vector<Rewrite>& rewrites) {
    for (const Rewrite& rewrite : rewrites) {
        const bool isMoved = !rewrite.text || !rewrite.formerPath.empty() || !fs::exists(rewrite.path);
        if (isMoved) {
            requireAccess(directoryOf(rewrite.path));
        }
        if (rewrite.text && !rewrite.formerPath.empty()) {
            requireAccess(rewrite.formerPath);
        } else if (fs::exists(rewrite.path)) {
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
