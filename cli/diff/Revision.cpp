// Takes databases out of git, through an index of its own.
#include "diff/Revision.h"

#include "term/ExitCode.h"
#include "term/Subprocess.h"

#include <fmt/format.h>

#include <algorithm>
#include <array>
#include <optional>
#include <string_view>

namespace diff {

namespace {

/// The variables for git: in a hook, those of the repository whose hook it is must not be used for another one.
std::vector<std::string> environment() {
    constexpr std::array<std::string_view, 4> OF_REPOSITORY{
        "GIT_DIR=", "GIT_WORK_TREE=", "GIT_INDEX_FILE=", "GIT_PREFIX="};
    std::vector<std::string> all = environmentVariables();
    std::erase_if(all, [&](const std::string& variable) {
        return std::any_of(OF_REPOSITORY.begin(), OF_REPOSITORY.end(),
                           [&](std::string_view name) { return variable.starts_with(name); });
    });
    return all;
}

/// Runs git in a directory.
/// @return its output without the last line end; nothing if it fails
std::optional<std::string> git(const std::string& directory, std::vector<std::string> arguments,
                               const std::string& index = {}) {
    std::vector<std::string> command{"git", "-C", directory};
    command.insert(command.end(), arguments.begin(), arguments.end());
    std::vector<std::string> variables = environment();
    if (!index.empty()) {
        variables.push_back("GIT_INDEX_FILE=" + index);
    }
    Subprocess process(command, variables, true);
    std::string text;
    if (!process.succeeds(text)) {
        return std::nullopt;
    }
    if (text.ends_with('\n')) {
        text.pop_back();
    }
    return text;
}

} // namespace

Revision::Revision(const std::string& name, const std::vector<std::string>& directories) {
    bool isInRepository = false;
    for (const std::string& directory : directories) {
        const std::optional<std::string> top = git(directory, {"rev-parse", "--show-toplevel"});
        const std::optional<std::string> prefix = git(directory, {"rev-parse", "--show-prefix"});
        if (!top || !prefix) {
            m_directories.push_back(directory);
            continue;
        }
        isInRepository = true;
        const std::optional<std::string> commit =
            git(directory, {"rev-parse", "--verify", "--end-of-options", name + "^{commit}"});
        if (!commit) {
            throw CommandError(ExitCode::FAULT,
                               fmt::format("git knows no revision \"{}\" in \"{}\"", name, directory));
        }
        const std::string tree =
            fmt::format("{}:{}", *commit, prefix->substr(0, prefix->find_last_not_of('/') + 1));
        const std::string number = std::to_string(m_directories.size());
        const std::string index = m_scratch.path() + "/index" + number;
        const std::string target = m_scratch.path() + '/' + number + '/';
        if (!git(*top, {"read-tree", tree}, index)) {
            throw CommandError(
                ExitCode::FAULT,
                fmt::format("revision \"{}\" does not have the directory \"{}\"", name, directory));
        }
        if (!git(*top, {"checkout-index", "--all", "--prefix=" + target}, index)) {
            throw CommandError(ExitCode::FAULT, fmt::format("git cannot write the files of \"{}\"", name));
        }
        m_directories.push_back(target);
    }
    if (!isInRepository) {
        throw CommandError(ExitCode::FAULT, fmt::format("\"{}\" is not in a git repository",
                                                        directories.empty() ? "" : directories.front()));
    }
}

} // namespace diff
