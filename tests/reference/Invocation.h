#pragma once

// Calls as values, put to whatever has the exported interface: the manager, the reference, or a binding of the manager.

#include "Call.h"
#include "Outcome.h"

#include <tarvik/TARVIKNS.h>

#include <cstddef>
#include <string>
#include <vector>

namespace reference {

/// What differs in how targets take and give texts: `Recorder` for dumps, `text` makes an argument, `recorded` shows
/// what a dump wrote, `isTheOne` asks for the manager.
template <typename Target>
struct Terms;

/// The arguments of a call, as what the methods take.
class Arguments {
public:
    /// @param held takes the place of an argument where it is not null
    Arguments(const Call& call, const std::vector<const char*>& held)
        : m_arguments(call.arguments), m_held(held) {}

    [[nodiscard]] const char* text(std::size_t number) const {
        if (number < m_held.size() && m_held[number] != nullptr) {
            return m_held[number];
        }
        const auto* text = std::get_if<std::string>(&m_arguments.at(number));
        return text == nullptr ? nullptr : text->c_str();
    }
    [[nodiscard]] std::string bytes(std::size_t number) const {
        const auto* text = std::get_if<std::string>(&m_arguments.at(number));
        return text == nullptr ? "" : *text;
    }
    [[nodiscard]] bool flag(std::size_t number) const { return std::get<bool>(m_arguments.at(number)); }
    template <typename Enumeration>
    [[nodiscard]] Enumeration value(std::size_t number) const {
        return static_cast<Enumeration>(std::get<int>(m_arguments.at(number)));
    }
    [[nodiscard]] auto mode(std::size_t number) const { return value<TARVIKNS::MODE_TYPE>(number); }
    [[nodiscard]] auto output(std::size_t number) const { return value<TARVIKNS::OUTPUT_TYPE>(number); }
    [[nodiscard]] auto operation(std::size_t number) const { return value<TARVIKNS::OP_TYPE>(number); }
    [[nodiscard]] auto option(std::size_t number) const { return value<TARVIKNS::PROGRAM_OPTION>(number); }

private:
    const std::vector<Argument>& m_arguments;
    const std::vector<const char*>& m_held;
};

/// What a dump writes into a recorder; with none, its messages tell.
template <typename Target, typename Dump>
std::string dumped(bool recorded, Dump dump) {
    typename Terms<Target>::Recorder recorder;
    dump(recorded ? &recorder : nullptr);
    return Terms<Target>::recorded(recorder);
}

/// Holds nothing: for targets that return copies.
struct NothingHeld {
    template <typename Result>
    const Result& hold(const Result& result) {
        return result;
    }
};

/// @param heldArguments texts that take the place of arguments where they are not null
/// @param held is given each result that is a reference or a pointer
template <typename Target, typename Held = NothingHeld>
std::string invoke(Target& target, const Call& call, const std::vector<const char*>& heldArguments = {},
                   Held&& held = Held()) {
    const Arguments a(call, heldArguments);
    switch (call.method) {
        using enum Method;
    case GET_CONSTRAINTS_MANAGER:
        return show(Terms<Target>::isTheOne(target));
    case SET_EXCEPTIONS:
        target.setExceptions(a.flag(0));
        return "";
    case GET_OPERATION_ORDERS:
        return show(held.hold(target.getOperationOrders()));
    case GET_PROGRAM_OPTION_ORDERS:
        return show(held.hold(target.getProgramOptionOrders()));
    case MODE_STRING_2_TYPE:
        return show(target.modeString2Type(a.text(0)));
    case MODE_TYPE_2_STRING:
        return show(target.modeType2String(a.mode(0)));
    case CABLE_STRING_2_TYPE:
        return show(target.cableString2Type(a.text(0)));
    case CABLE_TYPE_2_STRING:
        return show(target.cableType2String(a.output(0)));
    case OPERATION_STRING_2_TYPE:
        return show(target.operationString2Type(a.text(0)));
    case OPERATION_TYPE_2_STRING:
        return show(target.operationType2String(a.operation(0)));
    case OPERATION_DISPLAY_STRING_2_TYPE:
        return show(target.operationDisplayString2Type(a.text(0)));
    case OPERATION_TYPE_2_DISPLAY_STRING:
        return show(target.operationType2DisplayString(a.operation(0)));
    case OPTION_STRING_2_TYPE:
        return show(target.optionString2Type(a.text(0)));
    case OPTION_TYPE_2_STRING:
        return show(target.optionType2String(a.option(0)));
    case REMOVE_PACKAGE_NAME: {
        auto device = Terms<Target>::text(a.bytes(0));
        target.removePackageName(device);
        return show(device);
    }
    case CHECK_OUTPUT:
        return show(target.checkConstraints(a.mode(0), a.output(1)));
    case CHECK_DEVICE:
        return show(target.checkConstraints(a.mode(0), a.text(1), a.text(2)));
    case CHECK_OUTPUT_AND_DEVICE:
        return show(target.checkConstraints(a.mode(0), a.output(1), a.text(2), a.text(3)));
    case CHECK_OPERATION:
        return show(target.checkConstraints(a.mode(0), a.output(1), a.text(2), a.operation(3), a.text(4)));
    case CHECK_OPERATION_PROPERTY:
        return show(target.checkConstraints(a.text(0), a.mode(1), a.operation(2), a.text(3)));
    case GET_DEVICE_OPERATIONS:
        return show(target.getDeviceOperations(a.text(0), a.mode(1), a.output(2)));
    case GET_PROGRAM_OPTIONS:
        return show(target.getProgramOptions(a.text(0), a.mode(1), a.output(2), a.text(3)));
    case GET_BSDL_OPERATIONS:
        return show(target.getBsdlOperations(a.text(0), a.output(1)));
    case GET_DEVICE_OPERATION_OPTIONS:
        return show(held.hold(target.getDeviceOperationOptions(a.text(0), a.text(1), a.mode(2))));
    case GET_DEVICE_STRING_PROPERTIES:
        return show(held.hold(target.getDeviceStringProperties(a.text(0), a.text(1))));
    case GET_DEVICE_STRING_PROPERTY:
        return show(held.hold(target.getDeviceStringProperty(a.text(0), a.text(1))));
    case GET_DEVICE_BOOL_PROPERTY:
        return show(target.getDeviceBoolProperty(a.text(0), a.text(1)));
    case GET_DEVICE_LONG_PROPERTY:
        return show(target.getDeviceLongProperty(a.text(0), a.text(1)));
    case GET_PART_FAMILY:
        return show(target.getPartFamily(a.text(0)));
    case ADD_CACHED_DEVICE_FAMILY:
        target.addCachedDeviceFamily(a.text(0), a.text(1));
        return "";
    case IS_KORVEL_DEVICE:
        return show(target.isKorvelDevice(a.text(0)));
    case GET_ALL_DEVICE_IDCODES:
        return show(held.hold(target.getAllDeviceIdcodes()));
    case IS_SPI_DEVICE:
        return show(target.isSpiDevice(Terms<Target>::text(a.bytes(0))));
    case GET_SPI_DEVICE_STRING_PROPERTY:
        return show(held.hold(target.getSpiDeviceStringProperty(a.text(0), a.text(1))));
    case GET_SPI_DEVICE_BOOL_PROPERTY:
        return show(target.getSpiDeviceBoolProperty(a.text(0), a.text(1)));
    case GET_SPI_DEVICE_LONG_PROPERTY:
        return show(target.getSpiDeviceLongProperty(a.text(0), a.text(1)));
    case IS_MB_BPI_SPI_SUPPORT:
        return show(target.isMbBpiSpiSupport(a.text(0), a.text(1), a.text(2), a.flag(3)));
    case DUMP_OPERATIONS_TABLE:
        return dumped<Target>(a.flag(0), [&](auto* recorder) { target.dumpOperationsTable(recorder); });
    case DUMP_BSDL_OPERATIONS_TABLE:
        return dumped<Target>(a.flag(0), [&](auto* recorder) { target.dumpBsdlOperationsTable(recorder); });
    case DUMP_PROGRAM_OPTIONS_TABLE:
        return dumped<Target>(a.flag(0), [&](auto* recorder) { target.dumpProgramOptionsTable(recorder); });
    case DUMP_CACHED_DEVICE_FAMILIES:
        return dumped<Target>(a.flag(0), [&](auto* recorder) { target.dumpCachedDeviceFamilies(recorder); });
    case DUMP_MB_BPI_SPI:
        target.dumpMbBpiSpi();
        return "";
    }
    return "no such method";
}

} // namespace reference
