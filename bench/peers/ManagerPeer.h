#pragma once

#include "peers/Question.h"

#include <tarvik/ConstraintsManager.h>

#include <string_view>

namespace bench {

/// The manager itself, answering from a database directory.
class ManagerPeer {
public:
    static constexpr const char* NAME = "manager";

    explicit ManagerPeer(const std::string& directory);
    explicit ManagerPeer(ConstraintsManager& manager) : m_manager(manager) {}

    /// Asks for everything about every device once.
    void load(const Facts& facts);

    [[nodiscard]] std::uint32_t operations(const Question& question) {
        return static_cast<std::uint32_t>(
            m_manager.getDeviceOperations(question.device.c_str(), mode(question), output(question)));
    }
    [[nodiscard]] std::uint32_t options(const Question& question) {
        return static_cast<std::uint32_t>(
            m_manager.getProgramOptions(question.device.c_str(), mode(question), output(question), nullptr));
    }
    [[nodiscard]] bool allows(const Question& question) {
        return m_manager.checkConstraints(mode(question), output(question), question.device.c_str(),
                                          static_cast<TARVIKNS::OP_TYPE>(question.operation), nullptr);
    }
    [[nodiscard]] std::string_view property(const Question& question) {
        return m_manager.getDeviceStringProperty(question.device.c_str(), question.key.c_str());
    }

private:
    static TARVIKNS::MODE_TYPE mode(const Question& question) {
        return static_cast<TARVIKNS::MODE_TYPE>(question.mode);
    }
    static TARVIKNS::OUTPUT_TYPE output(const Question& question) {
        return static_cast<TARVIKNS::OUTPUT_TYPE>(question.output);
    }

    ConstraintsManager& m_manager;
};

} // namespace bench
