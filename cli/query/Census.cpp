// Asks one question for every device, as seldom as exact answers allow.
#include "query/Census.h"

#include "model/Catalogue.h"
#include "query/Apart.h"
#include "query/DeviceList.h"
#include "query/OrderDependentNames.h"

#include <tarvik/ConstraintsManager.h>

#include <unordered_map>
#include <unordered_set>

namespace why {

namespace {

using Kind = Question::Kind;

class Census {
public:
    Census(ConstraintsManager& manager, Question question, const Asking& ask, const Counting& count)
        : m_manager(manager), m_question(std::move(question)), m_ask(ask), m_count(count),
          m_supported(set(catalogue::list("base.acd", "DEVICE_SUPPORTED"))) {}

    [[nodiscard]] std::vector<Entry> take() {
        for (Member& member : members()) {
            add(std::move(member));
        }
        // First, as long as the manager was asked nothing.
        for (const Place& place : m_places) {
            if (place.isApart) {
                answer(place);
            }
        }
        for (const Place& place : m_places) {
            if (!place.isApart) {
                answer(place);
            }
        }
        return std::move(m_entries);
    }

private:
    struct Place {
        std::size_t position; ///< among the entries
        std::string group;    ///< the devices that share their answer; empty: none other
        bool isApart;
    };

    using Set = std::unordered_set<std::string>;

    static Set set(const std::vector<std::string>& names) { return {names.begin(), names.end()}; }

    void add(Member&& member) {
        Place place{m_entries.size(), "", member.isEntangled};
        if (m_question.kind != Kind::OPERATION) {
            place.isApart = place.isApart || member.isFaulty || hasUnknownOption(member.name, true);
        } else if (!place.isApart && m_supported.count(member.name) == 0) {
            place.group = std::move(member.family);
            // A family without a table may leave its records in another one's.
            place.isApart = m_supported.count(place.group) == 0;
        }
        m_entries.push_back({std::move(member.name), "", Verdict::NO});
        m_places.push_back(std::move(place));
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

    void answer(const Place& place) {
        if (m_count) {
            m_count(m_answered++, m_places.size());
        }
        Entry& entry = m_entries[place.position];
        if (!place.group.empty()) {
            const auto [known, isNew] = m_groups.emplace(place.group, place.position);
            if (!isNew) {
                const Entry& first = m_entries[known->second];
                entry = {entry.name, first.family, first.verdict};
                return;
            }
        }
        entry = place.isApart ? askApart(entry.name) : askFor(entry.name);
    }

    ConstraintsManager& m_manager;
    Question m_question;
    const Asking& m_ask;
    const Counting& m_count;
    std::size_t m_answered = 0;
    Set m_supported;
    std::vector<Entry> m_entries;
    std::vector<Place> m_places;
    std::unordered_map<std::string, std::size_t>
        m_groups; ///< to the position of the entry that was asked for
};

} // namespace

std::vector<Entry> askForAll(ConstraintsManager& manager, Question question, const Asking& ask,
                             const Counting& count) {
    return Census(manager, std::move(question), ask, count).take();
}

} // namespace why
