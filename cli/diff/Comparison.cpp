// Holds the answers of two databases against each other, and tells what devices have in common once.
#include "diff/Comparison.h"

#include "Table.h"

#include <fmt/format.h>

#include <algorithm>
#include <iterator>
#include <map>
#include <utility>

namespace diff {

namespace {

Texts without(const Texts& left, const Texts& right) {
    Texts rest;
    std::set_difference(left.begin(), left.end(), right.begin(), right.end(),
                        std::inserter(rest, rest.end()));
    return rest;
}

const Texts& answer(const Answers& answers, const std::string& question) {
    static const Texts none;
    const auto found = answers.find(question);
    return found == answers.end() ? none : found->second;
}

/// What changed, by question.
std::map<std::string, Change> changesOf(const Answers& before, const Answers& after) {
    std::map<std::string, Change> changes;
    for (const Answers* answers : {&before, &after}) {
        for (const auto& [question, texts] : *answers) {
            const Texts& left = answer(before, question);
            const Texts& right = answer(after, question);
            if (left != right) {
                changes[question] = {question, without(left, right), without(right, left)};
            }
        }
    }
    return changes;
}

/// Drops what changed for a package just as it did without one.
void dropRepetitions(std::map<std::string, Change>& changes, const Texts& packages) {
    for (const std::string& package : packages) {
        const std::string prefix = ofPackage(package, "");
        std::erase_if(changes, [&](const auto& entry) {
            const auto& [question, change] = entry;
            if (!question.starts_with(prefix)) {
                return false;
            }
            const auto general = changes.find(question.substr(prefix.size()));
            return general != changes.end() && general->second.lost == change.lost &&
                   general->second.gained == change.gained;
        });
    }
}

std::vector<std::string> keysWithout(const std::map<std::string, std::string>& left,
                                     const std::map<std::string, std::string>& right) {
    std::vector<std::string> keys;
    for (const auto& [key, value] : left) {
        if (!right.contains(key)) {
            keys.push_back(key);
        }
    }
    return keys;
}

/// The changes of one family: devices that share a change stand together.
void addGroups(std::vector<Group>& groups, const std::string& family,
               const std::map<std::string, std::vector<Change>>& changesByDevice) {
    std::map<Change, std::vector<std::string>> devicesByChange;
    for (const auto& [device, changes] : changesByDevice) {
        for (const Change& change : changes) {
            devicesByChange[change].push_back(device);
        }
    }
    std::map<std::vector<std::string>, std::vector<Change>> changesByDevices;
    for (const auto& [change, devices] : devicesByChange) {
        changesByDevices[devices].push_back(change);
    }
    std::vector<Group> added;
    for (const auto& [devices, changes] : changesByDevices) {
        const bool isWhole = devices.size() > 1 && devices.size() == changesByDevice.size();
        added.push_back({family, devices, isWhole, changes});
    }
    std::stable_sort(added.begin(), added.end(), [](const Group& left, const Group& right) {
        return left.devices.size() > right.devices.size();
    });
    groups.insert(groups.end(), added.begin(), added.end());
}

std::string asText(const Change& change, const Terminal& terminal) {
    std::string text = "  " + change.question + ':';
    for (const std::string& lost : change.lost) {
        text += ' ' + terminal.bad('-' + terminal.shown(lost));
    }
    for (const std::string& gained : change.gained) {
        text += ' ' + terminal.good('+' + terminal.shown(gained));
    }
    return text + '\n';
}

std::string heading(const Group& group, const Terminal& terminal) {
    if (group.isWhole) {
        return terminal.heading(fmt::format("{} (all {} devices)", group.family, group.devices.size())) +
               '\n';
    }
    if (group.devices.size() == 1) {
        return terminal.heading(fmt::format("{} ({})", group.devices.front(), group.family)) + '\n';
    }
    return terminal.heading(fmt::format("{} ({} devices)", group.family, group.devices.size())) + '\n' +
           wrapped(group.devices, 4, terminal.width());
}

Json asJson(const Change& change) {
    return {{"question", change.question}, {"lost", change.lost}, {"gained", change.gained}};
}

Json asJson(const std::vector<Change>& changes) {
    Json list = Json::array();
    for (const Change& change : changes) {
        list.push_back(asJson(change));
    }
    return list;
}

} // namespace

bool Comparison::isEmpty() const {
    return onlyInOld.empty() && onlyInNew.empty() && general.empty() && groups.empty();
}

Names commonNames(const Names& oldNames, const Names& newNames) {
    Names common;
    for (const auto& [device, family] : newNames.devices) {
        if (oldNames.devices.contains(device)) {
            common.devices[device] = family;
            Texts& packages = common.packages[device];
            packages = oldNames.packages.at(device);
            packages.insert(newNames.packages.at(device).begin(), newNames.packages.at(device).end());
        }
    }
    return common;
}

Comparison compare(const Names& oldNames, const Names& newNames, const Facts& oldFacts,
                   const Facts& newFacts) {
    Comparison comparison{keysWithout(oldNames.devices, newNames.devices),
                          keysWithout(newNames.devices, oldNames.devices),
                          {},
                          {}};
    for (auto& [question, change] : changesOf(oldFacts.general, newFacts.general)) {
        comparison.general.push_back(change);
    }
    const Names common = commonNames(oldNames, newNames);
    std::map<std::string, std::map<std::string, std::vector<Change>>> byFamily;
    for (const auto& [device, family] : common.devices) {
        std::map<std::string, Change> changes =
            changesOf(oldFacts.ofDevices.at(device), newFacts.ofDevices.at(device));
        dropRepetitions(changes, common.packages.at(device));
        std::vector<Change>& kept = byFamily[family][device];
        for (auto& [question, change] : changes) {
            kept.push_back(std::move(change));
        }
    }
    for (const auto& [family, changes] : byFamily) {
        addGroups(comparison.groups, family, changes);
    }
    return comparison;
}

std::string asText(const Comparison& comparison, const Terminal& terminal) {
    std::string text;
    const auto addNames = [&](const char* title, const std::vector<std::string>& names) {
        if (!names.empty()) {
            text += terminal.heading(title) + '\n' + wrapped(names, 2, terminal.width());
        }
    };
    addNames("only in the old database", comparison.onlyInOld);
    addNames("only in the new database", comparison.onlyInNew);
    if (!comparison.general.empty()) {
        text += terminal.heading("for all devices") + '\n';
    }
    for (const Change& change : comparison.general) {
        text += asText(change, terminal);
    }
    for (const Group& group : comparison.groups) {
        text += heading(group, terminal);
        for (const Change& change : group.changes) {
            text += asText(change, terminal);
        }
    }
    return text;
}

Json asJson(const Comparison& comparison) {
    Json groups = Json::array();
    for (const Group& group : comparison.groups) {
        groups.push_back({{"family", group.family},
                          {"devices", group.devices},
                          {"whole", group.isWhole},
                          {"changes", asJson(group.changes)}});
    }
    return {{"same", comparison.isEmpty()},
            {"onlyInOld", comparison.onlyInOld},
            {"onlyInNew", comparison.onlyInNew},
            {"general", asJson(comparison.general)},
            {"groups", groups}};
}

} // namespace diff
