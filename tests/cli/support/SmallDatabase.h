#pragma once

#include "DatabaseDirectory.h"
#include "ToolProcess.h"

#include <nlohmann/json.hpp>

/// A database of one family with two devices, and of a few flashes; and the tool on it.
class SmallDatabase {
public:
    SmallDatabase()
        : m_directory({{"base.acd", "DEVICE_SUPPORTED = finch,spi\n"
                                    "PROGRAM_OPTION_PACKAGE = FN10P48,finch,spi\n"
                                    "BS = outputs,PARALLEL,USB2:families,finch\n"
                                    "SS = outputs,PARALLEL:families,finch\n"
                                    "SPI = outputs,USB2:families,spi\n"
                                    "NOT_SUPPORTED_PART_IN_MODE = SS_FN10_P48\n"
                                    "IDCODE = FN10,0x0010:fn20,0x0020\n"},
                       {"finch.acd", "# the finch family\n"
                                     "OPERATION = PROGRAM,Bscan,PARALLEL,USB2:VERIFY,SSerial,PARALLEL\n"
                                     "BSDL_OPERATION = HIGHZ,SVF,USB2\n"
                                     "PROGRAM_OPTION = ERASE,Bscan,USB2\n"
                                     "PROPERTY = VENDOR,Korvel:CORE,2.5\n"
                                     "PROPERTIES = PROGRAM,2,SS,BS:OP_PROGRAM,2,VERIFY,ERASE\n"
                                     "[FN10]\n"
                                     "PROGRAM_OPTION = VERIFY,Bscan,PARALLEL\n"
                                     "PROPERTY = PINS,44:CORE,1.8\n"
                                     "[FN20]\n"},
                       {"spi.acd", "DEVICE_FAMILY = ST1,NV\n"
                                   "ST1_DEVICES = FLA,FLB\n"
                                   "NV_DEVICES = FLC\n"
                                   "ST1_PROPERTY = BUS,SPI:PAGE,256\n"
                                   "FLA_PROPERTY = DENSITY,1024:PAGE,512\n"
                                   "OPERATION = ERASE,SPI,USB2\n"
                                   "TYPE_MB_SPI_NONE_LEAD = FLA,FN10\n"}}) {}

    [[nodiscard]] std::string path() const { return m_directory.path(); }
    [[nodiscard]] std::string path(const std::string& name) const { return m_directory.path(name); }

    [[nodiscard]] ProcessOptions start(std::vector<std::string> arguments) const {
        arguments.insert(arguments.begin(), {"--database", path()});
        return {std::move(arguments), {}, {}, {}};
    }

    [[nodiscard]] ProcessResult run(std::vector<std::string> arguments) const {
        return runTool(start(std::move(arguments)));
    }

    /// The object that the tool answers with --json.
    [[nodiscard]] nlohmann::json json(std::vector<std::string> arguments) const {
        arguments.emplace_back("--json");
        return nlohmann::json::parse(run(std::move(arguments)).output);
    }

private:
    DatabaseDirectory m_directory;
};
