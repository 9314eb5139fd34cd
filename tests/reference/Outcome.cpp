// What comes of calls, brought to one form and compared.
#include "Outcome.h"

#include "support/TarvikTestPeer.h"

#include <Implementation.h>

#include <tarvik/ConstraintsManager.h>

#include <algorithm>
#include <array>

namespace reference {

namespace {

const std::string MANAGER_PRODUCT = "Tarvik";
const std::string MANAGER_SOURCE = "../s/ConstraintsManager";
const std::string DATABASE_SOURCE = "host/database";

/// Messages that the manager issues from places that nobody relies on.
bool hasAnyLine(std::string_view text) {
    return (text.starts_with("Operation ") && text.ends_with(" is not defined.\n")) ||
           (text.starts_with("ACD entry  ") && text.find(" not found for device family ") != text.npos);
}

std::string showMessage(const Message& message) {
    static const std::array<const char*, 3> CHANNELS{"info", "status", "debug"};
    return std::string(CHANNELS.at(static_cast<std::size_t>(message.channel))) + " " +
           (message.line == ANY_LINE ? "any" : std::to_string(message.line)) + " " +
           (message.text ? show(*message.text) : "any text");
}

bool matches(const Message& expected, const Message& actual) {
    return expected.channel == actual.channel && expected.line == actual.line &&
           (!expected.text || expected.text == actual.text);
}

std::string describe(const Outcome& outcome, std::size_t firstMessage) {
    constexpr std::size_t MESSAGES_SHOWN = 5;
    std::string text = outcome.result + "\n";
    const std::size_t end = std::min(outcome.messages.size(), firstMessage + MESSAGES_SHOWN);
    for (std::size_t number = firstMessage; number < end; ++number) {
        text +=
            "      message " + std::to_string(number) + ": " + showMessage(outcome.messages[number]) + "\n";
    }
    return text + "      " + std::to_string(outcome.messages.size()) + " messages in all\n";
}

} // namespace

std::string show(bool value) { return value ? "true" : "false"; }

std::string show(long value) { return std::to_string(value); }

std::string show(const std::string& text) {
    std::string shown = "\"";
    for (const char byte : text) {
        if (byte == '\n') {
            shown += "\\n";
        } else if (byte == '\0') {
            shown += "\\0";
        } else {
            shown += byte;
        }
    }
    return shown + "\"";
}

std::string show(const char* text) { return text == nullptr ? "null" : show(std::string(text)); }

std::string show(const StringBase& text) { return show(std::string(text.c_str(), text.GetLength())); }

std::string show(const std::optional<std::string>& text) { return text ? show(*text) : "null"; }

std::string showRaised(const std::string& type, int line) { return type + " " + std::to_string(line); }

std::string showRaised(const TarvikException& exception) {
    std::string type = "another TarvikException";
    if (dynamic_cast<const DataMismatchException*>(&exception) != nullptr) {
        type = "DataMismatchException";
    } else if (dynamic_cast<const OutOfRangeException*>(&exception) != nullptr) {
        type = "OutOfRangeException";
    } else if (dynamic_cast<const DataNotFoundException*>(&exception) != nullptr) {
        type = "DataNotFoundException";
    }
    if (exception.product() != MANAGER_PRODUCT || exception.source() != MANAGER_SOURCE) {
        type += std::string(" from ") + exception.product() + " " + exception.source();
    }
    return showRaised(type, exception.line());
}

std::string compare(const std::string& what, const Outcome& expected, const Outcome& actual) {
    const auto [left, right] = std::mismatch(expected.messages.begin(), expected.messages.end(),
                                             actual.messages.begin(), actual.messages.end(), matches);
    const bool sameMessages = left == expected.messages.end() && right == actual.messages.end();
    if (expected.result == actual.result && sameMessages) {
        return "";
    }
    const auto firstMessage = static_cast<std::size_t>(left - expected.messages.begin());
    return what + "\n    reference: " + describe(expected, firstMessage) +
           "    manager:   " + describe(actual, firstMessage);
}

void ManagerMessages::listen() {
    Port_MsgManData::setSink([this](const Port_MsgManData::Message& message) { add(message); });
}

void ManagerMessages::add(const Port_MsgManData::Message& message) {
    const bool debug = message.channel == Port_MsgManData::Channel::DEBUG;
    if (message.source == DATABASE_SOURCE) {
        ++m_ofDatabase;
        return;
    }
    std::string text(message.text);
    if (!debug && (message.product != MANAGER_PRODUCT || message.source != MANAGER_SOURCE)) {
        text += " from " + std::string(message.product) + " " + std::string(message.source);
    }
    const int line = hasAnyLine(text) ? ANY_LINE : message.line;
    m_messages.push_back({static_cast<Channel>(message.channel), line, std::move(text)});
}

std::vector<Message> ManagerMessages::take() { return std::exchange(m_messages, {}); }

namespace {

/// The entries of the table, in order of their keys.
auto ordered(const PropertyTable& entries) {
    std::map<std::string, ConstraintsManager::TextSet> result;
    for (const auto& [key, values] : entries) {
        result.emplace(key, values.set());
    }
    return result;
}

} // namespace

std::vector<Member> members(const Reference& reference) {
    std::vector<Member> members;
    const std::array<std::string, 9> modes{"bs",  "ss",     "sm",      "bsFile", "dp770",
                                           "spi", "kiteCf", "kiteMpm", "pff"};
    for (std::size_t mode = 0; mode < modes.size(); ++mode) {
        members.push_back({"m_" + modes[mode] + "Cables", show(reference.m_cables[mode])});
        members.push_back({"m_" + modes[mode] + "Devices", show(reference.m_devices[mode])});
    }
    members.push_back({"m_supportedDevices", show(reference.m_supportedDevices)});
    members.push_back({"m_programOptionPackages", show(reference.m_programOptionPackages)});
    members.push_back({"m_notSupportedPartInMode", show(reference.m_notSupportedPartInMode)});
    members.push_back({"m_loadedFamilies", show(reference.m_loadedFamilies)});
    members.push_back({"m_operationsLoaded", show(reference.m_operationsLoaded)});
    members.push_back({"m_programOptionsLoaded", show(reference.m_programOptionsLoaded)});
    members.push_back({"m_deviceProperties", show(reference.m_deviceProperties)});
    members.push_back({"m_deviceFamilyCache", show(reference.m_deviceFamilyCache)});
    members.push_back({"m_partFamily", show(reference.m_partFamily)});
    members.push_back({"m_spiProperties", show(reference.m_spiProperties)});
    members.push_back({"m_spiNames", show(reference.m_spiNames)});
    members.push_back({"m_spiFamilies", show(reference.m_spiFamilies)});
    members.push_back({"the devices by class", show(reference.m_classDevices)});
    members.push_back({"m_multibootTypes", show(reference.m_multibootTypes)});
    members.push_back({"m_operationOptions", "{}"});
    return members;
}

std::vector<Member> members(ConstraintsManager& manager) {
    auto& members = TarvikTestPeer::members(manager);
    const std::vector<std::vector<StringBase>> classDevices{members.m_at1Devices,  members.m_st1Devices,
                                                            members.m_st2Devices,  members.m_bpi1Devices,
                                                            members.m_bpi2Devices, members.m_bpi3Devices};
    return {
        {"m_bsCables", show(members.m_bsCables)},
        {"m_bsDevices", show(members.m_bsDevices)},
        {"m_ssCables", show(members.m_ssCables)},
        {"m_ssDevices", show(members.m_ssDevices)},
        {"m_smCables", show(members.m_smCables)},
        {"m_smDevices", show(members.m_smDevices)},
        {"m_bsFileCables", show(members.m_bsFileCables)},
        {"m_bsFileDevices", show(members.m_bsFileDevices)},
        {"m_dp770Cables", show(members.m_dp770Cables)},
        {"m_dp770Devices", show(members.m_dp770Devices)},
        {"m_spiCables", show(members.m_spiCables)},
        {"m_spiDevices", show(members.m_spiDevices)},
        {"m_kiteCfCables", show(members.m_kiteCfCables)},
        {"m_kiteCfDevices", show(members.m_kiteCfDevices)},
        {"m_kiteMpmCables", show(members.m_kiteMpmCables)},
        {"m_kiteMpmDevices", show(members.m_kiteMpmDevices)},
        {"m_pffCables", show(members.m_pffCables)},
        {"m_pffDevices", show(members.m_pffDevices)},
        {"m_supportedDevices", show(members.m_supportedDevices)},
        {"m_programOptionPackages", show(members.m_programOptionPackages)},
        {"m_notSupportedPartInMode", show(members.m_notSupportedPartInMode)},
        {"m_loadedFamilies", show(members.m_loadedFamilies)},
        {"m_operationsLoaded", show(members.m_operationsLoaded)},
        {"m_programOptionsLoaded", show(members.m_programOptionsLoaded)},
        {"m_deviceProperties", show(ordered(members.m_deviceProperties))},
        {"m_deviceFamilyCache", show(members.m_deviceFamilyCache)},
        {"m_partFamily", show(members.m_partFamily.get())},
        {"m_spiProperties", show(members.m_spiProperties.get())},
        {"m_spiNames", show(members.m_spiNames)},
        {"m_spiFamilies", show(members.m_spiFamilies)},
        {"the devices by class", show(classDevices)},
        {"m_multibootTypes", show(members.m_multibootTypes)},
        {"m_operationOptions", show(members.m_operationOptions)},
    };
}

} // namespace reference
