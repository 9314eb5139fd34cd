// Tells which names have to be asked about apart from all others.
#include "query/OrderDependentNames.h"

#include "model/Records.h"
#include "text/Suggest.h"

#include <AcdStore.h>
#include <TarvikException.h>
#include <tarvik/ConstraintsManager.h>

namespace why {

Oddities::Oddities() {
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

bool Oddities::isEntangled(const std::string& name) const {
    return name.find('_') != std::string::npos || m_names.count(lowerCase(name)) != 0;
}

bool hasUnknownOption(const std::string& name, bool sectionOnly) {
    const std::optional<AcdStore::Value> value = AcdStore::value(name.c_str(), "PROGRAM_OPTION");
    if (!value || (sectionOnly && !value->fromSection)) {
        return false;
    }
    for (const catalogue::Record& record : catalogue::readRecords(name, "PROGRAM_OPTION").all) {
        try {
            static_cast<void>(ConstraintsManager::optionString2Type(record.fields.front().text.c_str()));
        } catch (const DataMismatchException&) {
            return true;
        }
    }
    return false;
}

} // namespace why
