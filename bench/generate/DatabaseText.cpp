#include "generate/DatabaseText.h"

#include <tarvik/ConstraintsManager.h>

#include <filesystem>
#include <fstream>
#include <stdexcept>

// The facts as database files, written as a data author would write them: a record a line, a device a section.

namespace bench {

namespace {

constexpr std::array<const char*, MODES> MODE_NAMES{"Bscan", "SSerial", "Smap", "BSFILE", "DP770", "SPI"};
constexpr std::array<const char*, 9> MODE_KEYS{"BS",  "SS",     "SM",      "BSFILE", "DP770",
                                               "SPI", "KITECF", "KITEMPM", "PFF"};
/// The modes in which families have records: in the last one, SPI, all devices are looked up as spi.
constexpr std::size_t FAMILY_MODES = MODES - 1;
constexpr const char* ALL_OUTPUTS = "PARALLEL,ZORVA,USB2,SVF,STAPL";

/// Records behind one another, each on a line of its own.
class Records {
public:
    explicit Records(const char* key) : m_text(std::string(key) + " = ") {}

    void add(const std::string& record) {
        m_text += m_isEmpty ? record : ": \\\n    " + record;
        m_isEmpty = false;
    }

    [[nodiscard]] std::string text() const { return m_isEmpty ? std::string() : m_text + "\n"; }

private:
    std::string m_text;
    bool m_isEmpty = true;
};

[[nodiscard]] std::string outputName(std::size_t output) {
    return ConstraintsManager::cableType2String(static_cast<TARVIKNS::OUTPUT_TYPE>(output)).c_str();
}

[[nodiscard]] std::string operationName(std::size_t operation) {
    return ConstraintsManager::operationType2String(static_cast<TARVIKNS::OP_TYPE>(operation)).c_str();
}

[[nodiscard]] std::string optionName(std::size_t option) {
    return ConstraintsManager::optionType2String(static_cast<TARVIKNS::PROGRAM_OPTION>(option)).c_str();
}

/// The outputs, each behind a ",", for which `isSet` holds.
template <typename IsSet>
[[nodiscard]] std::string outputsWhere(IsSet isSet) {
    std::string names;
    for (std::size_t output = 0; output < OUTPUTS; ++output) {
        if (isSet(output)) {
            names += "," + outputName(output);
        }
    }
    return names;
}

template <typename Name>
[[nodiscard]] std::string tableText(const char* key, const Masks& masks, Name name) {
    Records records(key);
    for (std::size_t row = 0; row < OPERATIONS; ++row) {
        for (std::size_t mode = 0; mode < FAMILY_MODES; ++mode) {
            const std::string outputs = outputsWhere(
                [&](std::size_t output) { return (masks[cellOf(mode, output)] >> row & 1U) != 0; });
            if (!outputs.empty()) {
                records.add(name(row) + "," + MODE_NAMES[mode] + outputs);
            }
        }
    }
    return records.text();
}

[[nodiscard]] std::string bsdlText(const std::array<std::uint32_t, OUTPUTS>& masks) {
    Records records("BSDL_OPERATION");
    for (std::size_t row = 0; row < OPERATIONS; ++row) {
        const std::string outputs =
            outputsWhere([&](std::size_t output) { return (masks[output] >> row & 1U) != 0; });
        if (!outputs.empty()) {
            records.add(operationName(row) + outputs);
        }
    }
    return records.text();
}

[[nodiscard]] std::string propertyText(const std::string& key, const std::vector<Property>& properties) {
    Records records(key.c_str());
    for (const Property& property : properties) {
        records.add(property.key + "," + property.value);
    }
    return records.text();
}

[[nodiscard]] std::string familyText(const Family& family) {
    std::string text = tableText("OPERATION", family.operations, operationName) +
                       bsdlText(family.bsdlOperations) +
                       tableText("PROGRAM_OPTION", family.options, optionName);
    for (const Device& device : family.devices) {
        text += "\n[" + device.name + "]\n" + propertyText("PROPERTY", device.properties);
    }
    return text;
}

[[nodiscard]] std::string baseText(const Facts& facts) {
    std::string families;
    for (const Family& family : facts.families) {
        families += "," + family.name;
    }
    std::string text =
        "DEVICE_SUPPORTED = base,spi" + families + "\nPROGRAM_OPTION_PACKAGE = base,spi" + families + "\n";
    for (std::size_t mode = 0; mode < MODE_KEYS.size(); ++mode) {
        text += std::string(MODE_KEYS[mode]) + " = outputs," + ALL_OUTPUTS + ":families" +
                (mode < FAMILY_MODES    ? families
                 : mode == FAMILY_MODES ? ",spi"
                                        : "") +
                "\n";
    }
    Records codes("IDCODE");
    constexpr std::string_view DIGITS = "0123456789ABCDEF";
    std::size_t number = 0;
    for (const Family& family : facts.families) {
        for (const Device& device : family.devices) {
            std::string code = "0x00000000";
            std::size_t rest = ++number * 2 + 1;
            for (std::size_t digit = code.size() - 1; rest != 0; --digit, rest /= DIGITS.size()) {
                code[digit] = DIGITS[rest % DIGITS.size()];
            }
            codes.add(device.name + "," + code);
        }
    }
    return text + codes.text();
}

[[nodiscard]] std::string flashText(const Facts& facts) {
    std::string names;
    std::string properties;
    for (const Device& flash : facts.flashes) {
        names += (names.empty() ? "" : ",") + flash.name;
        properties += propertyText(flash.name + "_PROPERTY", flash.properties);
    }
    return "DEVICE_FAMILY = ST1\nST1_DEVICES = " + names + "\n" + properties +
           "OPERATION = PROGRAM,SPI,USB2\nPROGRAM_OPTION = VERIFY,SPI,USB2\n";
}

} // namespace

std::map<std::string, std::string> databaseText(const Facts& facts) {
    std::map<std::string, std::string> files{{"base.acd", baseText(facts)}, {"spi.acd", flashText(facts)}};
    for (const Family& family : facts.families) {
        files.emplace(family.name + ".acd", familyText(family));
    }
    return files;
}

void writeDatabase(const Facts& facts, const std::string& directory) {
    std::filesystem::create_directories(directory);
    for (const auto& [name, text] : databaseText(facts)) {
        std::ofstream file(std::filesystem::path(directory) / name, std::ios::binary);
        file << text;
        if (!file.flush()) {
            throw std::runtime_error("can't write " + name + " in " + directory);
        }
    }
}

} // namespace bench
