// Which keys the manager reads in which file, and how it splits their values.
#include "lint/Keys.h"

#include "model/Multiboot.h"
#include "model/Vocabulary.h"

#include <algorithm>

namespace lint {

namespace {

constexpr std::array<std::string_view, 3> BASE_LISTS{"DEVICE_SUPPORTED", "PROGRAM_OPTION_PACKAGE",
                                                     "NOT_SUPPORTED_PART_IN_MODE"};

template <typename Names>
bool holds(const Names& names, std::string_view name) {
    return std::find(names.begin(), names.end(), name) != names.end();
}

template <typename Names>
void add(std::vector<std::string>& all, const Names& names) {
    for (const auto& name : names) {
        all.emplace_back(name);
    }
}

std::string upperCase(std::string text) {
    std::transform(text.begin(), text.end(), text.begin(), [](char letter) {
        return letter >= 'a' && letter <= 'z' ? static_cast<char>(letter - 'a' + 'A') : letter;
    });
    return text;
}

} // namespace

bool isClass(std::string_view name) { return holds(CLASSES, name); }

Shape shapeInSection(std::string_view key) { return holds(FAMILY_KEYS, key) ? Shape::RECORDS : Shape::NONE; }

Shape shapeOf(Family::Kind kind, std::string_view key) {
    if (holds(FAMILY_KEYS, key)) {
        return Shape::RECORDS;
    }
    if (kind == Family::Kind::BASE) {
        if (holds(BASE_LISTS, key)) {
            return Shape::LIST;
        }
        return key == "IDCODE" || holds(vocabulary::modes(), key) ? Shape::RECORDS : Shape::NONE;
    }
    if (kind == Family::Kind::SPI) {
        if (key == "DEVICE_FAMILY" || key.ends_with(DEVICES_ENDING) || holds(multiboot::keys(), key)) {
            return Shape::LIST;
        }
        return key.ends_with(PROPERTY_ENDING) ? Shape::RECORDS : Shape::NONE;
    }
    return Shape::NONE;
}

std::vector<std::string> knownKeys(const Model& model, Family::Kind kind) {
    std::vector<std::string> all;
    add(all, FAMILY_KEYS);
    if (kind == Family::Kind::BASE) {
        add(all, BASE_LISTS);
        add(all, vocabulary::modes());
        all.emplace_back("IDCODE");
    } else if (kind == Family::Kind::SPI) {
        all.emplace_back("DEVICE_FAMILY");
        add(all, multiboot::keys());
        for (const std::string_view name : CLASSES) {
            all.push_back(std::string(name).append(DEVICES_ENDING));
            all.push_back(std::string(name).append(PROPERTY_ENDING));
        }
        for (const FlashList& family : model.flashFamilies()) {
            all.push_back(std::string(family.family.text).append(DEVICES_ENDING));
        }
        for (const std::string& name : model.flashNames()) {
            all.push_back(upperCase(name).append(PROPERTY_ENDING));
        }
    }
    return all;
}

} // namespace lint
