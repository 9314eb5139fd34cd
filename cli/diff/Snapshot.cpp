// A snapshot is a series of blocks: the general answers; then for each device its name, its family, whether it is
// one, the device with which it shares answers, those answers if it is the first one, and its other answers.
#include "diff/Snapshot.h"

#include "term/ExitCode.h"

#include <charconv>
#include <utility>

namespace diff {

void putBlock(std::string& text, std::string_view block) {
    text.append(std::to_string(block.size()) + ':').append(block);
}

std::string_view takeBlock(std::string_view& rest) {
    std::size_t size = 0;
    const auto [end, fault] = std::from_chars(rest.data(), rest.data() + rest.size(), size);
    const auto start = static_cast<std::size_t>(end - rest.data()) + 1;
    if (fault != std::errc() || start > rest.size() || size > rest.size() - start) {
        throw CommandError(ExitCode::FAULT, "the answers of a database can't be read");
    }
    const std::string_view block = rest.substr(start, size);
    rest.remove_prefix(start + size);
    return block;
}

namespace {

/// The answers after families and devices got other names.
Answers renamedAnswers(const Answers& answers, const Renaming& renamed) {
    const auto contains = [](const std::string& topic) {
        return topic == FAMILY || topic == FAMILIES || topic == FLASH_FAMILIES;
    };
    Answers result;
    for (const auto& [question, texts] : answers) {
        StringSet& changed = result[question];
        for (std::string text : texts) {
            if (const auto found = renamed.find(text); contains(question.topic) && found != renamed.end()) {
                text = found->second;
            }
            changed.insert(std::move(text));
        }
    }
    return result;
}

} // namespace

void Snapshot::rename(const Renaming& renamed) {
    if (renamed.empty()) {
        return;
    }
    m_general = renamedAnswers(m_general, renamed);
    const auto newName = [this, &renamed](std::string_view name) -> std::string_view {
        const auto found = renamed.find(name);
        return found == renamed.end() ? name : m_renamedTexts.emplace_back(found->second);
    };
    std::map<std::string_view, Device, NaturalLess> devices;
    for (auto& [name, device] : m_devices) {
        const bool isConcerned = renamed.contains(name) || renamed.contains(device.family);
        if (isConcerned) {
            device.own =
                m_renamedTexts.emplace_back(serialized(renamedAnswers(deserialized(device.own), renamed)));
        }
        device.family = newName(device.family);
        devices.emplace(newName(name), device);
    }
    m_devices = std::move(devices);
}

Snapshot::Snapshot(std::string text) : m_text(std::move(text)) {
    std::string_view rest = m_text;
    m_general = deserialized(takeBlock(rest));
    while (!rest.empty()) {
        const std::string_view name = takeBlock(rest);
        const std::string_view family = takeBlock(rest);
        const bool isFamily = !takeBlock(rest).empty();
        const std::string_view first = takeBlock(rest);
        const std::string_view shared = takeBlock(rest);
        if (first == name) {
            m_shared.emplace(name, deserialized(shared));
        }
        m_devices.emplace(name, Device{family, isFamily, &m_shared.at(first), takeBlock(rest)});
    }
}

} // namespace diff
