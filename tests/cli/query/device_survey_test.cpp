// The survey asks for all devices; each answer is that of a manager that was asked about this device alone.
#include "cli/support/OpenDatabase.h"
#include "model/Vocabulary.h"
#include "query/DeviceSurvey.h"

#include "reference/DatabaseGenerator.h"
#include "reference/Words.h"
#include "support/Sanitizers.h"

#include <TarvikException.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace {

using reference::Health;
using reference::RandomSource;
using TARVIKNS::MODE_TYPE;
using TARVIKNS::OUTPUT_TYPE;
using testing::ElementsAre;
using testing::Pair;
using testing::UnorderedElementsAre;
using Topics = DeviceSurvey::Topics;

std::vector<DeviceDetails> survey(const Topics& topics) {
    std::vector<DeviceDetails> all;
    DeviceSurvey(topics).run([&all](const DeviceDetails& details) { all.push_back(details); });
    return all;
}

/// The answer of a fresh manager to one question; nothing if it raises.
template <typename Ask>
auto fresh(Ask ask) -> std::optional<decltype(ask(*freshManager()))> {
    try {
        return ask(*freshManager());
    } catch (const TarvikException&) {
        return std::nullopt;
    }
}

/// The mask that a column of a table stands for.
/// @param outputsOf gives the outputs of a row
template <typename OutputsOf>
int maskOf(const DeviceTable& table, const std::vector<std::string>& keys, std::size_t output,
           OutputsOf outputsOf) {
    unsigned mask = 0;
    for (const DeviceTable::Row& row : table.rows) {
        const auto value = std::find(keys.begin(), keys.end(), row.key) - keys.begin();
        mask |= (outputsOf(row) >> output & 1U) << static_cast<unsigned>(value);
    }
    return static_cast<int>(mask);
}

/// Compares a table with a fresh manager's answer for each cell.
/// @param ask asks for the mask of a mode and an output
template <typename Ask>
void expectCells(const DeviceTable& table, const std::vector<std::string>& keys, Ask ask) {
    for (std::size_t mode = 0; mode < DeviceTable::MODES; ++mode) {
        for (std::size_t output = 0; output < DeviceTable::OUTPUTS; ++output) {
            const std::optional<int> expected = fresh([&](ConstraintsManager& manager) {
                return ask(manager, static_cast<MODE_TYPE>(mode), static_cast<OUTPUT_TYPE>(output));
            });
            if (!expected) {
                EXPECT_NE(table.fault, "") << "in mode " << mode << " through " << output;
                continue;
            }
            EXPECT_EQ(maskOf(table, keys, output,
                             [mode](const DeviceTable::Row& row) { return row.outputs.at(mode); }),
                      *expected)
                << "in mode " << mode << " through " << output << ' ' << table.fault;
        }
    }
}

void expectFreshTables(const DeviceDetails& details) {
    const char* const device = details.name.c_str();
    expectCells(*details.operations, vocabulary::operations(),
                [device](ConstraintsManager& manager, MODE_TYPE mode, OUTPUT_TYPE output) {
                    return manager.getDeviceOperations(device, mode, output);
                });
    for (std::size_t output = 0; output < DeviceTable::OUTPUTS; ++output) {
        const std::optional<int> expected = fresh([&](ConstraintsManager& manager) {
            return manager.getBsdlOperations(device, static_cast<OUTPUT_TYPE>(output));
        });
        if (expected) {
            EXPECT_EQ(maskOf(*details.operations, vocabulary::operations(), output,
                             [](const DeviceTable::Row& row) { return row.bsdl; }),
                      *expected);
        }
    }
    const auto expectOptions = [device](const DeviceTable& table, const char* package) {
        expectCells(table, vocabulary::options(),
                    [=](ConstraintsManager& manager, MODE_TYPE mode, OUTPUT_TYPE output) {
                        return manager.getProgramOptions(device, mode, output, package);
                    });
    };
    expectOptions(*details.options, nullptr);
    for (const auto& [package, changes] : details.packages) {
        SCOPED_TRACE("package " + package);
        expectOptions(changes.options ? *changes.options : *details.options, package.c_str());
    }
}

/// The keys of the modes that allow the device through some output.
std::vector<std::string> freshModes(const std::string& device, const char* package) {
    std::vector<std::string> allowed;
    for (std::size_t mode = 0; mode < vocabulary::modes().size(); ++mode) {
        for (int output = 0; output <= static_cast<int>(OUTPUT_TYPE::NONE); ++output) {
            if (freshManager()->checkConstraints(static_cast<MODE_TYPE>(mode),
                                                 static_cast<OUTPUT_TYPE>(output), device.c_str(), package)) {
                allowed.push_back(vocabulary::modes()[mode]);
                break;
            }
        }
    }
    return allowed;
}

void expectFreshFacts(const DeviceDetails& details) {
    const char* const device = details.name.c_str();
    EXPECT_EQ(details.family, toStdString(freshManager()->getPartFamily(device)));
    EXPECT_EQ(details.modes, freshModes(details.name, nullptr));
    for (const auto& [package, changes] : details.packages) {
        EXPECT_EQ(changes.modes, freshModes(details.name, package.c_str())) << package;
    }
    for (const std::string& key : reference::words::PROPERTIES) {
        const auto expected = fresh([&](ConstraintsManager& manager) {
            std::vector<std::string> values;
            for (const StringBase& value : manager.getDeviceStringProperties(device, key.c_str())) {
                values.push_back(toStdString(value));
            }
            return values;
        });
        if (!expected) {
            EXPECT_NE(details.fault, "") << key;
            continue;
        }
        std::vector<std::string> values;
        for (const Property& property : details.properties) {
            if (property.key == key) {
                values = property.values;
            }
        }
        EXPECT_EQ(values, *expected) << key << ' ' << details.fault;
    }
}

/// @param step 1 compares all devices, 2 every second one
/// @return the number of devices
std::size_t expectFreshAnswers(bool withFamilies, std::size_t step = 1) {
    const std::vector<DeviceDetails> all = survey({.operations = true,
                                                   .options = true,
                                                   .packages = true,
                                                   .facts = true,
                                                   .question = {},
                                                   .families = withFamilies});
    for (std::size_t position = 0; position < all.size(); position += step) {
        SCOPED_TRACE(all[position].name);
        expectFreshTables(all[position]);
        expectFreshFacts(all[position]);
    }
    return all.size();
}

TEST(DeviceSurvey, OverTheDemonstration) {
    const OpenDatabase database(std::vector<std::string>{TARVIK_SOURCE_DIRECTORY "/database"});
    EXPECT_GT(expectFreshAnswers(true, isSanitized() ? 23 : 7), 150U);
}

void expectFreshAnswersOverRandomDatabases(Health health, std::uint64_t seed) {
    for (std::uint64_t number = 0; number < 40 && !testing::Test::HasFailure(); ++number) {
        SCOPED_TRACE(number);
        RandomSource pick(rc::Random(seed + number));
        const reference::Files files = reference::makeDatabases(pick, health);
        std::string text;
        for (const auto& [name, content] : files) {
            text += "--- " + name + '\n' + content;
        }
        SCOPED_TRACE(text);
        const OpenDatabase database(files);
        // Each fresh answer starts a manager, which takes long under the sanitizers.
        expectFreshAnswers(number % 2 == 0, isSanitized() ? 9 : 1);
    }
}

TEST(DeviceSurvey, OverSoundDatabases) { expectFreshAnswersOverRandomDatabases(Health::SOUND, 100); }

TEST(DeviceSurvey, OverDamagedDatabases) { expectFreshAnswersOverRandomDatabases(Health::DAMAGED, 900); }

/// The values of a device's properties by key.
std::map<std::string, std::vector<std::string>> valuesOf(const std::vector<DeviceDetails>& all,
                                                         const std::string& device) {
    std::map<std::string, std::vector<std::string>> values;
    for (const DeviceDetails& details : all) {
        for (const Property& property : details.properties) {
            if (details.name == device) {
                values[property.key] = property.values;
            }
        }
    }
    return values;
}

TEST(DeviceSurvey, ListsPropertiesThatAnotherOwnersKeyGives) {
    const OpenDatabase database(std::map<std::string, std::string>{
        {"base.acd", "DEVICE_SUPPORTED = zor_x\n"},
        {"kes.acd", "PROPERTY = x_PINS,7:PINS,5\n[kes_x]\nPROPERTY = A,1\n"},
        {"zor_x.acd", "PROPERTY = B,2\n[zor]\nPROPERTY = x_PINS,3\n"}});
    const std::vector<DeviceDetails> all = survey({.facts = true});
    EXPECT_THAT(valuesOf(all, "kes_x"),
                UnorderedElementsAre(Pair("A", ElementsAre("1")), Pair("x_A", ElementsAre("1")),
                                     Pair("PINS", ElementsAre("7")), Pair("x_PINS", ElementsAre("7"))))
        << "the key of kes and x_PINS is that of kes_x and PINS";
    EXPECT_THAT(valuesOf(all, "zor"),
                UnorderedElementsAre(Pair("B", ElementsAre("2")), Pair("PINS", ElementsAre("3")),
                                     Pair("x_B", ElementsAre("2")), Pair("x_PINS", ElementsAre("3"))));
    for (const DeviceDetails& details : all) {
        expectFreshFacts(details);
    }
}

/// A question about the device's properties.
bool hasA1(ConstraintsManager& manager, const std::string& device) {
    return manager.getDeviceStringProperties(device.c_str(), "A").count(StringBase("1")) != 0;
}

TEST(DeviceSurvey, AnswersAQuestionAsAFreshManagerDoes) {
    for (std::uint64_t number = 0; number < 40; ++number) {
        RandomSource pick(rc::Random(5000 + number));
        const OpenDatabase database(reference::makeDatabases(pick, Health::DAMAGED));
        const std::string key = pick.from(reference::words::PROPERTIES);
        const std::string value = pick.from(reference::words::VALUES);
        const auto ask = [&](ConstraintsManager& manager, const std::string& device) {
            return manager.getDeviceStringProperties(device.c_str(), key.c_str())
                       .count(StringBase(value.c_str())) != 0;
        };
        for (const DeviceDetails& details : survey({.question = ask})) {
            const std::optional<bool> expected =
                fresh([&](ConstraintsManager& manager) { return ask(manager, details.name); });
            EXPECT_EQ(details.fault.empty(), expected.has_value()) << number << ' ' << details.name;
            EXPECT_EQ(details.answer, expected.value_or(false)) << number << ' ' << details.name;
        }
    }
}

TEST(DeviceSurvey, DevicesThatReadTheSameTableShareIt) {
    const OpenDatabase database(
        std::map<std::string, std::string>{{"base.acd", "DEVICE_SUPPORTED = D3,fam\n"},
                                           {"fam.acd", "OPERATION = PROGRAM,Bscan,USB2\n[D1]\n[D2]\n[D3]\n"
                                                       "OPERATION = ERASE,Bscan,USB2\n[D4]\n"}});
    const std::vector<DeviceDetails> all = survey({.operations = true});
    ASSERT_EQ(all.size(), 4U);
    EXPECT_EQ(all[0].operations, all[1].operations);
    EXPECT_EQ(all[0].operations, all[3].operations);
    EXPECT_NE(all[0].operations, all[2].operations);
    EXPECT_EQ(all[2].operations->rows.at(0).key, "ERASE");
}

TEST(DeviceSurvey, AnUnknownOptionIsAFaultForEachDeviceThatReadsIt) {
    const OpenDatabase database(std::map<std::string, std::string>{
        {"base.acd", "DEVICE_SUPPORTED = fam\n"},
        {"fam.acd", "PROPERTY = A,1\n[D1]\n[D2]\nPROGRAM_OPTION = OTP,Bscan,USB2\n[D3]\n"}});
    const std::vector<DeviceDetails> all = survey({.question = hasA1});
    ASSERT_EQ(all.size(), 3U);
    EXPECT_TRUE(all[0].answer);
    EXPECT_NE(all[1].fault, "");
    EXPECT_TRUE(all[2].answer);
}

TEST(DeviceSurvey, AFaultOfAFamilyIsMetOnce) {
    const OpenDatabase database(std::map<std::string, std::string>{
        {"base.acd", "DEVICE_SUPPORTED = fam\n"},
        {"fam.acd", "PROPERTY = A,1\nPROGRAM_OPTION = OTP,Bscan,USB2\n[D1]\n[D2]\n[D3]\nPROGRAM_OPTION = "
                    "VERIFY,Bscan,USB2\n[D4]\n"}});
    int asked = 0;
    const std::vector<DeviceDetails> all =
        survey({.question = [&asked](ConstraintsManager& manager, const std::string& device) {
            ++asked;
            return hasA1(manager, device);
        }});
    ASSERT_EQ(all.size(), 4U);
    EXPECT_EQ(asked, 2);
    EXPECT_NE(all[0].fault, "");
    EXPECT_NE(all[1].fault, "");
    EXPECT_EQ(all[2].fault, "") << "its own options are sound, and fill the table of the family";
    EXPECT_NE(all[3].fault, "");
}

} // namespace
