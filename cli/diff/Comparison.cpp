// Compares the answers of two databases, and names once what devices have in common.
#include "diff/Comparison.h"

#include <algorithm>
#include <iterator>
#include <utility>

namespace diff {

namespace {

/// What the other set lacks.
StringSet missingFrom(const StringSet& other, const StringSet& set) {
    StringSet rest;
    std::ranges::set_difference(set, other, std::inserter(rest, rest.end()));
    return rest;
}

/// What changed for one question. Each name is a change of its own, so that devices which share a part of a change can
/// be grouped by that part.
std::vector<Change> changesOf(const Question& question, const StringSet& before, const StringSet& after) {
    std::vector<Change> changes;
    if (before == after) {
        return changes;
    }
    const StringSet lost = missingFrom(after, before);
    const StringSet gained = missingFrom(before, after);
    if (question.kind == Question::Kind::VALUE) {
        changes.push_back({question, lost, gained});
        return changes;
    }
    for (const std::string& name : lost) {
        changes.push_back({question, {name}, {}});
    }
    for (const std::string& name : gained) {
        changes.push_back({question, {}, {name}});
    }
    return changes;
}

/// The changes with one for each question, in the order of the questions.
std::vector<Change> joined(const std::vector<Change>& changes) {
    std::map<Question, Change> byQuestion;
    for (const Change& change : changes) {
        Change& all = byQuestion[change.question];
        all.question = change.question;
        all.lost.insert(change.lost.begin(), change.lost.end());
        all.gained.insert(change.gained.begin(), change.gained.end());
    }
    std::vector<Change> sorted;
    sorted.reserve(byQuestion.size());
    for (auto& [question, change] : byQuestion) {
        sorted.push_back(std::move(change));
    }
    return sorted;
}

/// The answers about one device in one database.
struct DeviceAnswers {
    Answers own;
    const Answers& shared;

    /// A package without an answer of its own has that of the device without a package.
    [[nodiscard]] const StringSet& to(const Question& question) const {
        static const StringSet none;
        for (const Answers* const answers : {&own, &shared}) {
            if (const auto found = answers->find(question); found != answers->end()) {
                return found->second;
            }
        }
        return question.package.empty() ? none : to(withoutPackage(question));
    }

    [[nodiscard]] static Question withoutPackage(Question question) {
        question.package.clear();
        return question;
    }
};

std::set<Question> questions(const Answers& before, const Answers& after) {
    std::set<Question> questions;
    for (const Answers* const answers : {&before, &after}) {
        for (const auto& [question, answer] : *answers) {
            questions.insert(question);
        }
    }
    return questions;
}

/// The changes of these questions.
std::vector<Change> changesOf(const std::set<Question>& questions, const DeviceAnswers& before,
                              const DeviceAnswers& after) {
    std::vector<Change> all;
    for (const Question& question : questions) {
        std::vector<Change> changes = changesOf(question, before.to(question), after.to(question));
        if (!question.package.empty()) {
            // What changes just so without the package is listed there.
            const Question general = DeviceAnswers::withoutPackage(question);
            const std::vector<Change> known = changesOf(general, before.to(general), after.to(general));
            std::erase_if(changes, [&](const Change& change) {
                return std::ranges::find(known, Change{general, change.lost, change.gained}) != known.end();
            });
        }
        std::ranges::move(changes, std::back_inserter(all));
    }
    return all;
}

/// Compares device by device. Changes are known by number: most devices share theirs.
class Comparer {
public:
    Comparer(const Snapshot& before, const Snapshot& after) : m_before(before), m_after(after) {}

    [[nodiscard]] Comparison compare() {
        Comparison comparison{
            missingDevices(m_after, m_before), missingDevices(m_before, m_after), general(), {}, {}};
        std::map<std::string_view, Family, NaturalLess> families;
        std::map<std::string_view, Family> familyNames; ///< what families answer by their own names
        for (const auto& [name, after] : m_after.devices()) {
            const auto before = m_before.devices().find(name);
            if (before != m_before.devices().end()) {
                Family& family = after.isFamily ? familyNames[after.family] : families[after.family];
                family.push_back({name, changesOfDevice(before->second, after)});
                if (hasFault(before->second) && hasFault(after)) {
                    comparison.unanswered.emplace_back(name);
                }
            }
        }
        for (const auto& [name, names] : familyNames) {
            families.try_emplace(name);
        }
        for (const auto& [name, family] : families) {
            addGroups(comparison.groups, std::string(name), family);
            addGroups(comparison.groups, std::string(name), whatNoDeviceShows(family, familyNames[name]));
        }
        return comparison;
    }

private:
    using Numbers = std::vector<std::size_t>;
    using Family = std::vector<std::pair<std::string_view, Numbers>>; ///< devices with their changes

    /// The devices that the other database lacks.
    [[nodiscard]] static Devices missingDevices(const Snapshot& other, const Snapshot& snapshot) {
        Devices devices;
        for (const auto& [name, device] : snapshot.devices()) {
            if (other.devices().count(name) == 0 && !device.isFamily) {
                devices[std::string(device.family)].emplace_back(name);
            }
        }
        return devices;
    }

    [[nodiscard]] std::vector<Change> general() const {
        const Answers none;
        return joined(changesOf(questions(m_before.general(), m_after.general()), {m_before.general(), none},
                                {m_after.general(), none}));
    }

    [[nodiscard]] static bool hasFault(const Snapshot::Device& device) {
        return device.own.find(FAULTS) != device.own.npos &&
               deserialized(device.own).count({"", FAULTS, Question::Kind::VALUE}) != 0;
    }

    void add(Numbers& numbers, std::vector<Change> changes) {
        for (Change& change : changes) {
            const auto [known, isNew] = m_numbers.try_emplace(std::move(change), m_changes.size());
            if (isNew) {
                m_changes.push_back(&known->first);
            }
            numbers.push_back(known->second);
        }
    }

    /// What changed in answers that devices have in common.
    const Numbers& sharedChanges(const Answers& before, const Answers& after) {
        const auto [known, isNew] = m_shared.try_emplace({&before, &after});
        if (isNew) {
            add(known->second, changesOf(questions(before, after), {{}, before}, {{}, after}));
        }
        return known->second;
    }

    [[nodiscard]] Numbers changesOfDevice(const Snapshot::Device& before, const Snapshot::Device& after) {
        Numbers numbers = sharedChanges(*before.shared, *after.shared);
        if (!numbers.empty() || before.own != after.own) {
            const DeviceAnswers oldAnswers{deserialized(before.own), *before.shared};
            const DeviceAnswers newAnswers{deserialized(after.own), *after.shared};
            add(numbers, changesOf(questions(oldAnswers.own, newAnswers.own), oldAnswers, newAnswers));
        }
        return numbers;
    }

    /// The changes of a family's names that none of its devices shows.
    [[nodiscard]] static Family whatNoDeviceShows(const Family& family, const Family& names) {
        std::set<std::size_t> shown;
        for (const auto& [device, numbers] : family) {
            shown.insert(numbers.begin(), numbers.end());
        }
        Family rest;
        for (const auto& [name, numbers] : names) {
            Numbers own = numbers;
            std::erase_if(own, [&](std::size_t number) { return shown.count(number) != 0; });
            rest.push_back({name, std::move(own)});
        }
        return rest;
    }

    /// The changes of one family: devices that share a change stand together.
    void addGroups(std::vector<Group>& groups, const std::string& name, const Family& family) const {
        std::map<std::size_t, Numbers> devicesByChange;
        for (std::size_t device = 0; device < family.size(); ++device) {
            for (const std::size_t number : family[device].second) {
                devicesByChange[number].push_back(device);
            }
        }
        std::map<Numbers, std::vector<Change>> changesByDevices;
        for (const auto& [number, devices] : devicesByChange) {
            changesByDevices[devices].push_back(*m_changes[number]);
        }
        std::vector<Group> added;
        for (const auto& [devices, changes] : changesByDevices) {
            Group& group = added.emplace_back(Group{name, {}, {}, joined(changes)});
            for (std::size_t device = 0; device < family.size(); ++device) {
                const bool isIn = std::binary_search(devices.begin(), devices.end(), device);
                (isIn ? group.devices : group.others).emplace_back(family[device].first);
            }
        }
        std::stable_sort(added.begin(), added.end(), [](const Group& left, const Group& right) {
            return left.devices.size() > right.devices.size();
        });
        groups.insert(groups.end(), std::make_move_iterator(added.begin()),
                      std::make_move_iterator(added.end()));
    }

    const Snapshot& m_before;
    const Snapshot& m_after;
    std::map<Change, std::size_t> m_numbers;
    std::vector<const Change*> m_changes; ///< by number
    std::map<std::pair<const Answers*, const Answers*>, Numbers> m_shared;
};

} // namespace

bool Comparison::hasLosses() const {
    const auto isLoss = [](const Change& change) {
        return change.question.topic == FAULTS ? !change.gained.empty() : !change.lost.empty();
    };
    return !onlyInOld.empty() || std::any_of(general.begin(), general.end(), isLoss) ||
           std::any_of(groups.begin(), groups.end(), [&isLoss](const Group& group) {
               return std::any_of(group.changes.begin(), group.changes.end(), isLoss);
           });
}

bool Comparison::isEmpty() const {
    return onlyInOld.empty() && onlyInNew.empty() && general.empty() && groups.empty();
}

Comparison compare(const Snapshot& before, const Snapshot& after) {
    return Comparer(before, after).compare();
}

} // namespace diff
