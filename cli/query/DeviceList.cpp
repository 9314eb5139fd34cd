// Which names there are to ask about, and which of them need a manager of their own.
#include "query/DeviceList.h"

#include "model/Catalogue.h"
#include "query/OrderDependentNames.h"
#include "text/Suggest.h"

#include <AcdStore.h>

#include <unordered_set>

namespace {

using Set = std::unordered_set<std::string>;

bool hasPackage(const std::string& name) { return name.find('_') != std::string::npos; }

class Collection {
public:
    Collection() : m_flashes(catalogue::flashes()) {
        for (const std::string& family : catalogue::list("spi.acd", "DEVICE_FAMILY")) {
            m_flashNames.insert(family);
        }
        for (const catalogue::Flash& flash : m_flashes) {
            m_flashNames.insert(flash.name);
        }
    }

    [[nodiscard]] std::vector<ListedName> collect() {
        for (const std::string& family : catalogue::families()) {
            for (std::string& name : AcdStore::devices(family)) {
                add(std::move(name), family, hasPackage(family));
            }
        }
        for (catalogue::Flash& flash : m_flashes) {
            // The manager knows a flash by its name in upper case only.
            const bool isUnknown = !isFlash(flash.name);
            add(std::move(flash.name), "spi", isUnknown);
        }
        return std::move(m_names);
    }

private:
    void add(std::string name, const std::string& file, bool isOrderDependent) {
        if (m_seen.insert(lowerCase(name)).second) {
            const bool flash = isFlash(name);
            isOrderDependent = isOrderDependent || (flash && file != "spi") || m_dependent.contains(name);
            m_names.push_back({std::move(name), file, flash ? "spi" : file, isOrderDependent});
        }
    }

    [[nodiscard]] bool isFlash(const std::string& name) const {
        return m_flashNames.count(upperCase(name)) != 0;
    }

    std::vector<catalogue::Flash> m_flashes;
    Set m_flashNames; ///< as listed, with the families of flashes
    OrderDependentNames m_dependent;
    Set m_seen; ///< in lower case
    std::vector<ListedName> m_names;
};

} // namespace

std::vector<ListedName> deviceList() { return Collection().collect(); }

std::vector<ListedName> familyList(const std::vector<ListedName>& devices) {
    Set taken;
    for (const ListedName& device : devices) {
        taken.insert(lowerCase(device.name));
    }
    const OrderDependentNames dependent;
    std::vector<ListedName> families;
    const auto add = [&](const std::string& name, const std::string& file, bool isOrderDependent) {
        if (taken.insert(lowerCase(name)).second) {
            families.push_back({name, file, file, isOrderDependent});
        }
    };
    for (const std::string& family : catalogue::list("spi.acd", "DEVICE_FAMILY")) {
        const bool isUnknown = upperCase(family) != family;
        add(family, "spi", isUnknown || dependent.contains(family));
    }
    for (const std::string& family : catalogue::families()) {
        add(family, family, hasPackage(family));
    }
    add("base", "base", true);
    add("spi", "spi", true);
    return families;
}
