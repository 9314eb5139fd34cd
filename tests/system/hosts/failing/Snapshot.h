#pragma once

#include <HostTestPeer.h>

#include <TarvikSmokeMgr.h>

#include <string>
#include <utility>
#include <vector>

/// What stands in a manager, as texts that compare: one for each step of the start-up, in the order in which
/// the steps fill it. A text is empty until its step was reached.
struct Snapshot {
    std::vector<std::pair<std::string, std::string>> steps;

    static Snapshot of(ConstraintsManager& manager) {
        const TarvikTestPeer peer(manager);
        return {{{"supported devices", text(peer.supportedDevices())},
                 {"packages", text(peer.programOptionPackages())},
                 {"BS outputs", text(peer.bsCables())},
                 {"SS outputs", text(peer.ssCables())},
                 {"SM outputs", text(peer.smCables())},
                 {"BSFILE outputs", text(peer.bsFileCables())},
                 {"DP770 outputs", text(peer.dp770Cables())},
                 {"SPI outputs", text(peer.spiCables())},
                 {"KITECF outputs", text(peer.kiteCfCables())},
                 {"KITEMPM outputs", text(peer.kiteMpmCables())},
                 {"PFF outputs", text(peer.pffCables())},
                 {"BS families", text(peer.bsDevices())},
                 {"SS families", text(peer.ssDevices())},
                 {"SM families", text(peer.smDevices())},
                 {"BSFILE families", text(peer.bsFileDevices())},
                 {"DP770 families", text(peer.dp770Devices())},
                 {"SPI families", text(peer.spiDevices())},
                 {"KITECF families", text(peer.kiteCfDevices())},
                 {"KITEMPM families", text(peer.kiteMpmDevices())},
                 {"PFF families", text(peer.pffDevices())},
                 {"idcodes", text(peer.deviceIdcodes())},
                 {"excluded parts", text(peer.notSupportedPartInMode())},
                 {"orders", text(manager.getOperationOrders()) + text(manager.getProgramOptionOrders())},
                 {"SPI names", text(peer.spiNames()) + text(peer.spiFamilies())},
                 {"AT1", text(peer.at1Devices())},
                 {"ST1", text(peer.st1Devices())},
                 {"ST2", text(peer.st2Devices())},
                 {"BPI1", text(peer.bpi1Devices())},
                 {"BPI2", text(peer.bpi2Devices())},
                 {"BPI3", text(peer.bpi3Devices())},
                 {"SPI properties", text(peer.spiProperties())},
                 {"SPI operations", masks(manager,
                                          [&](auto output) {
                                              return manager.getDeviceOperations("", TARVIKNS::MODE_TYPE::SPI,
                                                                                 output);
                                          })},
                 {"SPI operations noted", text(peer.operationsLoaded())},
                 {"SPI boundary scan", boundaryScanFlags(manager)},
                 {"SPI options", masks(manager,
                                       [&](auto output) {
                                           return manager.getProgramOptions("", TARVIKNS::MODE_TYPE::SPI,
                                                                            output, nullptr);
                                       })},
                 {"SPI options noted", text(peer.programOptionsLoaded())},
                 {"multiboot types", text(peer.multibootTypes())}}};
    }

    /// The masks that SPI mode gives for each output, where there is one. That loads nothing.
    template <typename MaskOf>
    static std::string masks(ConstraintsManager& manager, MaskOf maskOf) {
        const bool exceptions = TarvikTestPeer(manager).exceptions();
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
