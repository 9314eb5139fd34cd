#pragma once

#include <tarvik/ConstraintsManager.h>

#include <AcdStore.h>
#include <Port_MsgManData.h>

/// Sees the manager's members, and puts manager, databases and sink back to how a process starts with them.
class TarvikTestPeer {
public:
    /// Removes the manager, if there is one, so that the next request for it makes a new one.
    static void removeManager() {
        if (ConstraintsManager::s_instance != nullptr) {
            ConstraintsManager::RemoveConstraintsManager();
            forgetManager();
        }
    }

    /// The same for a manager that is removed already.
    static void forgetManager() { ConstraintsManager::s_instance = nullptr; }

    static void reset() {
        removeManager();
        AcdStore::resetForTesting();
        Port_MsgManData::setSink({});
    }

    /// The pointer as it stands; after a removal it is no longer to be followed.
    static ConstraintsManager* instance() { return ConstraintsManager::s_instance; }

    explicit TarvikTestPeer(ConstraintsManager& manager) : m_manager(manager) {}

    // Members, by the manager's own names.
    auto& exceptions() { return m_manager.m_exceptions; }
    auto& devKey() { return m_manager.m_devKey; }
    auto& bsCables() { return m_manager.m_bsCables; }
    auto& ssCables() { return m_manager.m_ssCables; }
    auto& smCables() { return m_manager.m_smCables; }
    auto& bsFileCables() { return m_manager.m_bsFileCables; }
    auto& dp770Cables() { return m_manager.m_dp770Cables; }
    auto& spiCables() { return m_manager.m_spiCables; }
    auto& kiteCfCables() { return m_manager.m_kiteCfCables; }
    auto& kiteMpmCables() { return m_manager.m_kiteMpmCables; }
    auto& pffCables() { return m_manager.m_pffCables; }
    auto& supportedDevices() { return m_manager.m_supportedDevices; }
    auto& bsDevices() { return m_manager.m_bsDevices; }
    auto& ssDevices() { return m_manager.m_ssDevices; }
    auto& smDevices() { return m_manager.m_smDevices; }
    auto& bsFileDevices() { return m_manager.m_bsFileDevices; }
    auto& dp770Devices() { return m_manager.m_dp770Devices; }
    auto& spiDevices() { return m_manager.m_spiDevices; }
    auto& kiteCfDevices() { return m_manager.m_kiteCfDevices; }
    auto& kiteMpmDevices() { return m_manager.m_kiteMpmDevices; }
    auto& pffDevices() { return m_manager.m_pffDevices; }
    auto& programOptionPackages() { return m_manager.m_programOptionPackages; }
    auto& notSupportedPartInMode() { return m_manager.m_notSupportedPartInMode; }
    auto& deviceIdcodes() { return m_manager.m_deviceIdcodes; }
    auto& loadedFamilies() { return m_manager.m_loadedFamilies; }
    auto& operationsLoaded() { return m_manager.m_operationsLoaded; }
    auto& programOptionsLoaded() { return m_manager.m_programOptionsLoaded; }
    const PropertyTable& deviceProperties() { return *m_manager.m_deviceProperties; }
    auto& deviceFamilyCache() { return m_manager.m_deviceFamilyCache; }
    auto& programOptionPackageIndex() { return m_manager.m_programOptionPackageIndex; }
    auto& operationOptions() { return m_manager.m_operationOptions; }
    auto& partFamily() { return m_manager.m_partFamily; }
    auto& operationTable() { return m_manager.m_operationTable; }
    auto& programOptionTable() { return m_manager.m_programOptionTable; }
    auto& bsdlOperationTable() { return m_manager.m_bsdlOperationTable; }
    auto& operationOrders() { return m_manager.m_operationOrders; }
    auto& programOptionOrders() { return m_manager.m_programOptionOrders; }
    auto& spiProperties() { return m_manager.m_spiProperties; }
    auto& spiNames() { return m_manager.m_spiNames; }
    auto& spiFamilies() { return m_manager.m_spiFamilies; }
    auto& at1Devices() { return m_manager.m_at1Devices; }
    auto& st1Devices() { return m_manager.m_st1Devices; }
    auto& st2Devices() { return m_manager.m_st2Devices; }
    auto& bpi1Devices() { return m_manager.m_bpi1Devices; }
    auto& bpi2Devices() { return m_manager.m_bpi2Devices; }
    auto& bpi3Devices() { return m_manager.m_bpi3Devices; }
    auto& multibootTypes() { return m_manager.m_multibootTypes; }

    // Internal operations.
    void parseOperationEntries(PM_DEVKEY* accessor, unsigned familyIndex, const char* family) {
        m_manager.parseOperationEntries(accessor, familyIndex, family);
    }
    void parseBsdlOperationEntries(PM_DEVKEY* accessor, unsigned familyIndex, const char* family) {
        m_manager.parseBsdlOperationEntries(accessor, familyIndex, family);
    }
    void parseProgramOptionEntries(PM_DEVKEY* accessor, const char* family) {
        m_manager.parseProgramOptionEntries(accessor, family);
    }
    int programOptionTableIndex(const char* name) { return m_manager.programOptionTableIndex(name); }
    void readSpiProperties(PM_DEVKEY* accessor) { m_manager.readSpiProperties(accessor); }
    StringBase spiDeviceClass(const char* device) { return m_manager.spiDeviceClass(device); }
    unsigned familyIndex(const char* name) { return m_manager.familyIndex(name); }
    bool isFamilyName(const StringBase& name) { return m_manager.isFamilyName(name); }
    void loadDeviceData(const char* device, const char* package) {
        m_manager.loadDeviceData(device, package);
    }
    bool modeAllowsOutput(TARVIKNS::MODE_TYPE mode, TARVIKNS::OUTPUT_TYPE output) {
        return m_manager.modeAllowsOutput(mode, output);
    }
    const NameSet* modeDeviceSet(TARVIKNS::MODE_TYPE mode, int location) {
        return m_manager.modeDeviceSet(mode, location);
    }
    StringBase supportedDeviceNameAt(int position) { return m_manager.supportedDeviceNameAt(position); }
    StringBase programOptionPackageNameAt(int position) {
        return m_manager.programOptionPackageNameAt(position);
    }

private:
    ConstraintsManager& m_manager;
};
