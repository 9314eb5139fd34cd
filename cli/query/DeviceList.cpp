// Which devices there are, and which of them can't be asked for one after the other.
#include "query/DeviceList.h"

#include "model/Catalogue.h"
#include "query/OrderDependentNames.h"
#include "text/Suggest.h"

#include <AcdStore.h>
#include <UT_STR.h>

#include <unordered_set>

namespace why {

namespace {

using Set = std::unordered_set<std::string>;

class Collection {
public:
    Collection() {
        for (const std::string& family : catalogue::list("spi.acd", "DEVICE_FAMILY")) {
            m_flashes.insert(family);
        }
        for (const catalogue::Flash& flash : catalogue::flashes()) {
            m_flashes.insert(flash.name);
        }
    }

    [[nodiscard]] std::vector<Member> collect() {
        const bool commonFault = hasUnknownOption("base", false) || hasUnknownOption("spi", false);
        for (const std::string& family : catalogue::families()) {
            const bool familyFault = commonFault || hasUnknownOption(family, false);
            // A question about a device of it may meet what another question left behind.
            const bool isOdd = family.find('_') != std::string::npos;
            for (std::string& name : AcdStore::devices(family)) {
                add(std::move(name), family, isOdd, familyFault);
            }
        }
        for (catalogue::Flash& flash : catalogue::flashes()) {
            const bool isOdd = !isFlash(flash.name);
            add(std::move(flash.name), "spi", isOdd, commonFault);
        }
        return std::move(m_members);
    }

private:
    void add(std::string name, const std::string& family, bool isOdd, bool isFaulty) {
        if (m_seen.insert(lowerCase(name)).second) {
            Member member{"", isFlash(name) ? "spi" : family, isOdd || m_oddities.isEntangled(name),
                          isFaulty};
            member.name = std::move(name);
            m_members.push_back(std::move(member));
        }
    }

    [[nodiscard]] bool isFlash(const std::string& name) const {
        return m_flashes.count(plain(UT_STR::Upper(name.c_str()))) != 0;
    }

    Set m_flashes; ///< as listed, families of flashes too
    Oddities m_oddities;
    Set m_seen; ///< in lower case
    std::vector<Member> m_members;
};

} // namespace

std::vector<Member> members() { return Collection().collect(); }

} // namespace why
