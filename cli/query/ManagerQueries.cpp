// What several commands ask the manager, in one place so that they ask it alike.
#include "query/ManagerQueries.h"

#include "model/Catalogue.h"
#include "model/Vocabulary.h"
#include "query/Tool.h"

#include <tarvik/ConstraintsManager.h>

namespace questions {

namespace {

template <typename Type>
std::vector<Type> members(const std::vector<Type>& order, int mask) {
    std::vector<Type> found;
    for (const Type value : order) {
        if ((static_cast<unsigned>(mask) >> static_cast<unsigned>(value) & 1U) != 0) {
            found.push_back(value);
        }
    }
    return found;
}

} // namespace

std::vector<std::string> modes(Tool& tool, const std::string& device) {
    ConstraintsManager& manager = tool.manager();
    // Resolved first, lest what the host layer says about its files is dropped as well.
    static_cast<void>(AcdStore::value(device.c_str(), ""));
    const std::size_t issued = tool.messages().count();
    std::vector<std::string> allowed;
    for (const std::string& key : vocabulary::modes()) {
        if (manager.checkConstraints(vocabulary::readMode(key), device.c_str(), nullptr)) {
            allowed.push_back(key);
        }
    }
    tool.messages().forgetBehind(issued);
    return allowed;
}

std::vector<TARVIKNS::OP_TYPE> operations(const ConstraintsManager& manager, int mask) {
    return members(manager.getOperationOrders(), mask);
}

std::vector<TARVIKNS::PROGRAM_OPTION> options(const ConstraintsManager& manager, int mask) {
    return members(manager.getProgramOptionOrders(), mask);
}

void requireKnown(ConstraintsManager& manager, const std::string& device) {
    if (!manager.isKorvelDevice(device.c_str())) {
        throw catalogue::unknownDevice(device);
    }
}

} // namespace questions
