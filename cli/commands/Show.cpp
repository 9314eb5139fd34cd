// `show`: everything about one device.
#include "commands/Commands.h"

#include "commands/CommonArguments.h"
#include "model/Vocabulary.h"
#include "query/ApplicationFault.h"
#include "query/AskedDevice.h"
#include "query/DeviceDetails.h"
#include "query/ManagerQueries.h"
#include "query/Tool.h"
#include "term/Table.h"

#include <tarvik/ConstraintsManager.h>

#include <fmt/format.h>
#include <fmt/ranges.h>

#include <memory>
#include <utility>

namespace {

struct Shown {
    DeviceDetails details;
};

/// "P-U--", or "-" for none.
std::string cell(DeviceTable::Outputs outputs, const std::string& letters) {
    if (outputs == 0) {
        return "-";
    }
    std::string text = letters;
    for (std::size_t output = 0; output < text.size(); ++output) {
        if ((outputs >> output & 1U) == 0) {
            text[output] = '-';
        }
    }
    return text;
}

std::string legend(const std::string& letters) {
    std::vector<std::string> words;
    for (std::size_t output = 0; output < letters.size(); ++output) {
        words.push_back(fmt::format("{} {}", letters[output], vocabulary::outputs().at(output)));
    }
    return fmt::format("  through  {}\n", fmt::join(words, "  "));
}

/// Rows by modes; the cells show the outputs. Rows that the device has in SPI mode only are marked, unless it is a flash.
std::string matrix(const std::string& title, const std::vector<DeviceTable::Row>& rows, bool withBsdl,
                   bool isFlash, const Terminal& terminal) {
    if (rows.empty()) {
        return {};
    }
    const std::string letters = outputLetters();
    Table::Row headings{""};
    for (std::size_t mode = 0; mode < DeviceTable::MODES; ++mode) {
        headings.push_back(vocabulary::modes().at(mode));
    }
    if (withBsdl) {
        headings.emplace_back("BSDL");
    }
    Table table(std::move(headings));
    std::string mark;
    for (const DeviceTable::Row& row : rows) {
        Table::Row cells{row.key};
        if (!isFlash && row.isOfSpiModeOnly()) {
            cells.front() += " (spi)";
            mark = fmt::format("  (spi)    {}\n", questions::SPI_MODE_RULE);
        }
        for (const DeviceTable::Outputs outputs : row.outputs) {
            cells.push_back(cell(outputs, letters));
        }
        if (withBsdl) {
            cells.push_back(cell(row.bsdl, letters));
        }
        table.add(std::move(cells));
    }
    return fmt::format("\n{}\n{}{}{}", terminal.heading(title), legend(letters), mark,
                       table.text(terminal, 2));
}

std::string section(const char* title, const Properties& properties, const Terminal& terminal) {
    return properties.empty()
               ? std::string()
               : fmt::format("\n{}\n{}", terminal.heading(title), asText(properties, terminal, 2));
}

std::string multibootText(const std::vector<DeviceDetails::Arrangement>& arrangements,
                          const Terminal& terminal) {
    if (arrangements.empty()) {
        return {};
    }
    Table table;
    for (const DeviceDetails::Arrangement& arrangement : arrangements) {
        table.add({arrangement.type, arrangement.width, arrangement.position});
    }
    return fmt::format("\n{}\n{}", terminal.heading("Multiboot"), table.text(terminal, 2));
}

/// A row for each mode from which a package is excluded.
std::string packagesText(const DeviceDetails& details, const Terminal& terminal) {
    if (details.packages.empty()) {
        return {};
    }
    Table table({"PACKAGE", "NOT IN MODE", "WHERE"});
    for (const auto& [package, changes] : details.packages) {
        std::string name = package;
        for (const DeviceDetails::Exclusion& exclusion : changes.exclusions) {
            table.add({std::exchange(name, ""), exclusion.mode, catalogue::asText(exclusion.origin)});
        }
        if (changes.exclusions.empty()) {
            table.add({name, "-", ""});
        }
    }
    return fmt::format("\n{}\n{}", terminal.heading("Packages"), table.text(terminal, 2));
}

bool hasOwnOptions(const DeviceDetails::Package& package, const DeviceDetails& details) {
    return package.options && package.options->rows != details.options->rows;
}

/// The options in the packages that have their own.
std::string packageMatrices(const DeviceDetails& details, const Terminal& terminal) {
    std::string text;
    for (const auto& [package, changes] : details.packages) {
        if (hasOwnOptions(changes, details)) {
            const std::string title = "Programming options in package " + terminal.sanitised(package) +
                                      (changes.options->rows.empty() ? ": none" : "");
            text += changes.options->rows.empty()
                        ? fmt::format("\n{}\n", terminal.heading(title))
                        : matrix(title, changes.options->rows, false, details.flash, terminal);
        }
    }
    return text;
}

std::string heading(const DeviceDetails& details, const Terminal& terminal) {
    Table table;
    const bool asWritten = details.name == details.spelling;
    table.add({"Device", asWritten
                             ? details.name
                             : fmt::format("{} (in the database: {})", details.name, details.spelling)});
    table.add({"Family", details.flash ? details.family + " (a flash)" : details.family});
    if (!details.flashClass.empty()) {
        table.add({"Class", details.flashClass});
    }
    if (details.idcode) {
        table.add({"IDCODE", details.idcode->value + "  " + catalogue::asText(details.idcode->origin)});
        for (const catalogue::Shadow& shadow : details.idcode->shadows) {
            table.add({"", fmt::format("shadows {}: {}", catalogue::asText(shadow.origin), shadow.text)});
        }
    }
    table.add({"Modes", fmt::format("{}", fmt::join(details.modes, " "))});
    return table.text(terminal);
}

std::string asText(const Shown& shown, const Terminal& terminal) {
    const DeviceDetails& details = shown.details;
    return heading(details, terminal) + section("Properties", details.shownProperties(), terminal) +
           section("Flash properties", details.flashProperties, terminal) + packagesText(details, terminal) +
           multibootText(details.multiboot, terminal) +
           matrix("Operations", details.operations->rows, true, details.flash, terminal) +
           matrix("Programming options", details.options->rows, false, details.flash, terminal) +
           packageMatrices(details, terminal);
}

Json outputKeys(DeviceTable::Outputs outputs) {
    Json keys = Json::array();
    for (std::size_t output = 0; output < DeviceTable::OUTPUTS; ++output) {
        if ((outputs >> output & 1U) != 0) {
            keys.push_back(vocabulary::outputs().at(output));
        }
    }
    return keys;
}

/// Outputs by key and mode, without the modes that have none.
Json asJson(const std::vector<DeviceTable::Row>& rows) {
    Json object = Json::object();
    for (const DeviceTable::Row& row : rows) {
        Json modes = Json::object();
        for (std::size_t mode = 0; mode < DeviceTable::MODES; ++mode) {
            if (row.outputs.at(mode) != 0) {
                modes[vocabulary::modes().at(mode)] = outputKeys(row.outputs.at(mode));
            }
        }
        if (!modes.empty()) {
            object[row.key] = std::move(modes);
        }
    }
    return object;
}

Json bsdlJson(const std::vector<DeviceTable::Row>& rows) {
    Json object = Json::object();
    for (const DeviceTable::Row& row : rows) {
        if (row.bsdl != 0) {
            object[row.key] = outputKeys(row.bsdl);
        }
    }
    return object;
}

Json asJson(const DeviceDetails::Idcode& idcode) {
    Json object{{"value", idcode.value}};
    object.update(catalogue::asJson(idcode.origin));
    if (!idcode.shadows.empty()) {
        object["shadows"] = catalogue::asJson(idcode.shadows);
    }
    return object;
}

Json asJson(const std::vector<DeviceDetails::Arrangement>& arrangements) {
    Json list = Json::array();
    for (const DeviceDetails::Arrangement& arrangement : arrangements) {
        list.push_back(
            {{"type", arrangement.type}, {"width", arrangement.width}, {"position", arrangement.position}});
    }
    return list;
}

/// All packages, with the modes that do not take them and the options that they change.
Json packagesJson(const DeviceDetails& details) {
    Json list = Json::array();
    for (const auto& [package, changes] : details.packages) {
        Json excluded = Json::array();
        for (const DeviceDetails::Exclusion& exclusion : changes.exclusions) {
            excluded.push_back({{"mode", exclusion.mode}});
            excluded.back().update(catalogue::asJson(exclusion.origin));
        }
        list.push_back(
            {{"name", package},
             {"excluded", std::move(excluded)},
             {"options", hasOwnOptions(changes, details) ? asJson(changes.options->rows) : Json()}});
    }
    return list;
}

Json asJson(const Shown& shown) {
    const DeviceDetails& details = shown.details;
    return {{"device", details.name},
            {"spelling", details.spelling},
            {"family", details.family},
            {"idcode", details.idcode ? asJson(*details.idcode) : Json()},
            {"modes", details.modes},
            {"properties", asJson(details.shownProperties())},
            {"flash", details.flash},
            {"flashClass", details.flashClass.empty() ? Json() : Json(details.flashClass)},
            {"flashProperties", asJson(details.flashProperties)},
            {"packages", packagesJson(details)},
            {"multiboot", asJson(details.multiboot)},
            {"operations", asJson(details.operations->rows)},
            {"bsdl", bsdlJson(details.operations->rows)},
            {"options", asJson(details.options->rows)}};
}

/// Notes what an application gets that asks about the device.
void noteFault(Tool& tool, const std::string& device) {
    const auto ask = [&](ConstraintsManager& manager) {
        askForTables(manager, device);
        return std::string();
    };
    noteApplicationFault(tool, ask, std::nullopt);
}

ExitCode run(Tool& tool, const std::string& device) {
    const Shown shown{deviceDetails(askedDevice(tool, device).name)};
    noteFault(tool, shown.details.name);
    return tool.answer(shown);
}

Action declare(ArgumentList& list) {
    auto device = std::make_shared<std::string>();
    list = {
        argument::device(device.get()),
    };
    return [device](Tool& tool) { return run(tool, *device); };
}

} // namespace

const Command command::SHOW{
    "show", "Show everything about a device", "", "tarvik show KS50", declare,
};
