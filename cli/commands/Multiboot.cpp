// `multiboot`: does a device support a multiboot arrangement?
#include "commands/Commands.h"

#include "model/Catalogue.h"
#include "model/Multiboot.h"
#include "query/Tool.h"
#include "term/Table.h"
#include "term/Verdict.h"
#include "text/Suggest.h"

#include <tarvik/ConstraintsManager.h>

#include <fmt/format.h>

#include <algorithm>
#include <memory>

namespace {

struct Arguments {
    std::string device;
    std::string type;
    std::string width;
    bool lead = false;
    bool chain = false;
};

/// The word that a text names, without regard to case.
/// @param others what else to suggest
const std::string& readWord(const char* kind, const std::vector<std::string>& words, const std::string& text,
                            std::vector<std::string> others = {}) {
    const auto found = std::find_if(words.begin(), words.end(),
                                    [&](const std::string& word) { return sameWithoutCase(word, text); });
    if (found == words.end()) {
        others.insert(others.end(), words.begin(), words.end());
        throw CommandError(ExitCode::FAULT,
                           fmt::format("unknown multiboot {} \"{}\"{}\n{}s, in any case:\n{}", kind, text,
                                       didYouMean(text, others), kind, wrapped(words, 2)));
    }
    return *found;
}

/// "BPI" and "TYPE_BPI" are the same type.
const std::string& readType(const std::string& text) {
    const std::string prefix = multiboot::TYPE_PREFIX;
    std::vector<std::string> shortTypes;
    for (const std::string& type : multiboot::TYPES) {
        shortTypes.push_back(type.substr(prefix.size()));
        if (sameWithoutCase(shortTypes.back(), text)) {
            return type;
        }
    }
    return readWord("type", multiboot::TYPES, text, shortTypes);
}

ExitCode run(Tool& tool, const Arguments& arguments) {
    if (arguments.lead == arguments.chain) {
        throw CommandError(ExitCode::FAULT,
                           "multiboot takes either --lead or --chain\nsee: tarvik multiboot --help");
    }
    const std::string& type = readType(arguments.type);
    const std::string& width = readWord("width", multiboot::WIDTHS, arguments.width);
    const char* const position = arguments.lead ? "lead" : "chain";
    ConstraintsManager& manager = tool.manager();
    const bool supported =
        manager.isMbBpiSpiSupport(arguments.device.c_str(), type.c_str(), width.c_str(), arguments.lead);
    const bool known = supported || manager.isKorvelDevice(arguments.device.c_str());
    const Verdict verdict{
        supported,
        fmt::format("{} as {} device of {} {}", arguments.device, position, type, width),
        {{"device", arguments.device}, {"type", type}, {"width", width}, {"position", position}}};
    const ExitCode status = tool.answer(verdict, supported ? ExitCode::YES : ExitCode::NO);
    if (!known) {
        tool.note(catalogue::unknownDevice(arguments.device).what());
    }
    return status;
}

Action declare(ArgumentList& list) {
    auto arguments = std::make_shared<Arguments>();
    list = {
        {.name = "DEVICE",
         .description = "The device",
         .kind = ValueKind::DEVICE,
         .required = true,
         .target = &arguments->device},
        {.name = "--type",
         .value = "TYPE",
         .description = "The arrangement, with or without TYPE_",
         .choices = multiboot::TYPES,
         .required = true,
         .target = &arguments->type},
        {.name = "--width",
         .value = "WIDTH",
         .description = "The data width",
         .choices = multiboot::WIDTHS,
         .required = true,
         .target = &arguments->width},
        {.name = "--lead", .description = "The device is the first of the chain", .target = &arguments->lead},
        {.name = "--chain",
         .description = "The device is a later one of the chain",
         .target = &arguments->chain},
    };
    return [arguments](Tool& tool) { return run(tool, *arguments); };
}

} // namespace

const Command command::MULTIBOOT{
    "multiboot", "Check whether a device supports a multiboot arrangement",
    "",          "tarvik multiboot OVD16 --type MB_SPI --width NONE --lead",
    declare,
};
