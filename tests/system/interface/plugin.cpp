// A plug-in of an application: answers from a database, and takes the libraries with it when it is unloaded.
#include <tarvik/ConstraintsManager.h>

#include <AcdStore.h>
#include <Port_MsgManData.h>

#include <string>

extern "C" __attribute__((visibility("default"))) int vendorOf(const char* device, const char* directory,
                                                               char* vendor, int size);

/// Writes the vendor of a device that a database gives.
/// @return how many messages there were; -1 without a manager
int vendorOf(const char* device, const char* directory, char* vendor, int size) {
    int messages = 0;
    Port_MsgManData::setSink([&messages](const Port_MsgManData::Message&) { ++messages; });
    AcdStore::setSearchPath({directory});
    ConstraintsManager* const manager = ConstraintsManager::getConstraintsManager();
    if (manager == nullptr) {
        return -1;
    }
    manager->setExceptions(false);
    const char* const text = manager->getDeviceStringProperty(device, "VENDOR");
    std::string(text == nullptr ? "none" : text).copy(vendor, static_cast<std::size_t>(size));
    ConstraintsManager::RemoveConstraintsManager();
    // Its code goes with this library.
    Port_MsgManData::setSink({});
    return messages;
}
