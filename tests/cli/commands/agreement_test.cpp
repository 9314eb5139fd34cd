// The commands answer as the manager does: every answer is compared with that of a process of its own, which asks the
// manager just this question.
#include "cli/support/DatabaseDirectory.h"
#include "cli/support/ToolProcess.h"

#include "reference/DatabaseGenerator.h"
#include "reference/RandomSource.h"
#include "support/Sanitizers.h"

#include <gtest/gtest.h>
#include <nlohmann/json.hpp>

#include <algorithm>
#include <set>

namespace {

using nlohmann::json;
using reference::RandomSource;
using Words = std::vector<std::string>;

const Words MODES{"BS", "SS", "SM", "BSFILE", "DP770", "SPI", "KITECF", "KITEMPM", "PFF"};
const Words TABLE_MODES{"BS", "SS", "SM", "BSFILE", "DP770", "SPI"};
const Words OUTPUTS{"PARALLEL", "ZORVA", "USB2", "SVF", "STAPL"};
const Words OPERATIONS{"PROGRAM", "VERIFY", "ERASE", "READBACKTOFILE", "BYPASS", "CHECKSUM"};
const Words PROPERTIES{"VENDOR", "PINS", "FLASH", "PROGRAM", "VERIFY", "PACKAGES", "OP_PROGRAM", "NOSUCH"};
const Words PACKAGES{"TQ144", "PQ208", "SO8", "NONE"};

/// One database, asked through the commands and through fresh processes.
class Comparison {
public:
    explicit Comparison(const DatabaseDirectory::Files& files) : m_directory(files) {}

    [[nodiscard]] json command(Words words) const {
        words.insert(words.begin(), {"--database", m_directory.path(), "--literal", "--json"});
        return json::parse(runTool(words).output);
    }

    /// The answers of a process that asks nothing else.
    [[nodiscard]] std::vector<json> results(const std::vector<json>& calls) const {
        ProcessOptions start{{"--database", m_directory.path(), "batch"}, {}, {}, {}};
        start.input = R"({"call": "setExceptions", "args": [false]})"
                      "\n";
        for (const json& call : calls) {
            start.input += call.dump() + '\n';
        }
        const std::string output = runTool(start).output;
        std::vector<json> all;
        for (std::size_t position = output.find('\n') + 1; position < output.size();) {
            const std::size_t end = output.find('\n', position);
            all.push_back(json::parse(output.substr(position, end - position)).at("result"));
            position = end + 1;
        }
        return all;
    }

    [[nodiscard]] json result(const char* call, const json& arguments) const {
        return results({{{"call", call}, {"args", arguments}}}).front();
    }

    /// The names of all devices whose bytes are UTF-8.
    [[nodiscard]] Words devices() const {
        Words names;
        const json answer = command({"devices"});
        for (const json& device : answer.value("devices", json::array())) {
            if (const std::string name = device.at("name"); name.find("\uFFFD") == std::string::npos) {
                names.push_back(name);
            }
        }
        return names;
    }

    void compareMasks(RandomSource& pick, const std::string& device) const {
        const std::string& mode = pick.from(MODES);
        const std::string& output = pick.from(OUTPUTS);
        const std::string& package = pick.from(PACKAGES);
        const Words place{device, "--mode", mode, "--output", output};
        const auto ask = [&](const char* name, const Words& more = {}) {
            Words words{name};
            words.insert(words.end(), place.begin(), place.end());
            words.insert(words.end(), more.begin(), more.end());
            return command(words);
        };
        expectMask(ask("operations"), "getDeviceOperations",
                   {{"device", device}, {"mode", mode}, {"output", output}});
        expectMask(ask("options"), "getProgramOptions",
                   {{"device", device}, {"mode", mode}, {"output", output}, {"package", nullptr}});
        expectMask(ask("options", {"--package", package}), "getProgramOptions",
                   {{"device", device}, {"mode", mode}, {"output", output}, {"package", package}});
        expectMask(command({"bsdl", device, "--output", output}), "getBsdlOperations",
                   {{"device", device}, {"output", output}});
    }

    void compareChecks(RandomSource& pick, const std::string& device) const {
        const std::string& mode = pick.from(MODES);
        const std::string& output = pick.from(OUTPUTS);
        const std::string& package = pick.from(PACKAGES);
        expectAllowed({"check", "--mode", mode, "--output", output}, {{"mode", mode}, {"output", output}});
        expectAllowed({"check", device, "--mode", mode, "--package", package},
                      {{"mode", mode}, {"device", device}, {"package", package}});
        expectAllowed({"check", device, "--mode", mode, "--output", output, "--package", package},
                      {{"mode", mode}, {"output", output}, {"device", device}, {"package", package}});
    }

    void compareProperties(RandomSource& pick, const std::string& device) const {
        const std::string& key = pick.from(PROPERTIES);
        const json arguments{{"device", device}, {"key", key}};
        const std::vector<json> found =
            results({{{"call", "getDeviceStringProperty"}, {"args", arguments}},
                     {{"call", "isSpiDevice"}, {"args", {device}}},
                     {{"call", "getDeviceStringProperties"}, {"args", arguments}}});
        json values = found[1].get<bool>() ? json::array() : found[2];
        const bool hasNone = found[0].is_null() || (found[1].get<bool>() && found[0] == "");
        if (hasNone) {
            values = json::array();
        } else if (values.empty()) {
            values = json::array({found[0]});
        }
        const json answer = command({"property", device, key});
        if (!answer.contains("error")) {
            EXPECT_EQ(answer.at("values"), values) << device << ' ' << key;
            ++m_compared;
        }
        const std::string& operation = pick.from(OPERATIONS);
        const std::string& mode = pick.from(MODES);
        const json options = command({"operation-options", device, operation, "--mode", mode});
        if (!options.contains("error")) {
            EXPECT_EQ(options.at("options"),
                      result("getDeviceOperationOptions",
                             {{"device", device}, {"operation", operation}, {"mode", mode}}))
                << device << ' ' << operation << ' ' << mode;
            ++m_compared;
        }
    }

    /// The table of operations that `show` and the report have, cell by cell.
    void compareTable(const std::string& device) const {
        const json answer = command({"show", device});
        if (answer.contains("error")) {
            return;
        }
        for (const std::string& mode : TABLE_MODES) {
            for (const std::string& output : OUTPUTS) {
                std::set<std::string> shown;
                for (const auto& [operation, modes] : answer.at("operations").items()) {
                    const json outputs = modes.value(mode, json::array());
                    if (std::find(outputs.begin(), outputs.end(), output) != outputs.end()) {
                        shown.insert(operation);
                    }
                }
                const json listed = command({"operations", device, "--mode", mode, "--output", output});
                expectMask(listed, "getDeviceOperations",
                           {{"device", device}, {"mode", mode}, {"output", output}});
                EXPECT_EQ(json(shown), sorted(listed.at("operations")))
                    << device << ' ' << mode << ' ' << output;
            }
        }
    }

    /// The devices that `which` lists are those whose masks have the operation, and no others.
    void compareWhich(RandomSource& pick, const Words& devices) const {
        const std::string& mode = pick.from(TABLE_MODES);
        const std::string& output = pick.from(OUTPUTS);
        const std::string& operation = pick.from(OPERATIONS);
        const json answer = command({"which", "--operation", operation, "--mode", mode, "--output", output});
        std::set<std::string> listed;
        for (const json& device : answer.at("devices")) {
            listed.insert(device.at("name").get<std::string>());
        }
        const int bit = result("operationString2Type", {operation}).get<int>();
        for (const std::string& device : devices) {
            const auto mask =
                result("getDeviceOperations", {{"device", device}, {"mode", mode}, {"output", output}})
                    .get<int>();
            EXPECT_EQ(listed.count(device) != 0, ((static_cast<unsigned>(mask) >> bit) & 1U) != 0)
                << device << ' ' << operation << ' ' << mode << ' ' << output;
            ++m_compared;
        }
    }

    [[nodiscard]] int compared() const noexcept { return m_compared; }

private:
    static json sorted(json list) {
        std::sort(list.begin(), list.end());
        return list;
    }

    void expectMask(const json& answer, const char* call, const json& arguments) const {
        if (!answer.contains("error")) {
            EXPECT_EQ(answer.at("mask"), result(call, arguments)) << call << ' ' << arguments;
            ++m_compared;
        }
    }

    void expectAllowed(const Words& words, const json& arguments) const {
        const json answer = command(words);
        if (!answer.contains("error")) {
            EXPECT_EQ(answer.at("allowed"), result("checkConstraints", arguments)) << arguments;
            ++m_compared;
        }
    }

    DatabaseDirectory m_directory;
    mutable int m_compared = 0; ///< answers
};

TEST(CommandAgreement, OverRandomDatabases) {
    const std::uint64_t databases = isSanitized() ? 3 : 12;
    int compared = 0;
    for (std::uint64_t number = 0; number < databases && !HasFailure(); ++number) {
        RandomSource pick(rc::Random(9000 + number));
        const Comparison comparison(reference::makeDatabases(pick, reference::Health::SOUND));
        const Words devices = comparison.devices();
        if (devices.empty()) {
            continue;
        }
        for (int question = 0; question < 6; ++question) {
            const std::string& device = pick.from(devices);
            comparison.compareMasks(pick, device);
            comparison.compareChecks(pick, device);
            comparison.compareProperties(pick, device);
        }
        comparison.compareTable(pick.from(devices));
        comparison.compareWhich(pick, devices);
        compared += comparison.compared();
    }
    EXPECT_GT(compared, static_cast<int>(databases) * 40)
        << "the databases have devices, and the questions answers";
}

} // namespace
