// Holds the answers of two databases against each other, and tells what devices have in common once.
#include "diff/Comparison.h"

#include "diff/Serialization.h"

#include <fmt/format.h>

#include <algorithm>
#include <iterator>
#include <utility>

namespace diff {

namespace {

Texts without(const Texts& left, const Texts& right) {
    Texts rest;
    std::set_difference(left.begin(), left.end(), right.begin(), right.end(),
                        std::inserter(rest, rest.end()));
    return rest;
}

/// What changed for one question. Names come and go one by one, so that devices that share a part of a change stand
/// together in that part.
std::vector<Change> changesOf(const Question& question, const Texts& before, const Texts& after) {
    std::vector<Change> changes;
    if (before == after) {
        return changes;
    }
    const Texts lost = without(before, after);
    const Texts gained = without(after, before);
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

Question ofPackage(const std::string& package, Question question) {
    question.topic = fmt::format("package {}: {}", package, question.topic);
    return question;
}

/// Compares device by device. Changes are known by number: most devices share theirs.
class Comparer {
public:
    Comparer(const Facts& before, const Facts& after) : m_before(before), m_after(after) {}

    [[nodiscard]] Comparison compare() {
        Comparison comparison{onlyIn(m_before, m_after), onlyIn(m_after, m_before), general(), {}};
        std::map<std::string, Family> families;
        for (const auto& [name, after] : m_after.devices) {
            const auto before = m_before.devices.find(name);
            if (before != m_before.devices.end()) {
                families[after.family].push_back({name, changesOfDevice(before->second, after)});
            }
        }
        for (const auto& [name, family] : families) {
            addGroups(comparison.groups, name, family);
        }
        return comparison;
    }

private:
    using Numbers = std::vector<std::size_t>;
    using Family = std::vector<std::pair<std::string, Numbers>>; ///< devices with their changes

    [[nodiscard]] static Devices onlyIn(const Facts& facts, const Facts& others) {
        Devices devices;
        for (const auto& [name, device] : facts.devices) {
            // What stands for a family without devices is no device itself.
            if (others.devices.count(name) == 0 && name != device.family) {
                devices[device.family].push_back(name);
            }
        }
        return devices;
    }

    [[nodiscard]] std::vector<Change> general() const {
        std::vector<Change> all;
        for (const Question& question : questions({&m_before.general, &m_after.general})) {
            const std::vector<Change> changes =
                diff::changesOf(question, m_before.answer(m_before.general, {}, question),
                                m_after.answer(m_after.general, {}, question));
            all.insert(all.end(), changes.begin(), changes.end());
        }
        return joined(all);
    }

    [[nodiscard]] static std::set<Question> questions(const std::vector<const Answers*>& all) {
        std::set<Question> questions;
        for (const Answers* const answers : all) {
            for (const auto& [question, texts] : *answers) {
                questions.insert(question);
            }
        }
        return questions;
    }

    void add(Numbers& numbers, const Question& question, const Texts& before, const Texts& after) {
        for (Change& change : diff::changesOf(question, before, after)) {
            const auto [known, isNew] = m_numbers.try_emplace(std::move(change), m_changes.size());
            if (isNew) {
                m_changes.push_back(&known->first);
            }
            numbers.push_back(known->second);
        }
    }

    /// What changed in answers that devices have in common.
    const Numbers& sharedChanges(const DeviceFacts& before, const DeviceFacts& after) {
        const auto [known, isNew] = m_shared.try_emplace({before.shared, after.shared});
        if (!isNew) {
            return known->second;
        }
        std::vector<const Answers*> all;
        for (const std::size_t index : before.shared) {
            all.push_back(&m_before.shared[index]);
        }
        for (const std::size_t index : after.shared) {
            all.push_back(&m_after.shared[index]);
        }
        for (const Question& question : questions(all)) {
            add(known->second, question, m_before.answer({}, before.shared, question),
                m_after.answer({}, after.shared, question));
        }
        return known->second;
    }

    [[nodiscard]] Numbers changesOfDevice(const DeviceFacts& before, const DeviceFacts& after) {
        Numbers numbers = sharedChanges(before, after);
        if (!numbers.empty() || before.own != after.own) {
            const Answers oldOwn = unpackedAnswers(before.own);
            const Answers newOwn = unpackedAnswers(after.own);
            const std::set<Question> own = questions({&oldOwn, &newOwn});
            std::erase_if(numbers,
                          [&](std::size_t number) { return own.count(m_changes[number]->question) != 0; });
            for (const Question& question : own) {
                add(numbers, question, m_before.answer(oldOwn, before.shared, question),
                    m_after.answer(newOwn, after.shared, question));
            }
        }
        addPackages(numbers, before, after);
        return numbers;
    }

    void addPackages(Numbers& numbers, const DeviceFacts& before, const DeviceFacts& after) {
        std::set<std::string> packages;
        for (const DeviceFacts* const facts : {&before, &after}) {
            for (const auto& [package, answers] : facts->packages) {
                packages.insert(package);
            }
        }
        const Numbers general = numbers;
        for (const std::string& package : packages) {
            const Answers oldPackage = inPackage(m_before, before, package);
            const Answers newPackage = inPackage(m_after, after, package);
            for (const Question& question : questions({&oldPackage, &newPackage})) {
                const Texts& oldTexts = m_before.answer(oldPackage, before.shared, question);
                const Texts& newTexts = m_after.answer(newPackage, after.shared, question);
                for (const Change& change : diff::changesOf(question, oldTexts, newTexts)) {
                    // What changed for the package just as it did without one is told already.
                    const bool isTold = std::any_of(general.begin(), general.end(), [&](std::size_t number) {
                        return *m_changes[number] == change;
                    });
                    if (!isTold) {
                        // One name at a time, which either was there or is there.
                        add(numbers, ofPackage(package, question), change.lost, change.gained);
                    }
                }
            }
        }
    }

    /// The answers that the package changes, and those that stand for it otherwise.
    [[nodiscard]] static Answers inPackage(const Facts& facts, const DeviceFacts& device,
                                           const std::string& package) {
        Answers answers;
        const auto found = device.packages.find(package);
        if (found != device.packages.end()) {
            if (found->second.options) {
                answers = facts.shared[*found->second.options];
            }
            if (found->second.modes) {
                answers[{MODES}] = *found->second.modes;
            }
        }
        // Those of a device that was asked for apart.
        for (const auto& [question, texts] : unpackedAnswers(device.own)) {
            if (question.topic == MODES || question.topic == OPTIONS) {
                answers.try_emplace(question, texts);
            }
        }
        return answers;
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
                (isIn ? group.devices : group.others).push_back(family[device].first);
            }
        }
        std::stable_sort(added.begin(), added.end(), [](const Group& left, const Group& right) {
            return left.devices.size() > right.devices.size();
        });
        groups.insert(groups.end(), std::make_move_iterator(added.begin()),
                      std::make_move_iterator(added.end()));
    }

    const Facts& m_before;
    const Facts& m_after;
    std::map<Change, std::size_t> m_numbers;
    std::vector<const Change*> m_changes; ///< by number
    std::map<std::pair<Numbers, Numbers>, Numbers> m_shared;
};

} // namespace

bool Comparison::isEmpty() const {
    return onlyInOld.empty() && onlyInNew.empty() && general.empty() && groups.empty();
}

Comparison compare(const Facts& oldFacts, const Facts& newFacts) {
    return Comparer(oldFacts, newFacts).compare();
}

} // namespace diff
