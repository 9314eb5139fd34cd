#include <AcdStore.h>
#include <tarvik/ConstraintsManager.h>

// Asks one question about one device, and ends.

int main(int argumentCount, char** arguments) {
    if (argumentCount != 3) {
        return 2;
    }
    AcdStore::setSearchPath({arguments[1]});
    ConstraintsManager& manager = *ConstraintsManager::getConstraintsManager();
    return manager.getDeviceOperations(arguments[2], TARVIKNS::MODE_TYPE::BS, TARVIKNS::OUTPUT_TYPE::USB2) ==
                   0
               ? 1
               : 0;
}
