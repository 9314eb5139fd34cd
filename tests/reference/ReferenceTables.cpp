// The reference's start-up, its constraint tables and the entries that fill them.
#include "Reference.h"

#include <algorithm>
#include <cstddef>
#include <utility>

namespace reference {

namespace {

const std::vector<std::string> MODE_KEYS{"BS",  "SS",     "SM",      "BSFILE", "DP770",
                                         "SPI", "KITECF", "KITEMPM", "PFF"};

} // namespace

std::string textOf(const char* text) { return text == nullptr ? "" : text; }

long decimal(const std::string& text) {
    std::size_t at = 0;
    while (at < text.size() && std::string(" \t\n\v\f\r").find(text[at]) != std::string::npos) {
        ++at;
    }
    const bool negative = at < text.size() && text[at] == '-';
    if (at < text.size() && (text[at] == '-' || text[at] == '+')) {
        ++at;
    }
    long long value = 0;
    for (; at < text.size() && text[at] >= '0' && text[at] <= '9'; ++at) {
        value = std::min(value * 10 + (text[at] - '0'), 1LL << 32);
    }
    value = negative ? -value : value;
    return static_cast<long>(std::max(-2147483648LL, std::min(value, 2147483647LL)));
}

Reference::Reference(const std::map<std::string, std::string>& files) : m_databases(files) {
    try {
        initialise();
    } catch (const Raised& raised) {
        m_messages.push_back({Channel::INFO, raised.line, std::nullopt});
    }
    m_exceptions = true;
}

std::vector<Message> Reference::takeMessages() { return std::exchange(m_messages, {}); }

void Reference::issueInfo(int line, const std::string& text) {
    m_messages.push_back({Channel::INFO, line, text});
}

void Reference::issueDebug(const std::string& text) { m_messages.push_back({Channel::DEBUG, 0, text}); }

void Reference::raiseIfOn(const std::string& type, int line) {
    if (m_exceptions) {
        throw Raised{type, line};
    }
}

void Reference::initialise() {
    if (!m_databases.has("base.acd")) {
        // The host names the place in its own report.
        throw Raised{"DataNotFoundException", ANY_LINE};
    }
    loadSupportedLists();
    loadModeSets();
    loadDeviceIdcodes();
    loadNotSupportedParts();
    for (int value = 0; value < 32; ++value) {
        m_operationOrders.push_back(value);
    }
    for (int value = 0; value < 24; ++value) {
        m_programOptionOrders.push_back(value);
    }
    loadSpiCatalogue();
}

void Reference::loadSupportedLists() {
    const Accessor base = m_databases.file("base.acd");
    for (const std::string& name : base.items("DEVICE_SUPPORTED")) {
        m_supportedDevices.insert(name);
    }
    for (const std::string& name : base.items("PROGRAM_OPTION_PACKAGE")) {
        m_programOptionPackages.insert(name);
    }
}

void Reference::loadModeSets() {
    const Accessor base = m_databases.file("base.acd");
    for (std::size_t mode = 0; mode < MODE_KEYS.size(); ++mode) {
        std::vector<Record> records = base.records(MODE_KEYS[mode]);
        records.resize(std::max<std::size_t>(records.size(), 2));
        for (std::size_t field = 1; field < records[0].size(); ++field) {
            m_cables[mode].insert(static_cast<int>(cableString2Type(records[0][field].c_str())));
        }
        for (std::size_t field = 1; field < records[1].size(); ++field) {
            m_devices[mode].insert(records[1][field]);
        }
    }
}

void Reference::loadDeviceIdcodes() {
    for (const Record& record : m_databases.file("base.acd").records("IDCODE")) {
        m_deviceIdcodes[record[0]] = fieldOf(record, 1).value_or("");
    }
}

void Reference::loadNotSupportedParts() {
    for (const std::string& part : m_databases.file("base.acd").items("NOT_SUPPORTED_PART_IN_MODE")) {
        m_notSupportedPartInMode.insert(part);
    }
}

int Reference::readOperation(const std::string& key, const std::string& family, int location) {
    const int operation = static_cast<int>(operationString2Type(key.c_str()));
    if (operation == 32) {
        issueDebug(family + " op = " + key + "\n");
        raiseIfOn("OutOfRangeException", location);
    }
    return operation;
}

int Reference::readMode(const Record& record, const std::string& family, int missing) {
    const std::optional<std::string> text = fieldOf(record, 1);
    if (!text) {
        issueDebug(family + " mode =   (null)\n");
        raiseIfOn("DataMismatchException", missing);
    }
    return static_cast<int>(modeString2Type(text.value_or("").c_str()));
}

std::vector<std::string> Reference::outputTexts(const Record& record, std::size_t first,
                                                const std::string& family, int missing) {
    if (record.size() <= first) {
        issueDebug(family + " out = (null)\n");
        raiseIfOn("DataMismatchException", missing);
        return {};
    }
    return {record.begin() + static_cast<std::ptrdiff_t>(first), record.end()};
}

int Reference::readOutput(const std::string& text, const std::string& family, int unknown) {
    const int output = static_cast<int>(cableString2Type(text.c_str()));
    if (output == 9) {
        issueDebug(family + " out   = " + text + "\n");
        raiseIfOn("DataMismatchException", unknown);
    }
    return output;
}

void Reference::parseOperationEntries(const Accessor& accessor, const Block& block,
                                      const std::string& family) {
    for (const Record& record : accessor.records("OPERATION")) {
        const int operation = readOperation(record[0], family, 1631);
        const int mode = readMode(record, family, 1638);
        for (const std::string& text : outputTexts(record, 2, family, 1649)) {
            const int output = readOutput(text, family, 1659);
            if (block && operation < 32 && mode < 6 && output < 5) {
                m_operations.emplace(*block, operation, mode, output);
            }
        }
    }
}

void Reference::parseBsdlOperationEntries(const Accessor& accessor, const Block& block,
                                          const std::string& family) {
    for (const Record& record : accessor.records("BSDL_OPERATION")) {
        const int operation = readOperation(record[0], family, 1688);
        for (const std::string& text : outputTexts(record, 1, family, 1695)) {
            const int output = readOutput(text, family, 1705);
            if (block && operation < 32 && output < 5) {
                m_bsdlOperations.emplace(*block, operation, output);
            }
        }
    }
}

void Reference::parseProgramOptionEntries(const Accessor& accessor, const std::string& family) {
    const Block block = programOptionBlock(family);
    for (const Record& record : accessor.records("PROGRAM_OPTION")) {
        const int option = static_cast<int>(optionString2Type(record[0].c_str()));
        const int mode = readMode(record, family, 1739);
        for (const std::string& text : outputTexts(record, 2, family, 1750)) {
            const int output = readOutput(text, family, 1760);
            if (block && mode < 6 && output < 5) {
                m_options.emplace(*block, option, mode, output);
            }
        }
    }
}

Reference::Block Reference::programOptionBlock(const std::string& name) {
    if (m_programOptionPackages.contains(name)) {
        return name;
    }
    raiseIfOn("OutOfRangeException", 2024);
    return std::nullopt;
}

bool Reference::checkConstraints(TARVIKNS::MODE_TYPE mode, TARVIKNS::OUTPUT_TYPE output) {
    const int m = static_cast<int>(mode);
    const int o = static_cast<int>(output);
    if (m == 8 || (m >= 0 && m < 8 && m_cables.at(static_cast<std::size_t>(m)).contains(o))) {
        return true;
    }
    issueInfo(201, outputDisplayName(o) + " is not supported in " + modeDisplayName(m) + "\n");
    return false;
}

bool Reference::isPartAllowedInMode(int mode, const std::string& device, const char* package) {
    const std::string modeKey = modeType2String(static_cast<TARVIKNS::MODE_TYPE>(mode));
    return !m_notSupportedPartInMode.contains(modeKey + "_" + device + "_" + textOf(package));
}

bool Reference::familySupportsMode(int mode, const std::string& device, const char* package) {
    if (package != nullptr && !isPartAllowedInMode(mode, device, package)) {
        return false;
    }
    const std::string family = getPartFamily(baseName(device).c_str());
    if (mode >= 0 && mode <= 8) {
        return m_devices.at(static_cast<std::size_t>(mode)).contains(family);
    }
    raiseIfOn("OutOfRangeException", 644);
    return false;
}

bool Reference::deviceSupportsMode(int mode, const std::string& device, const char* package) {
    return familySupportsMode(mode, mode == 5 ? "spi" : baseName(device), package);
}

namespace {

std::string partName(const std::string& device, const char* package) {
    return package == nullptr ? device : device + "_" + package;
}

} // namespace

bool Reference::checkConstraints(TARVIKNS::MODE_TYPE mode, const char* device, const char* package) {
    const int m = static_cast<int>(mode);
    const std::string name = baseName(textOf(device));
    if (m == 8 || m == 5 || deviceSupportsMode(m, name, package)) {
        return true;
    }
    issueInfo(229, partName(name, package) + " is not supported in " + modeDisplayName(m) + "\n");
    return false;
}

bool Reference::checkConstraints(TARVIKNS::MODE_TYPE mode, TARVIKNS::OUTPUT_TYPE output, const char* device,
                                 const char* package) {
    const int m = static_cast<int>(mode);
    const int o = static_cast<int>(output);
    const std::string name = baseName(textOf(device));
    const bool outputAllowed =
        m == 8 || (m >= 0 && m < 8 && m_cables.at(static_cast<std::size_t>(m)).contains(o));
    const bool deviceAllowed = deviceSupportsMode(m, name, package);
    if (outputAllowed && deviceAllowed) {
        return true;
    }
    if (outputAllowed) {
        issueInfo(256, partName(name, package) + " is not supported in " + modeDisplayName(m) + "\n");
    } else {
        issueInfo(249, outputDisplayName(o) + " is not supported in " + modeDisplayName(m) + "\n");
    }
    return false;
}

} // namespace reference
