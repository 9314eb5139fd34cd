// Questions that several commands ask the manager, so that they ask them in the same way.
#include "query/ManagerQueries.h"

#include "model/Catalogue.h"
#include "model/Vocabulary.h"
#include "query/FreshManager.h"
#include "query/Tool.h"

#include <tarvik/ConstraintsManager.h>

using TARVIKNS::MODE_TYPE;
using TARVIKNS::OUTPUT_TYPE;

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

/// The keys of the modes for which a condition holds. The manager's messages about the others are dropped.
template <typename Condition>
std::vector<std::string> modesThat(Condition holds) {
    const MutedMessages muted;
    std::vector<std::string> found;
    const std::vector<std::string>& keys = vocabulary::modes();
    for (std::size_t mode = 0; mode < keys.size(); ++mode) {
        if (holds(static_cast<MODE_TYPE>(mode))) {
            found.push_back(keys[mode]);
        }
    }
    return found;
}

/// May the device be configured in the mode through some output?
bool isAllowed(ConstraintsManager& manager, MODE_TYPE mode, const std::string& device, const char* package) {
    for (int output = 0; output <= static_cast<int>(OUTPUT_TYPE::NONE); ++output) {
        if (manager.checkConstraints(mode, static_cast<OUTPUT_TYPE>(output), device.c_str(), package)) {
            return true;
        }
    }
    return false;
}

} // namespace

std::vector<std::string> modes(ConstraintsManager& manager, const std::string& device, const char* package) {
    return modesThat([&](MODE_TYPE mode) { return isAllowed(manager, mode, device, package); });
}

std::vector<std::string> modesWithoutOutput(ConstraintsManager& manager, const std::string& device,
                                            const char* package) {
    return modesThat([&](MODE_TYPE mode) {
        return mode != MODE_TYPE::SPI && mode != MODE_TYPE::PFF &&
               manager.checkConstraints(mode, device.c_str(), package) &&
               !isAllowed(manager, mode, device, package);
    });
}

std::vector<std::string> modes(Tool& tool, const std::string& device) {
    ConstraintsManager& manager = tool.manager();
    // Resolved first, so that the host layer's messages about its files are not dropped.
    static_cast<void>(AcdStore::value(device.c_str(), ""));
    return modes(manager, device, nullptr);
}

std::vector<TARVIKNS::OP_TYPE> operations(const ConstraintsManager& manager, int mask) {
    return members(manager.getOperationOrders(), mask);
}

std::vector<TARVIKNS::PROGRAM_OPTION> options(const ConstraintsManager& manager, int mask) {
    return members(manager.getProgramOptionOrders(), mask);
}

void requireKnown(Tool& tool, const std::string& device) {
    if (!tool.isLiteral() && !tool.manager().isKorvelDevice(device.c_str())) {
        throw catalogue::unknownDevice(device);
    }
}

} // namespace questions
