// Finds the names that need a manager of their own.
#include "query/OrderDependentNames.h"

#include "text/Suggest.h"

#include <AcdStore.h>
#include <TarvikException.h>
#include <tarvik/ConstraintsManager.h>

OrderDependentNames::OrderDependentNames() {
    for (const std::string& family : AcdStore::families()) {
        m_names.insert(lowerCase(family));
        m_names.insert(lowerCase(family) + ".acd");
        if (sameWithoutCase(family, "base") || sameWithoutCase(family, "spi")) {
            for (const std::string& name : AcdStore::devices(family)) {
                m_names.insert(lowerCase(name));
            }
        }
    }
}

bool OrderDependentNames::contains(const std::string& name) const {
    return name.find('_') != std::string::npos || m_names.count(lowerCase(name)) != 0;
}

bool hasUnknownOption(const std::string& name) {
    const std::optional<AcdStore::Value> value = AcdStore::value(name.c_str(), "PROGRAM_OPTION");
    if (!value || value->text.empty()) {
        return false;
    }
    const std::string_view text = value->text;
    for (std::size_t start = 0; start <= text.size();) {
        const std::size_t end = std::min(text.find(':', start), text.size());
        const std::string_view record = text.substr(start, end - start);
        try {
            const std::string option(record.substr(0, record.find(',')));
            static_cast<void>(ConstraintsManager::optionString2Type(option.c_str()));
        } catch (const DataMismatchException&) {
            return true;
        }
        start = end + 1;
    }
    return false;
}

bool hasOwnOptions(const std::string& device) {
    const std::optional<AcdStore::Value> value = AcdStore::value(device.c_str(), "PROGRAM_OPTION");
    return value && value->fromSection;
}
