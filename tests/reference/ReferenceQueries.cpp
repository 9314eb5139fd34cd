// The reference's questions about one device: what it offers, and its properties.
#include "Reference.h"

#include <algorithm>

namespace reference {

namespace {

bool holds(const std::vector<std::string>& list, const std::string& text) {
    return std::find(list.begin(), list.end(), text) != list.end();
}

/// Bit i is set when `allowed(i)`.
template <typename Allowed>
int mask(int count, Allowed allowed) {
    unsigned bits = 0;
    for (int value = 0; value < count; ++value) {
        if (allowed(value)) {
            bits |= 1U << value;
        }
    }
    return static_cast<int>(bits);
}

std::string outOfRange(const std::string& what, int value) {
    return what + " is out of range -- " + std::to_string(value) + ".\n";
}

} // namespace

int Reference::getDeviceOperations(const char* device, TARVIKNS::MODE_TYPE mode,
                                   TARVIKNS::OUTPUT_TYPE output) {
    std::string name = textOf(device);
    if (static_cast<int>(mode) == 5) {
        name = "spi";
    } else {
        if (!isSupported(name)) {
            name = getPartFamily(device);
        }
        if (!m_loadedFamilies.contains(name)) {
            loadDeviceData(name, nullptr);
        }
    }
    const Block block = operationBlock(name);
    return mask(32, [&](int operation) {
        return block &&
               m_operations.contains({*block, operation, static_cast<int>(mode), static_cast<int>(output)});
    });
}

int Reference::getProgramOptions(const char* device, TARVIKNS::MODE_TYPE mode, TARVIKNS::OUTPUT_TYPE output,
                                 const char* package) {
    std::string plain = textOf(device);
    std::string owner = plain + textOf(package);
    const int m = static_cast<int>(mode);
    const int o = static_cast<int>(output);
    if (m == 5) {
        owner = "spi";
    } else if (getPartFamily(device) != plain && m_programOptionPackages.contains(owner)) {
        if (!holds(m_programOptionsLoaded, owner)) {
            loadDeviceData(plain, package);
        }
    } else {
        const std::string family = getPartFamily(device);
        if (family != plain && !m_programOptionPackages.contains(plain)) {
            plain = family;
        }
        if (!holds(m_programOptionsLoaded, plain)) {
            loadDeviceData(plain, nullptr);
        }
        owner = plain;
    }
    if (m < 0 || m > 5) {
        issueDebug(outOfRange("Mode", m));
        return 0;
    }
    if (o < 0 || o > 4) {
        issueDebug(outOfRange("Outstream(Cable or file type)", o));
        return 0;
    }
    const Block block = programOptionBlock(owner);
    return mask(24, [&](int option) { return block && m_options.contains({*block, option, m, o}); });
}

int Reference::getBsdlOperations(const char* device, TARVIKNS::OUTPUT_TYPE output) {
    std::string name = textOf(device);
    if (!isSupported(name)) {
        name = getPartFamily(device);
    }
    if (!holds(m_operationsLoaded, name)) {
        loadDeviceData(name, nullptr);
    }
    const Block block = operationBlock(name);
    const int o = static_cast<int>(output);
    if (o >= 5) {
        issueDebug(outOfRange("Outstream(Cable or file type)", o));
        return 0;
    }
    return mask(32, [&](int operation) {
        return block && m_bsdlOperations.contains({*block, operation, o});
    });
}

bool Reference::checkConstraints(TARVIKNS::MODE_TYPE mode, TARVIKNS::OUTPUT_TYPE output, const char* device,
                                 TARVIKNS::OP_TYPE operation, const char* /*family*/) {
    const int m = static_cast<int>(mode);
    const int o = static_cast<int>(output);
    const int op = static_cast<int>(operation);
    std::string name = textOf(device);
    if (m == 5) {
        name = "spi";
    } else {
        if (!isSupported(name)) {
            name = getPartFamily(baseName(name).c_str());
        }
        if (!holds(m_operationsLoaded, name)) {
            loadDeviceData(name, nullptr);
        }
        if (m < 0 || m >= 6) {
            issueDebug(outOfRange("Mode", m));
            return false;
        }
    }
    if (o < 0 || o > 4) {
        issueDebug(outOfRange("Outstream(Cable or file type", o));
        return false;
    }
    if (op < 0 || op > 31) {
        issueDebug(outOfRange("Opeartion", op));
        return false;
    }
    const Block block = operationBlock(name);
    return block && m_operations.contains({*block, op, m, o});
}

bool Reference::checkConstraints(const char* device, TARVIKNS::MODE_TYPE mode, TARVIKNS::OP_TYPE operation,
                                 const char* /*family*/) {
    return hasDevicePropertyValue(baseName(textOf(device)), operationType2String(operation),
                                  modeType2String(mode));
}

TextSet Reference::getDeviceOperationOptions(const char* device, const char* operation,
                                             TARVIKNS::MODE_TYPE mode) {
    if (!hasDevicePropertyValue(textOf(device), textOf(operation), modeType2String(mode))) {
        return {};
    }
    const std::string key = upper("OP_" + textOf(operation));
    const TextSet values = getDeviceStringProperties(device, key.c_str());
    if (!values.empty()) {
        return values;
    }
    return getDeviceStringProperties(device, (key + "_" + modeType2String(mode)).c_str());
}

bool Reference::hasDevicePropertyValue(const std::string& device, const std::string& key,
                                       const std::string& value) {
    return getDeviceStringProperties(device.c_str(), key.c_str()).contains(value);
}

TextSet Reference::getDeviceStringProperties(const char* device, const char* key) {
    const std::string name = textOf(device);
    if (!m_loadedFamilies.contains(name)) {
        loadDeviceData(name, nullptr);
    }
    if (m_deviceProperties.contains(name + "_" + textOf(key))) {
        return m_deviceProperties[name + "_" + textOf(key)];
    }
    const std::string family = getPartFamily(device);
    if (family == name) {
        return {};
    }
    if (!m_loadedFamilies.contains(family)) {
        loadDeviceData(family, nullptr);
    }
    const auto found = m_deviceProperties.find(family + "_" + textOf(key));
    return found == m_deviceProperties.end() ? TextSet{} : found->second;
}

std::optional<std::string> Reference::getDeviceStringProperty(const char* device, const char* key) {
    if (isSpiDevice(textOf(device))) {
        return getSpiDeviceStringProperty(device, key);
    }
    TextSet values = getDeviceStringProperties(device, key);
    if (values.empty()) {
        const std::string family = getPartFamily(device);
        if (family != textOf(device)) {
            m_partFamily = family;
            values = getDeviceStringProperties(family.c_str(), key);
        }
    }
    if (!values.empty()) {
        return *values.begin();
    }
    issueInfo(ANY_LINE, "ACD entry  " + std::string(key == nullptr ? "(null)" : key) +
                            " not found for device family " + (device == nullptr ? "(null)" : device) +
                            ".\n");
    raiseIfOn("DataNotFoundException", 437);
    return std::nullopt;
}

bool Reference::getDeviceBoolProperty(const char* device, const char* key) {
    return hasDevicePropertyValue(textOf(device), textOf(key), "TRUE");
}

long Reference::getDeviceLongProperty(const char* device, const char* key) {
    const std::optional<std::string> text = getDeviceStringProperty(device, key);
    return text ? decimal(*text) : -1;
}

} // namespace reference
