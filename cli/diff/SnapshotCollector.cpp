// Who is asked about, in which order, and which devices share an answer. What is asked stands in Questions.cpp.
#include "diff/SnapshotCollector.h"

#include "diff/Serialization.h"
#include "model/Catalogue.h"
#include "model/Multiboot.h"
#include "query/Apart.h"
#include "text/Suggest.h"

#include <AcdStore.h>
#include <TarvikException.h>

#include <algorithm>

namespace diff {

namespace {

constexpr const char* BASE = "base";
constexpr const char* SPI = "spi";

/// KS5000 is no package of KS500.
bool mayBePackage(const std::string& device, const std::string& owner) {
    return owner[device.size()] < '0' || owner[device.size()] > '9';
}

} // namespace

Interview::Interview(ConstraintsManager& manager) : m_manager(manager), m_idcodes(manager) {
    const auto fill = [](Set& set, const std::vector<std::string>& names) {
        set.insert(names.begin(), names.end());
    };
    fill(m_supported, catalogue::list(BASE, "DEVICE_SUPPORTED"));
    fill(m_optionOwners, catalogue::list(BASE, "PROGRAM_OPTION_PACKAGE"));
    for (const std::string& key : multiboot::keys()) {
        for (const std::string& name : catalogue::list("spi.acd", key)) {
            m_inMultiboot.insert(lowerCase(name));
        }
    }
}

Facts Interview::facts(const Reached& reached) {
    collect();
    findPackages();
    // First, as long as the manager was asked nothing.
    for (const Member& member : m_oddMembers) {
        askApart(member);
    }
    for (const Member& member : m_members) {
        if (!member.hasTables) {
            askTables(member);
        }
    }
    // Tables before properties: the options of a device that has no table of its own must not fill its family's.
    for (const Member& member : m_members) {
        if (member.hasTables) {
            askTables(member);
        }
        askPackages(member);
    }
    std::size_t done = 0;
    for (const Member& member : m_members) {
        askRest(member);
        reached(++done, m_members.size());
    }
    m_facts.general = general();
    return std::move(m_facts);
}

void Interview::collect() {
    const bool commonFault = why::hasUnknownOption(BASE, false) || why::hasUnknownOption(SPI, false);
    // What stands for all devices that nobody knows.
    add({BASE, BASE, false, true, nullptr}, true);
    const std::vector<catalogue::Flash> flashes = catalogue::flashes();
    Set flashNames;
    for (const catalogue::Flash& flash : flashes) {
        flashNames.insert(lowerCase(flash.name));
    }
    Set inFiles;
    for (const std::string& family : catalogue::families()) {
        const bool isOdd =
            commonFault || why::hasUnknownOption(family, false) || family.find('_') != family.npos;
        const std::vector<std::string> devices = AcdStore::devices(family);
        for (const std::string& name : devices) {
            const bool isFlash = flashNames.count(lowerCase(name)) != 0;
            inFiles.insert(lowerCase(name));
            add({name, family, isFlash, hasTables(family), nullptr},
                isOdd || isFlash || why::hasUnknownOption(name, true));
        }
        if (devices.empty()) {
            add({family, family, false, true, nullptr}, true);
        }
    }
    for (const catalogue::Flash& flash : flashes) {
        // A name that is no flash to the manager is not in upper case.
        add({flash.name, SPI, true, hasTables(SPI), nullptr}, commonFault ||
                                                                  inFiles.count(lowerCase(flash.name)) != 0 ||
                                                                  !m_manager.isSpiDevice(flash.name.c_str()));
    }
}

/// A family without tables may leave its records in those of another one.
bool Interview::hasTables(const std::string& family) const {
    return m_supported.count(family) != 0 && m_optionOwners.count(family) != 0;
}

/// @param isOdd a question about the name may meet what another question left behind
void Interview::add(Member member, bool isOdd) {
    const auto [known, isNew] = m_facts.devices.try_emplace(member.name);
    if (isNew) {
        member.facts = &known->second;
        (isOdd || m_oddities.isEntangled(member.name) ? m_oddMembers : m_members)
            .push_back(std::move(member));
    }
}

DeviceFacts* Interview::device(const std::string& name) {
    const auto found = m_facts.devices.find(name);
    return found == m_facts.devices.end() ? nullptr : &found->second;
}

/// The packages that make a difference for a device: others answer as no package does.
void Interview::findPackages() {
    for (const std::string& owner : m_optionOwners) {
        for (std::size_t length = 1; length < owner.size(); ++length) {
            DeviceFacts* const facts = device(owner.substr(0, length));
            if (facts != nullptr && mayBePackage(owner.substr(0, length), owner)) {
                facts->packages.try_emplace(owner.substr(length));
            }
        }
    }
    for (const std::string& part : catalogue::list(BASE, "NOT_SUPPORTED_PART_IN_MODE")) {
        const std::size_t begin = part.find('_');
        const std::size_t end = begin == part.npos ? begin : part.find('_', begin + 1);
        if (end == part.npos) {
            continue;
        }
        if (DeviceFacts* const facts = device(part.substr(begin + 1, end - begin - 1))) {
            facts->packages[part.substr(end + 1)].modes.emplace();
        }
    }
}

/// Asks in a copy of this process. A manager that raises gives that for an answer.
Answers Interview::answersApart(const Asking& ask) {
    return unpackedAnswers(why::apart([&] {
        try {
            return packed(ask());
        } catch (const TarvikException& fault) {
            return packed(Answers{{{"faults"}, {fault.typeName()}}});
        }
    }));
}

/// Asks each kind of question of a manager of its own.
void Interview::askApart(const Member& member) {
    const std::vector<Asking> kinds{[&] { return whatItIs(member); }, [&] { return modes(member.name); },
                                    [&] { return operations(member.name); },
                                    [&] { return options(member.name, nullptr); },
                                    [&] { return allProperties(member); }};
    Answers own;
    for (const Asking& kind : kinds) {
        for (auto& [question, texts] : answersApart(kind)) {
            own[question].merge(Texts(texts));
        }
    }
    const Texts& family = own[{FAMILY, Question::Kind::VALUE}];
    member.facts->family = family.empty() ? member.family : *family.begin();
    member.facts->own = packed(own);
    for (auto& [package, facts] : member.facts->packages) {
        if (facts.modes) {
            facts.modes = answersApart([&, name = &package] {
                return Answers{{{MODES}, modes(member.name, name->c_str())}};
            })[{MODES}];
        }
        facts.options = m_facts.shared.size();
        m_facts.shared.push_back(
            answersApart([&, name = &package] { return options(member.name, name->c_str()); }));
    }
}

void Interview::askTables(const Member& member) {
    std::vector<std::size_t>& shared = member.facts->shared;
    const auto askFor = [&](const char* topic, const Set& owners, const Asking& ask) {
        const std::string& owner = owners.count(member.name) != 0 ? member.name : member.family;
        return share(topic + owner, [&] { return member.hasTables ? ask() : answersApart(ask); });
    };
    shared.push_back(askFor("operations ", m_supported, [&] { return operations(member.name); }));
    shared.push_back(askFor("options ", m_optionOwners, [&] { return options(member.name, nullptr); }));
}

void Interview::askPackages(const Member& member) {
    for (auto& [package, facts] : member.facts->packages) {
        if (m_optionOwners.count(member.name + package) != 0) {
            facts.options = share("options " + member.name + ' ' + package,
                                  [&, name = &package] { return options(member.name, name->c_str()); });
        }
        if (facts.modes) {
            facts.modes = modes(member.name, package.c_str());
        }
    }
}

void Interview::askRest(const Member& member) {
    DeviceFacts& facts = *member.facts;
    Answers own = whatItIs(member);
    facts.family = *own.at({FAMILY, Question::Kind::VALUE}).begin();
    own.merge(sectionProperties(member.name));
    if (member.isFlash) {
        addFlashProperties(own, member.name, "flash property ");
    }
    facts.own = packed(own);
    facts.shared.push_back(share("modes " + facts.family, [&] { return modes(member.name); }));
    facts.shared.push_back(
        share("properties " + facts.family, [&] { return familyProperties(facts.family); }));
}

/// Asks once for the devices of a group.
/// @return where the answers are among those that are shared
std::size_t Interview::share(const std::string& group, const Asking& ask) {
    const auto [known, isNew] = m_groups.try_emplace(group, m_facts.shared.size());
    if (isNew) {
        m_facts.shared.push_back(ask());
    }
    return known->second;
}

} // namespace diff
