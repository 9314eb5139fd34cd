// `show`: everything about one device, to read or to process.
#include "commands/Commands.h"

#include "commands/CommonArguments.h"
#include "model/Vocabulary.h"
#include "query/DeviceDetails.h"
#include "query/Tool.h"
#include "term/Table.h"

#include <fmt/format.h>
#include <fmt/ranges.h>

#include <memory>

namespace {

struct Sheet {
    DeviceSheet facts;
};

/// "P-U--", or "-" for none.
std::string cell(DeviceSheet::Outputs outputs, const std::string& letters) {
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

/// Rows by modes; the cells tell the outputs.
std::string matrix(const char* title, const std::vector<DeviceSheet::Row>& rows, bool withBsdl,
                   const Terminal& terminal) {
    if (rows.empty()) {
        return {};
    }
    const std::string letters = outputLetters();
    Table::Row headings{""};
    for (std::size_t mode = 0; mode < DeviceSheet::MODES; ++mode) {
        headings.push_back(vocabulary::modes().at(mode));
    }
    if (withBsdl) {
        headings.emplace_back("BSDL");
    }
    Table table(std::move(headings));
    for (const DeviceSheet::Row& row : rows) {
        Table::Row cells{row.key};
        for (const DeviceSheet::Outputs outputs : row.outputs) {
            cells.push_back(cell(outputs, letters));
        }
        if (withBsdl) {
            cells.push_back(cell(row.bsdl, letters));
        }
        table.add(std::move(cells));
    }
    return fmt::format("\n{}\n{}{}", terminal.heading(title), legend(letters), table.text(terminal, 2));
}

std::string section(const char* title, const Properties& properties, const Terminal& terminal) {
    return properties.empty()
               ? std::string()
               : fmt::format("\n{}\n{}", terminal.heading(title), asText(properties, terminal, 2));
}

std::string multibootText(const std::vector<DeviceSheet::Arrangement>& arrangements,
                          const Terminal& terminal) {
    if (arrangements.empty()) {
        return {};
    }
    Table table;
    for (const DeviceSheet::Arrangement& arrangement : arrangements) {
        table.add({arrangement.type, arrangement.width, arrangement.position});
    }
    return fmt::format("\n{}\n{}", terminal.heading("Multiboot"), table.text(terminal, 2));
}

std::string heading(const DeviceSheet& sheet, const Terminal& terminal) {
    Table table;
    const bool asWritten = sheet.name == sheet.spelling;
    table.add({"Device",
               asWritten ? sheet.name : fmt::format("{} (in the database: {})", sheet.name, sheet.spelling)});
    table.add({"Family", sheet.flash ? sheet.family + " (a flash)" : sheet.family});
    if (sheet.idcode) {
        table.add({"IDCODE", sheet.idcode->value + "  " + catalogue::asText(sheet.idcode->origin)});
        for (const catalogue::Shadow& shadow : sheet.idcode->shadows) {
            table.add({"", fmt::format("shadows {}: {}", catalogue::asText(shadow.origin), shadow.text)});
        }
    }
    table.add({"Modes", fmt::format("{}", fmt::join(sheet.modes, " "))});
    return table.text(terminal);
}

std::string asText(const Sheet& sheet, const Terminal& terminal) {
    const DeviceSheet& facts = sheet.facts;
    return heading(facts, terminal) + section("Properties", facts.properties, terminal) +
           section("Flash properties", facts.flashProperties, terminal) +
           multibootText(facts.multiboot, terminal) + matrix("Operations", facts.operations, true, terminal) +
           matrix("Programming options", facts.options, false, terminal);
}

Json outputKeys(DeviceSheet::Outputs outputs) {
    Json keys = Json::array();
    for (std::size_t output = 0; output < DeviceSheet::OUTPUTS; ++output) {
        if ((outputs >> output & 1U) != 0) {
            keys.push_back(vocabulary::outputs().at(output));
        }
    }
    return keys;
}

/// Outputs by key and mode, without the modes that have none.
Json asJson(const std::vector<DeviceSheet::Row>& rows) {
    Json object = Json::object();
    for (const DeviceSheet::Row& row : rows) {
        Json modes = Json::object();
        for (std::size_t mode = 0; mode < DeviceSheet::MODES; ++mode) {
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

Json bsdlJson(const std::vector<DeviceSheet::Row>& rows) {
    Json object = Json::object();
    for (const DeviceSheet::Row& row : rows) {
        if (row.bsdl != 0) {
            object[row.key] = outputKeys(row.bsdl);
        }
    }
    return object;
}

Json asJson(const DeviceSheet::Idcode& idcode) {
    Json object{{"value", idcode.value}};
    object.update(catalogue::asJson(idcode.origin));
    if (!idcode.shadows.empty()) {
        object["shadows"] = catalogue::asJson(idcode.shadows);
    }
    return object;
}

Json asJson(const std::vector<DeviceSheet::Arrangement>& arrangements) {
    Json list = Json::array();
    for (const DeviceSheet::Arrangement& arrangement : arrangements) {
        list.push_back(
            {{"type", arrangement.type}, {"width", arrangement.width}, {"position", arrangement.position}});
    }
    return list;
}

Json asJson(const Sheet& sheet) {
    const DeviceSheet& facts = sheet.facts;
    return {{"device", facts.name},
            {"spelling", facts.spelling},
            {"family", facts.family},
            {"idcode", facts.idcode ? asJson(*facts.idcode) : Json()},
            {"modes", facts.modes},
            {"properties", asJson(facts.properties)},
            {"flash", facts.flash},
            {"flashProperties", asJson(facts.flashProperties)},
            {"multiboot", asJson(facts.multiboot)},
            {"operations", asJson(facts.operations)},
            {"bsdl", bsdlJson(facts.operations)},
            {"options", asJson(facts.options)}};
}

ExitCode run(Tool& tool, const std::string& device) { return tool.answer(Sheet{deviceSheet(tool, device)}); }

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
