// Calls as values: their signatures, and how they print as C++.
#include "Call.h"

#include <cstdio>
#include <ostream>

namespace reference {

const std::vector<Signature>& signatures() {
    using enum Kind;
    static const std::vector<Signature> SIGNATURES{
        {Method::GET_CONSTRAINTS_MANAGER, "GET_CONSTRAINTS_MANAGER", 1, {}},
        {Method::SET_EXCEPTIONS, "SET_EXCEPTIONS", 20, {SWITCH}},
        {Method::GET_OPERATION_ORDERS, "GET_OPERATION_ORDERS", 1, {}},
        {Method::GET_PROGRAM_OPTION_ORDERS, "GET_PROGRAM_OPTION_ORDERS", 1, {}},
        {Method::MODE_STRING_2_TYPE, "MODE_STRING_2_TYPE", 3, {MODE_NAME}},
        {Method::MODE_TYPE_2_STRING, "MODE_TYPE_2_STRING", 2, {MODE}},
        {Method::CABLE_STRING_2_TYPE, "CABLE_STRING_2_TYPE", 3, {OUTPUT_NAME}},
        {Method::CABLE_TYPE_2_STRING, "CABLE_TYPE_2_STRING", 2, {OUTPUT}},
        {Method::OPERATION_STRING_2_TYPE, "OPERATION_STRING_2_TYPE", 3, {OPERATION_NAME}},
        {Method::OPERATION_TYPE_2_STRING, "OPERATION_TYPE_2_STRING", 3, {OPERATION}},
        {Method::OPERATION_DISPLAY_STRING_2_TYPE, "OPERATION_DISPLAY_STRING_2_TYPE", 3, {DISPLAY_NAME}},
        {Method::OPERATION_TYPE_2_DISPLAY_STRING, "OPERATION_TYPE_2_DISPLAY_STRING", 3, {OPERATION}},
        {Method::OPTION_STRING_2_TYPE, "OPTION_STRING_2_TYPE", 3, {OPTION_NAME}},
        {Method::OPTION_TYPE_2_STRING, "OPTION_TYPE_2_STRING", 3, {OPTION}},
        {Method::REMOVE_PACKAGE_NAME, "REMOVE_PACKAGE_NAME", 2, {DEVICE}},
        {Method::CHECK_OUTPUT, "CHECK_OUTPUT", 8, {MODE, OUTPUT}},
        {Method::CHECK_DEVICE, "CHECK_DEVICE", 20, {MODE, DEVICE, PACKAGE}},
        {Method::CHECK_OUTPUT_AND_DEVICE, "CHECK_OUTPUT_AND_DEVICE", 20, {MODE, OUTPUT, DEVICE, PACKAGE}},
        {Method::CHECK_OPERATION, "CHECK_OPERATION", 25, {MODE, OUTPUT, DEVICE, OPERATION, FAMILY}},
        {Method::CHECK_OPERATION_PROPERTY, "CHECK_OPERATION_PROPERTY", 15, {DEVICE, MODE, OPERATION, FAMILY}},
        {Method::GET_DEVICE_OPERATIONS, "GET_DEVICE_OPERATIONS", 30, {DEVICE, MODE, OUTPUT}},
        {Method::GET_PROGRAM_OPTIONS, "GET_PROGRAM_OPTIONS", 40, {DEVICE, MODE, OUTPUT, PACKAGE}},
        {Method::GET_BSDL_OPERATIONS, "GET_BSDL_OPERATIONS", 25, {DEVICE, OUTPUT}},
        {Method::GET_DEVICE_OPERATION_OPTIONS,
         "GET_DEVICE_OPERATION_OPTIONS",
         25,
         {DEVICE, OPERATION_PROPERTY, MODE}},
        {Method::GET_DEVICE_STRING_PROPERTIES, "GET_DEVICE_STRING_PROPERTIES", 25, {DEVICE, PROPERTY}},
        {Method::GET_DEVICE_STRING_PROPERTY, "GET_DEVICE_STRING_PROPERTY", 25, {DEVICE, PROPERTY}},
        {Method::GET_DEVICE_BOOL_PROPERTY, "GET_DEVICE_BOOL_PROPERTY", 12, {DEVICE, PROPERTY}},
        {Method::GET_DEVICE_LONG_PROPERTY, "GET_DEVICE_LONG_PROPERTY", 12, {DEVICE, PROPERTY}},
        {Method::GET_PART_FAMILY, "GET_PART_FAMILY", 25, {DEVICE}},
        {Method::ADD_CACHED_DEVICE_FAMILY, "ADD_CACHED_DEVICE_FAMILY", 12, {DEVICE, FAMILY}},
        {Method::IS_KORVEL_DEVICE, "IS_KORVEL_DEVICE", 8, {DEVICE}},
        {Method::GET_ALL_DEVICE_IDCODES, "GET_ALL_DEVICE_IDCODES", 2, {}},
        {Method::IS_SPI_DEVICE, "IS_SPI_DEVICE", 10, {SPI_DEVICE}},
        {Method::GET_SPI_DEVICE_STRING_PROPERTY,
         "GET_SPI_DEVICE_STRING_PROPERTY",
         15,
         {SPI_DEVICE, SPI_PROPERTY}},
        {Method::GET_SPI_DEVICE_BOOL_PROPERTY,
         "GET_SPI_DEVICE_BOOL_PROPERTY",
         10,
         {SPI_DEVICE, SPI_PROPERTY}},
        {Method::GET_SPI_DEVICE_LONG_PROPERTY,
         "GET_SPI_DEVICE_LONG_PROPERTY",
         10,
         {SPI_DEVICE, SPI_PROPERTY}},
        {Method::IS_MB_BPI_SPI_SUPPORT, "IS_MB_BPI_SPI_SUPPORT", 15, {SPI_DEVICE, TYPE_PREFIX, WIDTH, LEAD}},
        {Method::DUMP_OPERATIONS_TABLE, "DUMP_OPERATIONS_TABLE", 1, {RECORDER}},
        {Method::DUMP_BSDL_OPERATIONS_TABLE, "DUMP_BSDL_OPERATIONS_TABLE", 1, {RECORDER}},
        {Method::DUMP_PROGRAM_OPTIONS_TABLE, "DUMP_PROGRAM_OPTIONS_TABLE", 1, {RECORDER}},
        {Method::DUMP_CACHED_DEVICE_FAMILIES, "DUMP_CACHED_DEVICE_FAMILIES", 4, {RECORDER}},
        {Method::DUMP_MB_BPI_SPI, "DUMP_MB_BPI_SPI", 1, {}},
    };
    return SIGNATURES;
}

namespace {

/// A text as a literal that keeps every byte; long texts go on in a literal of their own after each line end.
std::string literal(const std::string& text, const std::string& indentation) {
    std::string written = "\"";
    for (std::size_t at = 0; at < text.size(); ++at) {
        const char byte = text[at];
        if (byte == '\n') {
            written += at + 1 == text.size() ? "\\n" : "\\n\"\n" + indentation + "\"";
        } else if (byte == '"' || byte == '\\') {
            written += std::string("\\") + byte;
        } else if (byte >= ' ' && byte <= '~') {
            written += byte;
        } else {
            char escape[8];
            std::snprintf(escape, sizeof escape, "\\%03o",
                          static_cast<unsigned>(static_cast<unsigned char>(byte)));
            written += escape;
        }
    }
    return written + "\"s";
}

struct ArgumentWriter {
    std::string operator()(std::nullptr_t) const { return "nullptr"; }
    std::string operator()(bool value) const { return value ? "true" : "false"; }
    std::string operator()(int value) const { return std::to_string(value); }
    std::string operator()(const std::string& text) const { return literal(text, ""); }
    std::string operator()(HeldText text) const { return "HeldText{" + std::to_string(text.number) + "}"; }
};

} // namespace

Call withoutHeldTexts(Call call) {
    for (Argument& argument : call.arguments) {
        if (std::holds_alternative<HeldText>(argument)) {
            argument = std::string();
        }
    }
    return call;
}

std::ostream& operator<<(std::ostream& out, const Call& call) {
    out << "{Method::" << signatures().at(static_cast<std::size_t>(call.method)).name << ", {";
    for (std::size_t number = 0; number < call.arguments.size(); ++number) {
        out << (number == 0 ? "" : ", ") << std::visit(ArgumentWriter(), call.arguments[number]);
    }
    return out << "}}";
}

std::ostream& operator<<(std::ostream& out, const Scenario& scenario) {
    out << "    expectAgreement({\n        {\n";
    for (const auto& [name, text] : scenario.files) {
        const std::string start = "            {" + literal(name, "") + ", ";
        out << start << literal(text, std::string(start.size(), ' ')) << "},\n";
    }
    out << "        },\n        {\n";
    for (const Call& call : scenario.calls) {
        out << "            " << call << ",\n";
    }
    return out << "        },\n    });\n";
}

} // namespace reference
