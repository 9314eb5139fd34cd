// Shows what an edit does before it is done: the edited database is made beside, and both are asked everything.
#include "edit/Proof.h"

#include "database/FileNames.h"
#include "platform/Platform.h"
#include "term/ExitCode.h"
#include "term/TemporaryDirectory.h"

#include <fmt/format.h>
#include <fmt/ranges.h>

#include <algorithm>
#include <filesystem>
#include <fstream>
#include <map>

namespace edit {

namespace {

namespace fs = std::filesystem;

fs::path normalised(const fs::path& path) { return fs::absolute(path).lexically_normal(); }

/// The new texts by path; none for a path that has no file any more.
using Texts = std::map<fs::path, const std::string*>;

Texts textsOf(const std::vector<Rewrite>& rewrites) {
    Texts texts;
    for (const Rewrite& rewrite : rewrites) {
        if (!rewrite.formerPath.empty()) {
            texts.emplace(normalised(acd::toPath(rewrite.formerPath)), nullptr);
        }
    }
    // After them: a file may take the path of one that is renamed.
    for (const Rewrite& rewrite : rewrites) {
        texts[normalised(acd::toPath(rewrite.path))] = rewrite.text ? &*rewrite.text : nullptr;
    }
    return texts;
}

/// Makes a layer with the new texts; the other files are links to those of the layer.
void copyLayer(const fs::path& layer, const fs::path& copy, const Texts& texts) {
    fs::create_directory(copy);
    if (fs::exists(layer)) {
        for (const fs::directory_entry& entry : fs::directory_iterator(layer)) {
            if (texts.contains(normalised(entry.path()))) {
                continue;
            }
            const fs::path target = copy / entry.path().filename();
            std::error_code isRefused;
            fs::create_symlink(fs::absolute(entry.path()), target, isRefused);
            if (isRefused) { // as on Windows, without special rights
                fs::copy_file(entry.path(), target);
            }
        }
    }
    for (const auto& [path, text] : texts) {
        if (text == nullptr || path != normalised(layer / path.filename())) {
            continue;
        }
        const fs::path target = copy / path.filename();
        std::ofstream file(target, std::ios::binary);
        if (!(file << *text).flush()) {
            throw CommandError(ExitCode::FAULT, fmt::format("cannot write \"{}\"", acd::fromPath(target)));
        }
    }
}

} // namespace

std::optional<diff::Comparison> effectOf(const std::vector<std::string>& layers,
                                         const std::vector<Rewrite>& rewrites,
                                         const diff::Renaming& renamed) {
    if (std::none_of(layers.begin(), layers.end(),
                     [](const std::string& layer) { return fs::exists(acd::toPath(layer) / "base.acd"); })) {
        return std::nullopt;
    }
    const Texts texts = textsOf(rewrites);
    const TemporaryDirectory scratch;
    std::vector<std::string> copies;
    try {
        for (const std::string& layer : layers) {
            copies.push_back(acd::joinPath(scratch.path(), std::to_string(copies.size())));
            copyLayer(acd::toPath(layer), acd::toPath(copies.back()), texts);
        }
    } catch (const fs::filesystem_error& error) {
        throw CommandError(ExitCode::FAULT, error.what());
    }
    const std::string separator{acd::platform::listSeparator()};
    return diff::compareDatabases(fmt::format("{}", fmt::join(layers, separator)),
                                  fmt::format("{}", fmt::join(copies, separator)), renamed);
}

} // namespace edit
