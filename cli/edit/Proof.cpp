// Shows what an edit does before it is done: the edited database is made beside, and both are asked everything.
#include "edit/Proof.h"

#include "database/FileNames.h"
#include "diff/CompareDatabases.h"
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

/// Makes a layer with the texts in place of some files; the others are links to those of the layer.
void copyLayer(const fs::path& layer, const fs::path& copy,
               const std::map<fs::path, const std::string*>& texts) {
    fs::create_directory(copy);
    for (const fs::directory_entry& entry : fs::directory_iterator(layer)) {
        const fs::path target = copy / entry.path().filename();
        if (const auto text = texts.find(fs::absolute(entry.path()).lexically_normal());
            text == texts.end()) {
            std::error_code isRefused;
            fs::create_symlink(fs::absolute(entry.path()), target, isRefused);
            if (isRefused) { // as on Windows, without special rights
                fs::copy_file(entry.path(), target);
            }
        } else {
            std::ofstream file(target, std::ios::binary);
            if (!(file << *text->second).flush()) {
                throw CommandError(ExitCode::FAULT,
                                   fmt::format("cannot write \"{}\"", acd::fromPath(target)));
            }
        }
    }
}

} // namespace

std::optional<diff::Comparison> effectOf(const std::vector<std::string>& layers,
                                         const std::vector<Rewrite>& rewrites) {
    if (std::none_of(layers.begin(), layers.end(),
                     [](const std::string& layer) { return fs::exists(acd::toPath(layer) / "base.acd"); })) {
        return std::nullopt;
    }
    std::map<fs::path, const std::string*> texts;
    for (const Rewrite& rewrite : rewrites) {
        texts.emplace(fs::absolute(acd::toPath(rewrite.path)).lexically_normal(), &rewrite.text);
    }
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
                                  fmt::format("{}", fmt::join(copies, separator)));
}

} // namespace edit
