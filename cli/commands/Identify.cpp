// `identify`: the devices that an identification code belongs to.
#include "commands/Commands.h"

#include "model/IdcodePattern.h"
#include "query/Tool.h"
#include "term/Table.h"

#include <tarvik/ConstraintsManager.h>

#include <fmt/format.h>
#include <fmt/ranges.h>

#include <algorithm>
#include <iostream>
#include <limits>
#include <memory>

namespace {

/// In place of a code: codes from standard input.
constexpr const char* STANDARD_INPUT = "-";

/// As many devices are named as nearest.
constexpr std::size_t MAX_NEAREST = 5;

struct Device {
    std::string name;
    std::string family;
    std::string idcode; ///< as the database writes it
    IdcodePattern pattern;
};

/// One code, and what it belongs to.
struct Identified {
    std::string code;
    std::string manufacturer;
    std::vector<Device> devices;
    std::vector<Device> nearest; ///< if there are no devices
    int differingBits = 0;       ///< of the nearest ones
};

using Identification = std::vector<Identified>;

std::string unknownText(const Identified& code) {
    std::vector<std::string> names;
    for (std::size_t i = 0; i < std::min(code.nearest.size(), MAX_NEAREST); ++i) {
        names.push_back(code.nearest[i].name);
    }
    if (names.size() < code.nearest.size()) {
        names.push_back(fmt::format("{} more", code.nearest.size() - names.size()));
    }
    return fmt::format("unknown: manufacturer {}, nearest {} ({} bit{})", code.manufacturer,
                       fmt::join(names, ", "), code.differingBits,
                       code.differingBits == 1 ? " differs" : "s differ");
}

std::string asText(const Identification& codes, const Terminal& terminal) {
    Table table;
    for (const Identified& code : codes) {
        for (const Device& device : code.devices) {
            table.add({code.code, device.name, device.family, device.idcode});
        }
        if (code.devices.empty()) {
            table.add({code.code, "-", "-", unknownText(code)});
        }
    }
    return table.text(terminal);
}

Json asJson(const std::vector<Device>& devices) {
    Json list = Json::array();
    for (const Device& device : devices) {
        list.push_back({{"name", device.name}, {"family", device.family}, {"idcode", device.idcode}});
    }
    return list;
}

Json asJson(const Identification& codes) {
    Json list = Json::array();
    for (const Identified& code : codes) {
        Json object{
            {"code", code.code}, {"manufacturer", code.manufacturer}, {"devices", asJson(code.devices)}};
        if (code.devices.empty()) {
            object["nearest"] = asJson(code.nearest);
            object["differingBits"] = code.differingBits;
        }
        list.push_back(std::move(object));
    }
    return {{"codes", list}};
}

/// The devices whose IDCODE can be read.
std::vector<Device> devicesOf(ConstraintsManager& manager) {
    std::vector<Device> devices;
    for (const auto& [name, idcode] : manager.getAllDeviceIdcodes()) {
        const std::string text = toStdString(idcode);
        if (const std::optional<IdcodePattern> pattern = readIdcode(text)) {
            devices.push_back(
                {toStdString(name), toStdString(manager.getPartFamily(name.c_str())), text, *pattern});
        }
    }
    return devices;
}

Identified identify(const std::vector<Device>& devices, const std::string& code) {
    const std::optional<IdcodePattern> pattern = readIdcode(code);
    if (!pattern) {
        throw CommandError(
            ExitCode::FAULT,
            fmt::format("\"{}\" is not an IDCODE: it takes 0x and up to 8 hexadecimal digits, or "
                        "32 binary digits",
                        code));
    }
    Identified found{code, pattern->manufacturer(), {}, {}, std::numeric_limits<int>::max()};
    for (const Device& device : devices) {
        const int distance = pattern->distance(device.pattern);
        if (distance < found.differingBits) {
            found.differingBits = distance;
            found.nearest.clear();
        }
        if (distance == found.differingBits) {
            found.nearest.push_back(device);
        }
    }
    if (found.differingBits == 0) {
        found.devices = std::exchange(found.nearest, {});
    }
    return found;
}

/// The arguments, with the words of standard input in place of "-".
std::vector<std::string> readCodes(const std::vector<std::string>& arguments) {
    std::vector<std::string> codes;
    for (const std::string& argument : arguments) {
        if (argument != STANDARD_INPUT) {
            codes.push_back(argument);
            continue;
        }
        for (std::string code; std::cin >> code;) {
            codes.push_back(code);
        }
    }
    return codes;
}

ExitCode run(Tool& tool, const std::vector<std::string>& arguments) {
    const std::vector<Device> devices = devicesOf(tool.manager());
    if (devices.empty()) {
        throw CommandError(ExitCode::NO, "the database has no IDCODEs");
    }
    Identification codes;
    for (const std::string& code : readCodes(arguments)) {
        codes.push_back(identify(devices, code));
    }
    const bool areKnown =
        std::ranges::none_of(codes, [](const Identified& code) { return code.devices.empty(); });
    return tool.answer(codes, areKnown ? ExitCode::YES : ExitCode::NO);
}

Action declare(ArgumentList& list) {
    auto codes = std::make_shared<std::vector<std::string>>();
    list = {{.name = "CODE",
             .description =
                 "An IDCODE: 0x and up to 8 hexadecimal digits, or 32 binary digits; X is any digit. - reads "
                 "codes from standard input",
             .required = true,
             .target = codes.get()}};
    return [codes](Tool& tool) { return run(tool, *codes); };
}

} // namespace

const Command command::IDENTIFY{
    "identify",
    "Find the device of an IDCODE",
    "X digits of the database match any digit. For an unknown code, shows its manufacturer field, and the "
    "devices whose "
    "IDCODE differs in the fewest bits. The exit status is 0 if every code is known.",
    "tarvik identify 0x14104FB7\n"
    "tarvik identify 0x14104FB7 00010100000100000100111110110111\n"
    "echo 0x14104FB7 | tarvik identify -",
    declare,
};
