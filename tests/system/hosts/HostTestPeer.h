#pragma once

#include <tarvik/ConstraintsManager.h>

/// Sees the members of the manager that a test against some host asks for; it knows nothing of the host.
class TarvikTestPeer {
public:
    /// Removes the manager, if there is one, so that the next request for it makes a new one.
    static void removeManager() {
        if (exists()) {
            ConstraintsManager::RemoveConstraintsManager();
            ConstraintsManager::s_instance = nullptr;
        }
    }
    [[nodiscard]] static bool exists() { return ConstraintsManager::s_instance != nullptr; }

    explicit TarvikTestPeer(const ConstraintsManager& manager) : m_manager(manager) {}

    auto& exceptions() const { return m_manager.m_exceptions; }
    auto& bsCables() const { return m_manager.m_bsCables; }
    auto& ssCables() const { return m_manager.m_ssCables; }
    auto& smCables() const { return m_manager.m_smCables; }
    auto& bsFileCables() const { return m_manager.m_bsFileCables; }
    auto& dp770Cables() const { return m_manager.m_dp770Cables; }
    auto& spiCables() const { return m_manager.m_spiCables; }
    auto& kiteCfCables() const { return m_manager.m_kiteCfCables; }
    auto& kiteMpmCables() const { return m_manager.m_kiteMpmCables; }
    auto& pffCables() const { return m_manager.m_pffCables; }
    auto& supportedDevices() const { return m_manager.m_supportedDevices; }
    auto& bsDevices() const { return m_manager.m_bsDevices; }
    auto& ssDevices() const { return m_manager.m_ssDevices; }
    auto& smDevices() const { return m_manager.m_smDevices; }
    auto& bsFileDevices() const { return m_manager.m_bsFileDevices; }
    auto& dp770Devices() const { return m_manager.m_dp770Devices; }
    auto& spiDevices() const { return m_manager.m_spiDevices; }
    auto& kiteCfDevices() const { return m_manager.m_kiteCfDevices; }
    auto& kiteMpmDevices() const { return m_manager.m_kiteMpmDevices; }
    auto& pffDevices() const { return m_manager.m_pffDevices; }
    auto& programOptionPackages() const { return m_manager.m_programOptionPackages; }
    auto& notSupportedPartInMode() const { return m_manager.m_notSupportedPartInMode; }
    auto& deviceIdcodes() const { return m_manager.m_deviceIdcodes; }
    auto& loadedFamilies() const { return m_manager.m_loadedFamilies; }
    auto& operationsLoaded() const { return m_manager.m_operationsLoaded; }
    auto& programOptionsLoaded() const { return m_manager.m_programOptionsLoaded; }
    auto& spiProperties() const { return m_manager.m_spiProperties; }
    auto& spiNames() const { return m_manager.m_spiNames; }
    auto& spiFamilies() const { return m_manager.m_spiFamilies; }
    auto& at1Devices() const { return m_manager.m_at1Devices; }
    auto& st1Devices() const { return m_manager.m_st1Devices; }
    auto& st2Devices() const { return m_manager.m_st2Devices; }
    auto& bpi1Devices() const { return m_manager.m_bpi1Devices; }
    auto& bpi2Devices() const { return m_manager.m_bpi2Devices; }
    auto& bpi3Devices() const { return m_manager.m_bpi3Devices; }
    auto& multibootTypes() const { return m_manager.m_multibootTypes; }

private:
    const ConstraintsManager& m_manager;
};
