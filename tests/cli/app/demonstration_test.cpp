// The demonstration that the tool carries.
#include "cli/support/ToolProcess.h"

#include <gmock/gmock.h>
#include <nlohmann/json.hpp>

#include <sstream>

namespace {

using nlohmann::json;

const std::string DATABASE = TARVIK_SOURCE_DIRECTORY "/database";

json asked(std::vector<std::string> arguments, const std::string& database) {
    arguments.emplace_back("--json");
    if (!database.empty()) {
        arguments.insert(arguments.begin(), {"--database", database});
    }
    return json::parse(runTool(arguments).output);
}

// The origins show that every file is there, with each line at its place.
TEST(Demonstration, IsTheDatabaseFolder) {
    const json devices = asked({"devices"}, "");
    EXPECT_GT(devices["devices"].size(), 50U);
    EXPECT_EQ(devices, asked({"devices"}, DATABASE));
    EXPECT_EQ(asked({"families"}, ""), asked({"families"}, DATABASE));
    EXPECT_EQ(asked({"dump", "multiboot"}, ""), asked({"dump", "multiboot"}, DATABASE));
    std::string family;
    for (const json& device : devices["devices"]) {
        if (device["family"] == family) {
            continue;
        }
        family = device["family"];
        json carried = asked({"show", device["name"]}, "");
        for (json& property : carried["properties"]) {
            property["file"] = DATABASE + "/" + property["file"].get<std::string>();
        }
        for (json& package : carried["packages"]) {
            for (json& exclusion : package["excluded"]) {
                exclusion["file"] = DATABASE + "/base.acd";
            }
        }
        carried["idcode"]["file"] = DATABASE + "/base.acd";
        EXPECT_EQ(carried, asked({"show", device["name"]}, DATABASE));
    }
}

TEST(Demonstration, IsReadWithoutComplaint) {
    for (const char* const command : {"devices", "families", "spi"}) {
        EXPECT_EQ(runTool({command}).error,
                  "tarvik: no database given: answering from the built-in demonstration\n");
    }
}

TEST(Demonstration, SheetsFit80Columns) {
    const json answer = asked({"devices"}, "");
    for (const json& device : answer["devices"]) {
        std::istringstream lines(runTool({{"show", device["name"]}, {}, {{"COLUMNS", "80"}}, {}, 0}).output);
        for (std::string line; std::getline(lines, line);) {
            EXPECT_LE(line.size(), 80U) << line;
        }
    }
}

} // namespace
