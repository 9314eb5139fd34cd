#pragma once

#include <HostTestPeer.h>

#include <Implementation.h>

#include <TarvikSmokeMgr.h>

#include <string>
#include <utility>
#include <vector>

/// What stands in a manager, as texts that compare: one for each step of the start-up, in the order in which
/// the steps fill it. A text is empty until its step was reached.
struct Snapshot {
    std::vector<std::pair<std::string, std::string>> steps;

    static Snapshot of(ConstraintsManager& manager) {
        auto& members = TarvikTestPeer::members(manager);
        return {{{"supported devices", text(members.m_supportedDevices)},
                 {"packages", text(members.m_programOptionPackages)},
                 {"BS outputs", text(members.m_bsCables)},
                 {"SS outputs", text(members.m_ssCables)},
                 {"SM outputs", text(members.m_smCables)},
                 {"BSFILE outputs", text(members.m_bsFileCables)},
                 {"DP770 outputs", text(members.m_dp770Cables)},
                 {"SPI outputs", text(members.m_spiCables)},
                 {"KITECF outputs", text(members.m_kiteCfCables)},
                 {"KITEMPM outputs", text(members.m_kiteMpmCables)},
                 {"PFF outputs", text(members.m_pffCables)},
                 {"BS families", text(members.m_bsDevices)},
                 {"SS families", text(members.m_ssDevices)},
                 {"SM families", text(members.m_smDevices)},
                 {"BSFILE families", text(members.m_bsFileDevices)},
                 {"DP770 families", text(members.m_dp770Devices)},
                 {"SPI families", text(members.m_spiDevices)},
                 {"KITECF families", text(members.m_kiteCfDevices)},
                 {"KITEMPM families", text(members.m_kiteMpmDevices)},
                 {"PFF families", text(members.m_pffDevices)},
                 {"idcodes", text(members.m_deviceIdcodes.get())},
                 {"excluded parts", text(members.m_notSupportedPartInMode)},
                 {"orders", text(manager.getOperationOrders()) + text(manager.getProgramOptionOrders())},
                 {"SPI names", text(members.m_spiNames) + text(members.m_spiFamilies)},
                 {"AT1", text(members.m_at1Devices)},
                 {"ST1", text(members.m_st1Devices)},
                 {"ST2", text(members.m_st2Devices)},
                 {"BPI1", text(members.m_bpi1Devices)},
                 {"BPI2", text(members.m_bpi2Devices)},
                 {"BPI3", text(members.m_bpi3Devices)},
                 {"SPI properties", text(members.m_spiProperties.get())},
                 {"SPI operations", masks(manager,
                                          [&](auto output) {
                                              return manager.getDeviceOperations("", TARVIKNS::MODE_TYPE::SPI,
                                                                                 output);
                                          })},
                 {"SPI operations noted", text(members.m_operationsLoaded)},
                 {"SPI boundary scan", boundaryScanFlags(manager)},
                 {"SPI options", masks(manager,
                                       [&](auto output) {
                                           return manager.getProgramOptions("", TARVIKNS::MODE_TYPE::SPI,
                                                                            output, nullptr);
                                       })},
                 {"SPI options noted", text(members.m_programOptionsLoaded)},
                 {"multiboot types", text(members.m_multibootTypes)}}};
    }

    /// The masks that SPI mode gives for each output, where there is one. That loads nothing.
    template <typename MaskOf>
    static std::string masks(ConstraintsManager& manager, MaskOf maskOf) {
        const bool exceptions = TarvikTestPeer::members(manager).m_exceptions;
        manager.setExceptions(false);
        std::string text;
        for (int output = 0; output < 5; ++output) {
            if (const int mask = maskOf(TARVIKNS::OUTPUT_TYPE{output}); mask != 0) {
                text += std::to_string(output) + ":" + std::to_string(mask) + " ";
            }
        }
        manager.setExceptions(exceptions);
        return text;
    }

    /// The places of the flags that are set in the dump; no name in the test's databases has a "1".
    static std::string boundaryScanFlags(ConstraintsManager& manager) {
        TarvikSmokeMgr recorder;
        manager.dumpBsdlOperationsTable(&recorder);
        const std::string& dumped = recorder.text();
        std::string places;
        for (std::size_t place = dumped.find('1'); place != std::string::npos;
             place = dumped.find('1', place + 1)) {
            places += std::to_string(place) + " ";
        }
        return places;
    }

    template <typename Container>
    static std::string text(const Container& container) {
        std::string joined;
        for (const auto& element : container) {
            joined += text(element) + " ";
        }
        return joined;
    }
    static std::string text(const StringBase& element) { return element.c_str(); }
    static std::string text(TARVIKNS::OUTPUT_TYPE element) {
        return std::to_string(static_cast<int>(element));
    }
    static std::string text(TARVIKNS::OP_TYPE element) { return std::to_string(static_cast<int>(element)); }
    static std::string text(TARVIKNS::PROGRAM_OPTION element) {
        return std::to_string(static_cast<int>(element));
    }
    template <typename Value>
    static std::string text(const std::pair<const StringBase, Value>& element) {
        return text(element.first) + "=" + text(element.second);
    }
};
