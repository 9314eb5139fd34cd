// A report says about each device what `show` says: the answers of a manager that was asked nothing before.
#include "PageData.h"
#include "cli/support/DatabaseDirectory.h"
#include "cli/support/ToolProcess.h"

#include "reference/DatabaseGenerator.h"
#include "reference/RandomSource.h"

#include <gtest/gtest.h>

#include <algorithm>

namespace {

using nlohmann::json;
using reference::Health;
using reference::RandomSource;

json sorted(json list) {
    std::sort(list.begin(), list.end());
    return list;
}

/// The sheet that `show` gives, in the form of the page's.
json shown(const json& answer) {
    json sheet;
    for (const char* const key : {"device", "family", "idcode", "modes", "operations", "bsdl", "options"}) {
        sheet[key] = answer.at(key);
    }
    sheet["properties"] = sorted(answer.at("properties"));
    sheet["flashProperties"] = sorted(answer.at("flashProperties"));
    sheet["multiboot"] = json::array();
    for (const json& one : answer.at("multiboot")) {
        sheet["multiboot"].push_back(one.at("type").get<std::string>() + ' ' +
                                     one.at("width").get<std::string>() + ' ' +
                                     one.at("position").get<std::string>());
    }
    sheet["multiboot"] = sorted(sheet["multiboot"]);
    return sheet;
}

/// @return the number of devices compared
std::size_t expectAgreement(const std::vector<std::string>& database) {
    std::vector<std::string> arguments = database;
    arguments.insert(arguments.end(), {"report", "--file", "-"});
    const ProcessResult outcome = runTool(arguments);
    const PageData page(outcome.output);
    bool hasFaults = false;
    for (std::size_t device = 0; device < page.size(); ++device) {
        hasFaults = hasFaults || page.fault(device) != json();
        if (page.name(device).find("\uFFFD") != std::string::npos) {
            continue; // its bytes are no UTF-8, so what the page shows can't be asked for
        }
        arguments = database;
        arguments.insert(arguments.end(), {"--literal", "show", page.name(device), "--json"});
        const json answer = json::parse(runTool(arguments).output);
        if (answer.contains("error")) {
            EXPECT_EQ(page.fault(device), answer.at("error")) << page.name(device);
            continue;
        }
        EXPECT_EQ(page.fault(device), json()) << page.name(device);
        json sheet = page.sheet(device);
        for (const char* const list : {"properties", "flashProperties", "multiboot"}) {
            sheet[list] = sorted(sheet[list]);
        }
        EXPECT_EQ(sheet, shown(answer)) << page.name(device);
    }
    EXPECT_EQ(outcome.status, hasFaults ? 2 : 0) << outcome.error;
    return page.size();
}

TEST(ReportAgreement, OverTheDemonstration) {
    EXPECT_GT(expectAgreement({"--database", TARVIK_SOURCE_DIRECTORY "/database"}), 150U);
}

void expectAgreementOverRandomDatabases(Health health, std::uint64_t seed) {
    for (std::uint64_t number = 0; number < 20 && !testing::Test::HasFailure(); ++number) {
        RandomSource pick(rc::Random(seed + number));
        const DatabaseDirectory directory(reference::makeDatabases(pick, health));
        expectAgreement({"--database", directory.path()});
    }
}

TEST(ReportAgreement, OverSoundDatabases) { expectAgreementOverRandomDatabases(Health::SOUND, 5000); }

TEST(ReportAgreement, OverDamagedDatabases) { expectAgreementOverRandomDatabases(Health::DAMAGED, 7000); }

TEST(ReportAgreement, ADeviceWithoutAnAnswerIsTold) {
    const DatabaseDirectory directory(DatabaseDirectory::Files{
        {"base.acd", "DEVICE_SUPPORTED = fam\n"},
        {"fam.acd", "PROPERTY = A,1\n[D1]\n[D2]\nPROGRAM_OPTION = NOSUCH,Bscan,USB2\n[D3]\n"}});
    EXPECT_EQ(expectAgreement({"--database", directory.path()}), 3U);
}

} // namespace
