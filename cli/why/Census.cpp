// Asks one question for every device, as seldom as exact answers allow.
#include "why/Census.h"

#include "Catalogue.h"
#include "Nearest.h"
#include "why/Apart.h"
#include "why/Oddities.h"
#include "why/StartUp.h"

#include <AcdStore.h>
#include <tarvik/ConstraintsManager.h>

#include <map>
#include <unordered_map>
#include <unordered_set>

namespace why {

namespace {

using Kind = Question::Kind;

class Census {
public:
    Census(ConstraintsManager& manager, Question question, const Asking& ask, const Counting& count)
        : m_manager(manager), m_question(std::move(question)), m_ask(ask), m_count(count),
          m_supported(set(catalogue::list("base.acd", "DEVICE_SUPPORTED"))),
          m_flashes(set(catalogue::list("spi.acd", "DEVICE_FAMILY"))) {
        for (const catalogue::Flash& flash : catalogue::flashes()) {
            m_flashes.insert(flash.name);
        }
    }

    [[nodiscard]] std::vector<Entry> take() {
        collect();
        // First, as long as the manager was asked nothing.
        for (const Member& member : m_members) {
            if (member.isApart) {
                answer(member);
            }
        }
        for (const Member& member : m_members) {
            if (!member.isApart) {
                answer(member);
            }
        }
        return std::move(m_entries);
    }

private:
    struct Member {
        std::size_t position; ///< among the entries
        std::string group;    ///< the devices that share their answer; empty: none other
        bool isApart;
    };

    using Set = std::unordered_set<std::string>;

    static Set set(const std::vector<std::string>& names) { return {names.begin(), names.end()}; }

    void collect() {
        Set seen;
        const bool commonFault = hasUnknownOption("base", false) || hasUnknownOption("spi", false);
        for (const std::string& family : catalogue::families()) {
            const bool familyFault = commonFault || hasUnknownOption(family, false);
            const bool isOdd = family.find('_') != std::string::npos;
            for (const std::string& name : AcdStore::devices(family)) {
                if (seen.insert(lowerCase(name)).second) {
                    add(name, family, isOdd, familyFault);
                }
            }
        }
        for (const catalogue::Flash& flash : catalogue::flashes()) {
            if (seen.insert(lowerCase(flash.name)).second) {
                add(flash.name, "spi", !isFlash(flash.name), commonFault);
            }
        }
    }

    /// @param isOdd a question about the name may meet what another question left behind
    /// @param isFaulty the manager may raise when it reads the options that belong to the name
    void add(const std::string& name, const std::string& family, bool isOdd, bool isFaulty) {
        Member member{m_entries.size(), "", isOdd || m_oddities.isEntangled(name)};
        m_entries.push_back({name, "", Verdict::NO});
        if (m_question.kind != Kind::OPERATION) {
            member.isApart = member.isApart || isFaulty || hasUnknownOption(name, true);
        } else if (!member.isApart && m_supported.count(name) == 0) {
            member.group = isFlash(name) ? "spi" : family;
            // A family without a table may leave its records in another one's.
            member.isApart = m_supported.count(member.group) == 0;
        }
        m_members.push_back(std::move(member));
    }

    [[nodiscard]] bool isFlash(const std::string& name) const {
        return m_flashes.count(upperCase(name)) != 0;
    }

    [[nodiscard]] Entry askFor(const std::string& name) {
        m_question.device = name;
        const Verdict verdict = m_ask(m_manager, m_question);
        return {name, plain(m_manager.getPartFamily(name.c_str())), verdict};
    }

    /// The family is asked for apart from the question, which resolves the name without its package.
    [[nodiscard]] Entry askApart(const std::string& name) {
        const std::string verdict =
            apart([&] { return std::to_string(static_cast<int>(askFor(name).verdict)); });
        std::string family = apart([&] { return plain(m_manager.getPartFamily(name.c_str())); });
        return {name, std::move(family), static_cast<Verdict>(verdict.at(0) - '0')};
    }

    void answer(const Member& member) {
        if (m_count) {
            m_count(m_answered++, m_members.size());
        }
        Entry& entry = m_entries[member.position];
        if (!member.group.empty()) {
            const auto [known, isNew] = m_groups.emplace(member.group, member.position);
            if (!isNew) {
                const Entry& first = m_entries[known->second];
                entry = {entry.name, first.family, first.verdict};
                return;
            }
        }
        entry = member.isApart ? askApart(entry.name) : askFor(entry.name);
    }

    ConstraintsManager& m_manager;
    Question m_question;
    const Asking& m_ask;
    const Counting& m_count;
    std::size_t m_answered = 0;
    Set m_supported;
    Set m_flashes; ///< as listed, families of flashes too
    Oddities m_oddities;
    std::vector<Entry> m_entries;
    std::vector<Member> m_members;
    std::unordered_map<std::string, std::size_t>
        m_groups; ///< to the position of the entry that was asked for
};

} // namespace

std::vector<Entry> askForAll(ConstraintsManager& manager, Question question, const Asking& ask,
                             const Counting& count) {
    return Census(manager, std::move(question), ask, count).take();
}

} // namespace why
