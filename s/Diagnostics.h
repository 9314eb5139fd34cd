#pragma once

// Exceptions and messages of the manager, and the locations that both carry.

#include <Port_MsgManData.h>
#include <TarvikException.h>

#include <utility>

namespace diagnostics {

inline constexpr const char* PRODUCT = "Tarvik";
inline constexpr const char* SOURCE = "../s/ConstraintsManager";
inline constexpr const char* REVISION = "1.0";

/// Where a report comes from. Reports show these numbers and hosts know them, so they never change, even if the code
/// moves. `docs/embedding.md` lists those that raise.
namespace location {

inline constexpr int OUTPUT_REFUSED = 201;
inline constexpr int DEVICE_REFUSED = 229;
inline constexpr int OUTPUT_REFUSED_WITH_DEVICE = 249;
inline constexpr int DEVICE_REFUSED_WITH_OUTPUT = 256;

inline constexpr int PROPERTY_NOT_FOUND = 437;
inline constexpr int DUMPED_MODE_UNKNOWN = 583;
inline constexpr int CHECKED_MODE_UNKNOWN = 644;

inline constexpr int PROPERTY_WITHOUT_VALUE = 1011;
inline constexpr int PROPERTIES_WITHOUT_VALUE = 1051;

inline constexpr int OPERATION_NOT_DEFINED = 1300;
inline constexpr int OPTION_WITHOUT_NAME = 1413;
inline constexpr int OPTION_NAME_UNKNOWN = 1500;

inline constexpr int OPERATION_UNKNOWN = 1631;
inline constexpr int OPERATION_WITHOUT_MODE = 1638;
inline constexpr int OPERATION_MODE_UNKNOWN = 1643;
inline constexpr int OPERATION_WITHOUT_OUTPUT = 1649;
inline constexpr int OPERATION_OUTPUT_UNKNOWN = 1659;

inline constexpr int BSDL_OPERATION_UNKNOWN = 1688;
inline constexpr int BSDL_OPERATION_WITHOUT_OUTPUT = 1695;
inline constexpr int BSDL_OPERATION_OUTPUT_UNKNOWN = 1705;

inline constexpr int PROGRAM_OPTION_WITHOUT_MODE = 1739;
inline constexpr int PROGRAM_OPTION_MODE_UNKNOWN = 1744;
inline constexpr int PROGRAM_OPTION_WITHOUT_OUTPUT = 1750;
inline constexpr int PROGRAM_OPTION_OUTPUT_UNKNOWN = 1760;

inline constexpr int DUMP = 1777;

inline constexpr int SUPPORTED_DEVICE_POSITION = 1959;
inline constexpr int PROGRAM_OPTION_PACKAGE_POSITION = 1975;
inline constexpr int SUPPORTED_DEVICE_UNKNOWN = 1999;
inline constexpr int PROGRAM_OPTION_PACKAGE_UNKNOWN = 2024;
inline constexpr int SPI_PROPERTY_WITHOUT_VALUE = 2322;

} // namespace location

/// Raises an exception of the given type, from the given location.
template <typename Exception>
[[noreturn]] void raise(int location) {
    throw Exception(PRODUCT, SOURCE, REVISION, location);
}

/// Raises only while `exceptions` is on; otherwise the caller continues with its neutral value.
template <typename Exception>
void raiseIf(bool exceptions, int location) {
    if (exceptions) {
        raise<Exception>(location);
    }
}

/// The message object of a location.
[[nodiscard]] inline Port_MsgManData message(int location) {
    return Port_MsgManData::createObject(PRODUCT, SOURCE, location, REVISION);
}

inline constexpr const char* MODE_OUT_OF_RANGE = "Mode is out of range -- %d.\n";

/// Is a value outside 0 to `bound` - 1? Then it issues the debug message `format`, which takes the value.
template <typename Value>
[[nodiscard]] bool rejectOutOfRange(Value value, int bound, const char* format) {
    const int number = static_cast<int>(value);
    const bool isOutside = number < 0 || number >= bound;
    if (isOutside) {
        Port_MsgManData::debugStub(format, number);
    }
    return isOutside;
}

} // namespace diagnostics
