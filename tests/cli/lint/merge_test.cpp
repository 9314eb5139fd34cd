// The linter merges layers itself, since it reads two mistakes as they were meant. Without these it must see exactly the
// values that the readers give, each text where they locate it.
#include "cli/diff/DatabaseRewriter.h"
#include "cli/support/DatabaseDirectory.h"
#include "cli/support/OpenDatabase.h"
#include "reference/DatabaseGenerator.h"

#include "lint/Model.h"

#include <AcdStore.h>
#include <AcdText.h>

#include <gtest/gtest.h>

#include <algorithm>
#include <deque>

namespace {

std::string joined(const lint::Value& value) {
    std::string text;
    for (const lint::Item& item : value.items) {
        text.append(&item == &value.items.front() ? "" : ":").append(item.whole.text);
    }
    return text;
}

/// Is a section of base.acd or spi.acd found before the device? The linter reports it and reads the device.
bool isHidden(const lint::Model& model, std::string_view name) {
    const auto has = [name](const lint::FamilyData* family) {
        return family != nullptr && std::any_of(family->devices.begin(), family->devices.end(),
                                                [name](const lint::Section& section) {
                                                    return AcdText::equalsIgnoreCase(section.name.text, name);
                                                });
    };
    return model.isFamilyInAnyCase(std::string(name)) || has(model.base()) || has(model.spi());
}

/// Compares one value with that of the readers.
/// @return whether it could be compared: the linter adds what a mistake lost
bool compare(const std::string& name, std::string_view key, const lint::Value& value) {
    if (value.shape == schema::Shape::NONE || !value.joinedAppends.empty() || !value.hidings.empty()) {
        return false;
    }
    const auto read = AcdStore::value(name.c_str(), std::string(key).c_str());
    if (!read) {
        ADD_FAILURE() << "the readers have no " << key << " of " << name;
        return false;
    }
    EXPECT_EQ(joined(value), read->text) << name << ' ' << key;
    for (const lint::Item& item : value.items) {
        for (const lint::Token& field : item.fields) {
            const auto offset =
                static_cast<std::size_t>(field.text.data() - value.items.front().whole.text.data());
            const AcdStore::SourceSpan place = read->at(offset);
            EXPECT_EQ(field.location.file->path(), place.file) << name << ' ' << key;
            EXPECT_EQ(field.location.line, place.line) << name << ' ' << key << ": " << field.text;
            EXPECT_EQ(field.location.column, place.column) << name << ' ' << key << ": " << field.text;
        }
    }
    return true;
}

} // namespace

TEST(LintModel, HasTheValuesThatTheReadersGive) {
    reference::RandomSource pick(rc::Random(7));
    std::size_t compared = 0;
    for (int round = 0; round < 60; ++round) {
        std::deque<DatabaseDirectory> layers;
        std::vector<std::string> paths;
        for (const reference::Files& files :
             rewritten(pick, reference::makeDatabases(pick, reference::Health::SOUND))) {
            paths.push_back(layers.emplace_back(files).path());
        }
        const OpenDatabase open(paths);
        const lint::Model model(AcdLines::ofDatabase());
        for (const auto& family : model.families()) {
            for (const auto& [key, value] : family->own.values) {
                compared += compare(family->name, key, value) ? 1U : 0U;
            }
        }
        for (const lint::Device& device : model.devices()) {
            const std::string_view name = device.section->name.text;
            for (const auto& [key, value] : device.section->values) {
                if (!isHidden(model, name)) {
                    compared += compare(std::string(name), key, value) ? 1U : 0U;
                }
            }
        }
        if (testing::Test::HasFailure()) {
            return; // one database is enough to see
        }
    }
    EXPECT_GT(compared, 1000U);
}
