#pragma once

#include <cstddef>
#include <iosfwd>
#include <map>
#include <string>
#include <string_view>
#include <variant>
#include <vector>

namespace reference {

/// The exported methods, each overload by itself.
enum class Method {
    GET_CONSTRAINTS_MANAGER,
    SET_EXCEPTIONS,
    GET_OPERATION_ORDERS,
    GET_PROGRAM_OPTION_ORDERS,
    MODE_STRING_2_TYPE,
    MODE_TYPE_2_STRING,
    CABLE_STRING_2_TYPE,
    CABLE_TYPE_2_STRING,
    OPERATION_STRING_2_TYPE,
    OPERATION_TYPE_2_STRING,
    OPERATION_DISPLAY_STRING_2_TYPE,
    OPERATION_TYPE_2_DISPLAY_STRING,
    OPTION_STRING_2_TYPE,
    OPTION_TYPE_2_STRING,
    REMOVE_PACKAGE_NAME,
    CHECK_OUTPUT,
    CHECK_DEVICE,
    CHECK_OUTPUT_AND_DEVICE,
    CHECK_OPERATION,
    CHECK_OPERATION_PROPERTY,
    GET_DEVICE_OPERATIONS,
    GET_PROGRAM_OPTIONS,
    GET_BSDL_OPERATIONS,
    GET_DEVICE_OPERATION_OPTIONS,
    GET_DEVICE_STRING_PROPERTIES,
    GET_DEVICE_STRING_PROPERTY,
    GET_DEVICE_BOOL_PROPERTY,
    GET_DEVICE_LONG_PROPERTY,
    GET_PART_FAMILY,
    ADD_CACHED_DEVICE_FAMILY,
    IS_KORVEL_DEVICE,
    GET_ALL_DEVICE_IDCODES,
    IS_SPI_DEVICE,
    GET_SPI_DEVICE_STRING_PROPERTY,
    GET_SPI_DEVICE_BOOL_PROPERTY,
    GET_SPI_DEVICE_LONG_PROPERTY,
    IS_MB_BPI_SPI_SUPPORT,
    DUMP_OPERATIONS_TABLE,
    DUMP_BSDL_OPERATIONS_TABLE,
    DUMP_PROGRAM_OPTIONS_TABLE,
    DUMP_CACHED_DEVICE_FAMILIES,
    DUMP_MB_BPI_SPI,
};

/// What an argument is about, so that a fitting one can be made up.
enum class Kind {
    SWITCH, ///< of the exceptions
    DEVICE,
    SPI_DEVICE,
    FAMILY,
    PACKAGE,
    PROPERTY,
    SPI_PROPERTY,
    MODE,
    OUTPUT,
    OPERATION,
    OPTION,
    MODE_NAME,
    OUTPUT_NAME,
    OPERATION_NAME,
    OPERATION_PROPERTY,
    DISPLAY_NAME,
    OPTION_NAME,
    TYPE_PREFIX,
    WIDTH,
    LEAD,
    RECORDER, ///< true for one, false for null
};

struct Signature {
    Method method;
    std::string_view name; ///< of the enumerator
    unsigned weight;       ///< how often it is called
    std::vector<Kind> arguments;
};

/// One for each method, in their order.
[[nodiscard]] const std::vector<Signature>& signatures();

/// A text that the manager itself returned before: one of those that are held, or the empty text while none is.
struct HeldText {
    std::size_t number; ///< modulo the number of held texts
};

/// Null is a null text. Enumerations are integers.
using Argument = std::variant<std::nullptr_t, bool, int, std::string, HeldText>;

struct Call {
    Method method;
    std::vector<Argument> arguments;
};

/// The call with the empty text in place of each text that the manager returned: for callers that hold no results.
[[nodiscard]] Call withoutHeldTexts(Call call);

using Files = std::map<std::string, std::string>;

/// Databases, and what is asked about them. Prints as a test that can be pasted into a file of tests.
struct Scenario {
    Files files;
    std::vector<Call> calls;
};

std::ostream& operator<<(std::ostream& out, const Call& call);
std::ostream& operator<<(std::ostream& out, const Scenario& scenario);

} // namespace reference
