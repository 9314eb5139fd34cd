// The demonstration that the tool carries.
#include "tool/ToolProcess.h"

#include <gmock/gmock.h>
#include <nlohmann/json.hpp>

#include <filesystem>
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

// The origins tell: every file must be there, with every line where it stood.
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
        std::istringstream lines(runTool({"show", device["name"]}).output);
        for (std::string line; std::getline(lines, line);) {
            EXPECT_LE(line.size(), 80U) << line;
        }
    }
}

/// The commands of the help's examples.
std::vector<std::string> examples(const std::string& command) {
    std::vector<std::string> found;
    std::istringstream lines(runTool({command, "--help"}).output);
    for (std::string line; std::getline(lines, line);) {
        if (line.find("tarvik " + command) != std::string::npos && line.starts_with("  ")) {
            found.push_back(line);
        }
    }
    return found;
}

TEST(Demonstration, ExamplesOfTheHelpAreAnsweredYes) {
    const std::filesystem::path folder = std::filesystem::path(TARVIK_TOOL).parent_path();
    for (const std::string command :
         {"devices", "families", "vocabulary", "show", "operations", "options", "bsdl", "operation-options",
          "check", "property", "spi", "multiboot", "dump", "batch"}) {
        const std::vector<std::string> lines = examples(command);
        EXPECT_FALSE(lines.empty()) << command;
        for (const std::string& line : lines) {
            const std::string shell = "unset TARVIK_DATABASE; PATH=" + folder.string() + ":$PATH; (" + line +
                                      ") 2>/dev/null | grep -q .";
            EXPECT_EQ(std::system(shell.c_str()), 0) << line;
            const std::string status =
                "unset TARVIK_DATABASE; PATH=" + folder.string() + ":$PATH;" + line + " >/dev/null 2>&1";
            EXPECT_EQ(std::system(status.c_str()), 0) << line;
        }
    }
}

} // namespace
