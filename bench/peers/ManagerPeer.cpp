#include "peers/ManagerPeer.h"

#include <AcdStore.h>

namespace bench {

namespace {

ConstraintsManager& managerOf(const std::string& directory) {
    AcdStore::setSearchPath({directory});
    return *ConstraintsManager::getConstraintsManager();
}

} // namespace

ManagerPeer::ManagerPeer(const std::string& directory) : m_manager(managerOf(directory)) {}

void ManagerPeer::load(const Facts& facts) {
    for (const Family& family : facts.families) {
        for (const Device& device : family.devices) {
            static_cast<void>(m_manager.getDeviceOperations(device.name.c_str(), TARVIKNS::MODE_TYPE::BS,
                                                            TARVIKNS::OUTPUT_TYPE::USB2));
            static_cast<void>(m_manager.getDeviceStringProperty(device.name.c_str(), "PINS"));
        }
    }
}

} // namespace bench
