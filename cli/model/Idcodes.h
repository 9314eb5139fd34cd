#pragma once

#include "text/Json.h"
#include "text/Suggest.h"

#include <tarvik/ConstraintsManager.h>

#include <optional>
#include <string>
#include <string_view>
#include <unordered_map>

/// Finds IDCODEs by device name. The manager keeps the names as the base database writes them; device names
/// are compared without case everywhere else, so here they are too, an exact match first.
class IdcodeFinder {
public:
    struct Idcode {
        std::string name; ///< as the database writes it
        std::string value;
    };

    explicit IdcodeFinder(const ConstraintsManager& manager) : m_idcodes(manager.getAllDeviceIdcodes()) {
        for (const auto& [name, idcode] : m_idcodes) {
            m_withoutCase.emplace(lowerCase(ltptstr::view(name)), &name);
        }
    }

    [[nodiscard]] std::optional<Idcode> find(std::string_view device) const {
        auto found = m_idcodes.find(device);
        if (found == m_idcodes.end()) {
            const auto other = m_withoutCase.find(lowerCase(device));
            if (other == m_withoutCase.end()) {
                return std::nullopt;
            }
            found = m_idcodes.find(*other->second);
        }
        return Idcode{toStdString(found->first), toStdString(found->second)};
    }

private:
    const ConstraintsManager::Texts& m_idcodes;
    std::unordered_map<std::string, const StringBase*> m_withoutCase;
};
