// `index`: writes the index of a database directory, or shows it.
#include "commands/Commands.h"

#include "commands/IndexWriter.h"
#include "database/IndexMaintenance.h"
#include "query/Tool.h"
#include "term/Table.h"

#include <fmt/chrono.h>
#include <fmt/format.h>

#include <memory>

namespace {

struct Arguments {
    std::vector<std::string> directories;
    bool show = false;
};

struct Written {
    std::string path;
    std::size_t files;
    std::size_t sections;
};

using AllWritten = std::vector<Written>;

std::string asText(const AllWritten& indexes, const Terminal& terminal) {
    std::string text;
    for (const Written& index : indexes) {
        text += fmt::format("{}: {} files, {} sections\n", terminal.sanitised(index.path), index.files,
                            index.sections);
    }
    return text;
}

Json asJson(const AllWritten& indexes) {
    Json list = Json::array();
    for (const Written& index : indexes) {
        list.push_back({{"path", index.path}, {"files", index.files}, {"sections", index.sections}});
    }
    return {{"written", list}};
}

struct Shown {
    std::string path;
    acd::CheckedIndex index;
};

struct StateName {
    const char* word;
    const char* text;
};

StateName nameOf(acd::IndexState state) {
    switch (state) {
    case acd::IndexState::MISSING:
        return {"missing", "the directory has no index"};
    case acd::IndexState::INVALID:
        return {"invalid", "not used: it can't be read, is damaged or of another version"};
    case acd::IndexState::STALE:
        return {"stale", "not used: the files have changed since it was made"};
    case acd::IndexState::CURRENT:
        break;
    }
    return {"current", "current"};
}

std::string asText(const acd::FileTime& time) {
    constexpr std::int64_t LAST_SECOND =
        253402300799; // of the year 9999: a file system can record any number
    if (time.seconds < 0 || time.seconds > LAST_SECOND) {
        return fmt::format("{}.{:09}", time.seconds, time.nanoseconds);
    }
    return fmt::format("{:%Y-%m-%dT%H:%M:%S}.{:09}Z", fmt::gmtime(static_cast<std::time_t>(time.seconds)),
                       time.nanoseconds);
}

std::string asText(const Shown& shown, const Terminal& terminal) {
    std::string text =
        fmt::format("{}: {}\n", terminal.sanitised(shown.path), nameOf(shown.index.state).text);
    if (shown.index.contents.files.empty()) {
        return text;
    }
    text += fmt::format("made {}\n", asText(shown.index.contents.created));
    Table table({"FILE", "SIZE", "CHANGED", "SECTIONS", ""});
    for (const acd::IndexedFile& file : shown.index.contents.files) {
        table.add({terminal.sanitised(file.name), std::to_string(file.status.size),
                   asText(file.status.changed), std::to_string(file.sections.count()),
                   shown.index.contents.isSettled(file) ? "" : "read each time: as young as the index"});
    }
    return text + table.text(terminal);
}

Json asJson(const acd::PackedStrings& strings) {
    Json list = Json::array();
    strings.forEach([&list](std::string_view name) { list.push_back(std::string(name)); });
    return list;
}

Json asJson(const Shown& shown) {
    Json files = Json::array();
    for (const acd::IndexedFile& file : shown.index.contents.files) {
        files.push_back({{"name", file.name},
                         {"size", file.status.size},
                         {"changed", asText(file.status.changed)},
                         {"settled", shown.index.contents.isSettled(file)},
                         {"sections", asJson(file.sections)}});
    }
    const bool isValid = !shown.index.contents.files.empty();
    return {{"path", shown.path},
            {"state", nameOf(shown.index.state).word},
            {"created", isValid ? Json(asText(shown.index.contents.created)) : Json()},
            {"files", files}};
}

ExitCode show(Tool& tool, const std::string& directory) {
    try {
        const Shown shown{indexPath(directory), acd::checkIndex(directory)};
        return tool.answer(shown,
                           shown.index.state == acd::IndexState::CURRENT ? ExitCode::YES : ExitCode::NO);
    } catch (const acd::ReadError& unreadable) {
        throw CommandError(ExitCode::FAULT,
                           fmt::format("can't read \"{}\": {}", directory, unreadable.what()));
    }
}

ExitCode run(Tool& tool, const Arguments& arguments) {
    if (arguments.show) {
        if (arguments.directories.size() != 1) {
            throw CommandError(ExitCode::FAULT, "--show takes one directory\nsee: tarvik index --help");
        }
        return show(tool, arguments.directories.front());
    }
    AllWritten indexes;
    for (const std::string& directory : arguments.directories) {
        Written& written = indexes.emplace_back(Written{indexPath(directory), 0, 0});
        for (const acd::IndexedFile& file : writeIndex(directory).files) {
            ++written.files;
            written.sections += file.sections.count();
        }
    }
    return tool.answer(indexes);
}

Action declare(ArgumentList& list) {
    auto arguments = std::make_shared<Arguments>();
    list = {
        {.name = "DIR",
         .description = "The directory of a database, or of a layer of one",
         .kind = ValueKind::PATH,
         .required = true,
         .target = &arguments->directories},
        {.name = "--show",
         .description = "Show the index of the directory, and whether it is current",
         .target = &arguments->show},
    };
    return [arguments](Tool& tool) { return run(tool, *arguments); };
}

} // namespace

const Command command::INDEX{
    "index",
    "Write the index of a database directory",
    "The index, index.acx, lets programs find a device without reading all files. It is not used once any "
    "file has "
    "changed: write it again then. With --show, the exit status is 1 if the index is not used.",
    "tarvik index database\n"
    "tarvik index --show database",
    declare,
};
