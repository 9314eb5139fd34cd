#pragma once

#include <algorithm>
#include <string>
#include <string_view>
#include <vector>

/// What the dumps must look like, piece by piece, told independently of the manager's own formatting.
namespace dump {

using Pieces = std::vector<std::string>;

inline const std::vector<std::string> MODES = {"BS", "SS", "SM", "BSFILE", "DP770", "SPI"};
inline const std::vector<std::string> OUTPUTS = {"PARALLEL", "ZORVA", "USB2", "SVF", "STAPL"};
inline const std::vector<std::string> OPERATIONS = {"PROGRAM",
                                                    "PROGRAMFLASH",
                                                    "PROGRAMFPGAONLY",
                                                    "VERIFY",
                                                    "ERASE",
                                                    "FUNCTIONTEST",
                                                    "BLANKCHECK",
                                                    "READBACKTOFILE",
                                                    "PROGRAMUES",
                                                    "READIDCODE",
                                                    "CHECKSUM",
                                                    "READUSERCODE",
                                                    "READCUSTOMERCODE",
                                                    "READUES",
                                                    "ACTIVATEOTF",
                                                    "VALIDATEUSERCODE",
                                                    "CHECKIDCODE",
                                                    "READSTATUSREGISTER",
                                                    "LOADCONFIGURATIONREVISION",
                                                    "BYPASS",
                                                    "HIGHZ",
                                                    "CLAMP",
                                                    "DOPRELOAD",
                                                    "ISPENABLE",
                                                    "CONLD",
                                                    "PROGRAMKEY",
                                                    "SECUREMODE",
                                                    "READTEMP",
                                                    "PROGRAMUSERCODE",
                                                    "PROGRAMCUSTOMERCODE",
                                                    "EXPRESSSVF",
                                                    "EXPRESSQSVF"};
inline const std::vector<std::string> OPTIONS = {"ERASE",
                                                 "VERIFY",
                                                 "READPROTECT",
                                                 "WRITEPROTECT",
                                                 "FUNCTIONTEST",
                                                 "SKIPUSERARRAY",
                                                 "LOADFPGA",
                                                 "PARALLELMODE",
                                                 "USED4",
                                                 "USERCODE",
                                                 "UES",
                                                 "SECUREMODE",
                                                 "PROGRAMKEY",
                                                 "OTF",
                                                 "PROG",
                                                 "SECTOR_PROTECT",
                                                 "SECTOR_LOCKDOWN",
                                                 "PROGRAM_ONLYFPGA",
                                                 "READ_PROTECT_NOBSCANTEST",
                                                 "OTP",
                                                 "ASSERT_INIT",
                                                 "DATA_WIDTH",
                                                 "RS_PIN1",
                                                 "RS_PIN0"};

/// A text cut to `cut` bytes and padded with blanks to `width`.
inline std::string cell(std::string_view text, std::size_t width, std::size_t cut) {
    std::string padded(text.substr(0, cut));
    padded.resize(std::max(width, padded.size()), ' ');
    return padded;
}
inline std::string nameCell(std::string_view name) { return cell(name, 15, 15); }
inline std::string flag(bool set) { return set ? "1 " : "0 "; }

/// The three header lines of a dump whose rows have a mode dimension.
inline Pieces moddedHeader(const std::vector<std::string>& columns) {
    Pieces pieces = {nameCell("")};
    for (const auto& column : columns) {
        pieces.push_back(cell(column, 60, 60));
    }
    pieces.insert(pieces.end(), {"\n", nameCell("")});
    for (std::size_t column = 0; column < columns.size(); ++column) {
        for (const auto& mode : MODES) {
            pieces.push_back(cell(mode, 10, 10));
        }
    }
    pieces.insert(pieces.end(), {"\n", nameCell("")});
    for (std::size_t block = 0; block < columns.size() * MODES.size(); ++block) {
        for (const auto& output : OUTPUTS) {
            pieces.push_back(cell(output, 2, 1));
        }
    }
    pieces.emplace_back("\n");
    return pieces;
}

/// The two header lines of the boundary-scan dump.
inline Pieces bsdlHeader() {
    Pieces pieces = {nameCell("")};
    for (const auto& operation : OPERATIONS) {
        pieces.push_back(cell(operation, 10, 6));
    }
    pieces.insert(pieces.end(), {"\n", nameCell("")});
    for (std::size_t operation = 0; operation < OPERATIONS.size(); ++operation) {
        for (const auto& output : OUTPUTS) {
            pieces.push_back(cell(output, 2, 1));
        }
    }
    pieces.emplace_back("\n");
    return pieces;
}

/// A data line of `cells` flags, of which those at the places `set` are 1.
inline Pieces row(const std::string& name, std::size_t cells, const std::vector<std::size_t>& set) {
    Pieces pieces = {nameCell(name)};
    for (std::size_t place = 0; place < cells; ++place) {
        pieces.push_back(flag(std::find(set.begin(), set.end(), place) != set.end()));
    }
    pieces.emplace_back("\n");
    return pieces;
}

/// The place of a flag in a row with a mode dimension.
constexpr std::size_t place(std::size_t column, std::size_t mode, std::size_t output) {
    return (column * 6 + mode) * 5 + output;
}

inline Pieces operator+(Pieces left, const Pieces& right) {
    left.insert(left.end(), right.begin(), right.end());
    return left;
}

inline std::string joined(const Pieces& pieces) {
    std::string text;
    for (const auto& piece : pieces) {
        text += piece;
    }
    return text;
}

} // namespace dump
