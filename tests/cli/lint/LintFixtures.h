#pragma once

#include "cli/support/DatabaseDirectory.h"
#include "cli/support/ToolProcess.h"

#include <nlohmann/json.hpp>

#include <map>
#include <string>
#include <vector>

using Files = std::map<std::string, std::string>;

/// The smallest database that is clean, for a test to spoil.
inline Files cleanDatabase() {
    return {{"base.acd", "DEVICE_SUPPORTED       = base,kestrel\n"
                         "PROGRAM_OPTION_PACKAGE = base,kestrel\n"
                         "IDCODE                 = KS50,0xX4104FB7\n"},
            {"kestrel.acd", "[KS50]\n"}};
}

/// The clean database with another text in the family's file.
inline Files withFamily(const std::string& text) {
    Files files = cleanDatabase();
    files["kestrel.acd"] = text;
    return files;
}

/// Runs the linter with just these arguments.
inline ProcessResult runLint(std::vector<std::string> arguments) {
    arguments.insert(arguments.begin(), "lint");
    return runTool({std::move(arguments), {}, {}, {}});
}

/// What the linter says of these files, with further arguments.
inline ProcessResult lint(const Files& files, std::vector<std::string> arguments = {}) {
    const DatabaseDirectory directory(files);
    arguments.push_back(directory.path());
    return runLint(std::move(arguments));
}

/// The codes of all findings in these files, in order.
inline std::vector<std::string> codes(const Files& files, std::vector<std::string> arguments = {}) {
    arguments.insert(arguments.end(), {"--format", "json"});
    const nlohmann::json report = nlohmann::json::parse(lint(files, std::move(arguments)).output);
    std::vector<std::string> all;
    for (const nlohmann::json& finding : report.at("findings")) {
        all.push_back(finding.at("code").get<std::string>());
    }
    return all;
}
