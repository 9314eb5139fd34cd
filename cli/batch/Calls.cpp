// The exported interface as a table: one row for each method, and the rules that match requests with rows.
#include "batch/Calls.h"

#include "text/Suggest.h"

#include <fmt/format.h>
#include <fmt/ranges.h>

#include <algorithm>
#include <limits>
#include <span>
#include <unordered_map>

namespace {

using binding::Arguments;
using binding::Call;
using binding::call;
using binding::Kind;
using binding::Parameter;
using binding::Recorder;
using Manager = ConstraintsManager;
using Mode = TARVIKNS::MODE_TYPE;
using Operation = TARVIKNS::OP_TYPE;
using Output = TARVIKNS::OUTPUT_TYPE;
using Text = const char*;

StringBase removePackageName(StringBase device) {
    Manager::removePackageName(device);
    return device;
}

template <void (Manager::*Method)(TarvikSmokeMgr*)>
Json dump(Manager& manager, Recorder wanted) {
    if (wanted == Recorder::NONE) {
        (manager.*Method)(nullptr);
        return nullptr;
    }
    TarvikSmokeMgr recorder;
    (manager.*Method)(&recorder);
    return toStdString(recorder.text());
}

template <void (Manager::*Method)(TarvikSmokeMgr*)>
void dumpToStatus(Manager& manager) {
    (manager.*Method)(nullptr);
}

template <typename... Types>
constexpr auto check(bool (Manager::*method)(Types...)) {
    return method;
}

constexpr std::string_view REMOVE = "RemoveConstraintsManager";

/// Overloads are neighbours.
constexpr Call CALLS[] = {
    call<&Manager::getConstraintsManager>("getConstraintsManager"),
    call<&Manager::RemoveConstraintsManager>(REMOVE),
    call<&Manager::setExceptions>("setExceptions", "exceptions"),
    call<&Manager::getOperationOrders>("getOperationOrders"),
    call<&Manager::getProgramOptionOrders>("getProgramOptionOrders"),

    call<&Manager::modeString2Type>("modeString2Type", "text"),
    call<&Manager::modeType2String>("modeType2String", "mode"),
    call<&Manager::cableString2Type>("cableString2Type", "text"),
    call<&Manager::cableType2String>("cableType2String", "output"),
    call<&Manager::operationString2Type>("operationString2Type", "text"),
    call<&Manager::operationDisplayString2Type>("operationDisplayString2Type", "text"),
    call<&Manager::operationType2String>("operationType2String", "operation"),
    call<&Manager::operationType2DisplayString>("operationType2DisplayString", "operation"),
    call<&Manager::optionString2Type>("optionString2Type", "text"),
    call<&Manager::optionType2String>("optionType2String", "option"),
    call<&removePackageName>("removePackageName", "device"),

    call<check<Mode, Output>(&Manager::checkConstraints)>("checkConstraints", "mode", "output"),
    call<check<Mode, Text, Text>(&Manager::checkConstraints)>("checkConstraints", "mode", "device",
                                                              "package"),
    call<check<Mode, Output, Text, Text>(&Manager::checkConstraints)>("checkConstraints", "mode", "output",
                                                                      "device", "package"),
    call<check<Mode, Output, Text, Operation, Text>(&Manager::checkConstraints)>(
        "checkConstraints", "mode", "output", "device", "operation", "family"),
    call<check<Text, Mode, Operation, Text>(&Manager::checkConstraints)>("checkConstraints", "device", "mode",
                                                                         "operation", "family"),

    call<&Manager::getDeviceOperations>("getDeviceOperations", "device", "mode", "output"),
    call<&Manager::getProgramOptions>("getProgramOptions", "device", "mode", "output", "package"),
    call<&Manager::getBsdlOperations>("getBsdlOperations", "device", "output"),
    call<&Manager::getDeviceOperationOptions>("getDeviceOperationOptions", "device", "operation", "mode"),

    call<&Manager::getDeviceStringProperties>("getDeviceStringProperties", "device", "key"),
    call<&Manager::getDeviceStringProperty>("getDeviceStringProperty", "device", "key"),
    call<&Manager::getDeviceBoolProperty>("getDeviceBoolProperty", "device", "key"),
    call<&Manager::getDeviceLongProperty>("getDeviceLongProperty", "device", "key"),

    call<&Manager::getPartFamily>("getPartFamily", "device"),
    call<&Manager::addCachedDeviceFamily>("addCachedDeviceFamily", "device", "family"),
    call<&Manager::isKorvelDevice>("isKorvelDevice", "device"),
    call<&Manager::getAllDeviceIdcodes>("getAllDeviceIdcodes"),

    call<&Manager::isSpiDevice>("isSpiDevice", "device"),
    call<&Manager::getSpiDeviceStringProperty>("getSpiDeviceStringProperty", "device", "property"),
    call<&Manager::getSpiDeviceBoolProperty>("getSpiDeviceBoolProperty", "device", "property"),
    call<&Manager::getSpiDeviceLongProperty>("getSpiDeviceLongProperty", "device", "property"),

    call<&Manager::isMbBpiSpiSupport>("isMbBpiSpiSupport", "device", "typePrefix", "width", "lead"),

    call<&dump<&Manager::dumpOperationsTable>>("dumpOperationsTable", "recorder"),
    call<&dumpToStatus<&Manager::dumpOperationsTable>>("dumpOperationsTable"),
    call<&dump<&Manager::dumpBsdlOperationsTable>>("dumpBsdlOperationsTable", "recorder"),
    call<&dumpToStatus<&Manager::dumpBsdlOperationsTable>>("dumpBsdlOperationsTable"),
    call<&dump<&Manager::dumpProgramOptionsTable>>("dumpProgramOptionsTable", "recorder"),
    call<&dumpToStatus<&Manager::dumpProgramOptionsTable>>("dumpProgramOptionsTable"),
    call<&dump<&Manager::dumpCachedDeviceFamilies>>("dumpCachedDeviceFamilies", "recorder"),
    call<&dumpToStatus<&Manager::dumpCachedDeviceFamilies>>("dumpCachedDeviceFamilies"),
    call<&Manager::dumpMbBpiSpi>("dumpMbBpiSpi"),
};

using Overloads = std::span<const Call>;

const std::unordered_map<std::string_view, Overloads>& callsByName() {
    static const auto index = [] {
        std::unordered_map<std::string_view, Overloads> calls;
        for (const Call* first = std::begin(CALLS); first != std::end(CALLS);) {
            const Call* const last = std::find_if(
                first, std::end(CALLS), [first](const Call& other) { return other.name != first->name; });
            calls.emplace(first->name, Overloads(first, last));
            first = last;
        }
        return calls;
    }();
    return index;
}

bool isEnumeration(Kind kind) {
    return kind == Kind::MODE || kind == Kind::OUTPUT || kind == Kind::OPERATION || kind == Kind::OPTION;
}

bool matchesKind(Kind kind, const Json& argument, bool named) {
    if (isEnumeration(kind)) {
        return argument.is_number_integer() || (named && argument.is_string());
    }
    return kind == Kind::BOOLEAN ? argument.is_boolean() : argument.is_string() || argument.is_null();
}

/// Binds the arguments to the parameters. @return false if count, names or kinds differ
bool bindArguments(const Call& call, Json& arguments, std::array<Json*, binding::MAX_PARAMETERS>& bound) {
    const bool named = arguments.is_object();
    if (arguments.size() != call.count) {
        return false;
    }
    for (std::size_t i = 0; i < call.count; ++i) {
        const Parameter& parameter = call.parameters[i];
        if (named) {
            const auto found = arguments.find(parameter.name);
            if (found == arguments.end()) {
                return false;
            }
            bound[i] = &*found;
        } else {
            bound[i] = &arguments[i];
        }
        if (!matchesKind(parameter.kind, *bound[i], named)) {
            return false;
        }
    }
    return true;
}

vocabulary::Kind vocabularyOf(Kind kind) {
    switch (kind) {
    case Kind::MODE:
        return vocabulary::Kind::MODE;
    case Kind::OUTPUT:
        return vocabulary::Kind::OUTPUT;
    case Kind::OPERATION:
        return vocabulary::Kind::OPERATION;
    default:
        return vocabulary::Kind::OPTION;
    }
}

bool fitsInt(const Json& number) {
    using Limits = std::numeric_limits<int>;
    if (number.is_number_unsigned()) {
        return number.get<std::uint64_t>() <= static_cast<std::uint64_t>(Limits::max());
    }
    const auto value = number.get<std::int64_t>();
    return value >= Limits::min() && value <= Limits::max();
}

/// Turns a word into its number. @return what is wrong with the argument; empty if nothing is
std::string normaliseArgument(const Parameter& parameter, Json& argument) {
    if (isEnumeration(parameter.kind)) {
        if (!argument.is_string()) {
            return fitsInt(argument) ? "" : fmt::format("\"{}\" is out of range", parameter.name);
        }
        const vocabulary::Kind kind = vocabularyOf(parameter.kind);
        const auto& text = argument.get_ref<const std::string&>();
        const std::optional<int> value = vocabulary::find(kind, text);
        if (!value) {
            return vocabulary::unknownWord(kind, text);
        }
        argument = *value;
    } else if (argument.is_string()) {
        const auto& text = argument.get_ref<const std::string&>();
        if (parameter.kind == Kind::RECORDER && text != "recorder") {
            return "the only recorder is \"recorder\"";
        }
        // The method would read the text up to the NUL, and answer for another name than the given one.
        if (parameter.kind == Kind::TEXT && text.find('\0') != std::string::npos) {
            return fmt::format("\"{}\" holds a NUL", parameter.name);
        }
    }
    return {};
}

/// The type of an argument, as `help` names it.
std::string_view typeName(Kind kind) {
    switch (kind) {
    case Kind::BOOLEAN:
        return "boolean";
    case Kind::TEXT:
    case Kind::BYTES:
        return "text or null";
    case Kind::MODE:
        return "mode";
    case Kind::OUTPUT:
        return "output";
    case Kind::OPERATION:
        return "operation";
    case Kind::OPTION:
        return "option";
    case Kind::RECORDER:
        break;
    }
    return "\"recorder\" or null";
}

std::string_view described(Kind kind) {
    switch (kind) {
    case Kind::BOOLEAN:
        return "true or false";
    case Kind::TEXT:
    case Kind::BYTES:
        return "text or null";
    case Kind::RECORDER:
        return "\"recorder\" or null";
    default:
        return "integer";
    }
}

std::string described(Overloads overloads) {
    std::vector<std::string> signatures;
    for (const Call& call : overloads) {
        std::vector<std::string> parameters;
        for (std::size_t i = 0; i < call.count; ++i) {
            const Parameter& parameter = call.parameters[i];
            parameters.push_back(fmt::format("{}: {}", parameter.name, described(parameter.kind)));
        }
        signatures.push_back(fmt::format("({})", fmt::join(parameters, ", ")));
    }
    return fmt::format("{} takes {}", overloads.front().name, fmt::join(signatures, " or "));
}

} // namespace

PreparedCall prepare(Request& request) {
    PreparedCall prepared;
    const auto found = callsByName().find(request.call);
    if (found == callsByName().end()) {
        prepared.isUnknown = true;
        return prepared;
    }
    std::array<Json*, binding::MAX_PARAMETERS> bound{};
    const auto overload =
        std::find_if(found->second.begin(), found->second.end(), [&](const Call& candidate) {
            return bindArguments(candidate, request.arguments, bound);
        });
    if (overload == found->second.end()) {
        prepared.fault = described(found->second);
        return prepared;
    }
    for (std::size_t i = 0; i < overload->count && prepared.fault.empty(); ++i) {
        prepared.fault = normaliseArgument(overload->parameters[i], *bound[i]);
        prepared.arguments[i] = bound[i];
    }
    prepared.call = prepared.fault.empty() ? &*overload : nullptr;
    return prepared;
}

bool isShutdown(const Call& call) { return call.name == REMOVE; }

std::vector<std::string> callNames() {
    std::vector<std::string> names;
    for (const auto& [name, overloads] : callsByName()) {
        names.emplace_back(name);
    }
    std::sort(names.begin(), names.end());
    return names;
}

Json describeCalls() {
    Json calls = Json::array();
    for (const Call& call : CALLS) {
        Json arguments = Json::array();
        for (std::size_t i = 0; i < call.count; ++i) {
            arguments.push_back(
                {{"name", call.parameters[i].name}, {"type", typeName(call.parameters[i].kind)}});
        }
        calls.push_back({{"call", call.name}, {"args", arguments}, {"result", call.result}});
    }
    return calls;
}
