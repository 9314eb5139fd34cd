// Asks the installed library of everything that can go wrong in an installation: the database beside it, data that
// crosses its border, and an exception that does.

#include <tarvik/ConstraintsManager.h>

#include <Port_MsgManData.h>
#include <TarvikException.h>

#include <iostream>

using TARVIKNS::MODE_TYPE;
using TARVIKNS::OP_TYPE;
using TARVIKNS::OUTPUT_TYPE;

int main() {
    static_assert(__cplusplus == 201703L, "C++17 is what is promised to suffice");
    Port_MsgManData::setSink([](const Port_MsgManData::Message&) {});
    ConstraintsManager* const manager = ConstraintsManager::getConstraintsManager();
    std::cout << "KS50 is of family " << manager->getPartFamily("KS50").c_str() << '\n';
    for (const OP_TYPE operation : {OP_TYPE::PROGRAM, OP_TYPE::VERIFY, OP_TYPE::ERASE}) {
        if (manager->checkConstraints(MODE_TYPE::BS, OUTPUT_TYPE::USB2, "KS50", operation, nullptr)) {
            std::cout << ConstraintsManager::operationType2DisplayString(operation).c_str() << '\n';
        }
    }
    std::cout << "Vendor " << manager->getDeviceStringProperty("KS50", "VENDOR") << '\n';
    try {
        std::cout << manager->getDeviceStringProperty("KS50", "NO_SUCH_PROPERTY") << '\n';
    } catch (const DataNotFoundException& exception) {
        std::cout << "No such property: " << exception.what() << '\n';
    }
    ConstraintsManager::RemoveConstraintsManager();
}
