// The dumps of the demonstration database, all of it loaded, against the files in tests/data/dumps. Where a
// difference is meant (the database was changed), TARVIK_RENEW_GOLDEN=1 in the environment writes the files anew.
#include "Members.h"

#include <TarvikSmokeMgr.h>

#include <algorithm>
#include <cstdlib>
#include <fstream>
#include <sstream>

namespace {

using TARVIKNS::MODE_TYPE;
using TARVIKNS::OUTPUT_TYPE;

constexpr auto BS = MODE_TYPE::BS;
constexpr auto PARALLEL = OUTPUT_TYPE::PARALLEL;

const std::string SOURCE_DIRECTORY = TARVIK_SOURCE_DIRECTORY;

// The package in a name that joins this device with one; empty for any other name. Of several devices that a
// name begins with, the longest is meant.
std::string packageIn(const std::string& name, const std::string& device,
                      const std::vector<std::string>& devices) {
    const auto beginsWith = [&](const std::string& text) { return name.compare(0, text.size(), text) == 0; };
    const bool isMeant =
        beginsWith(device) && std::none_of(devices.begin(), devices.end(), [&](const auto& other) {
            return other.size() > device.size() && beginsWith(other);
        });
    return isMeant ? name.substr(device.size()) : "";
}

// Asks for every device, and for each of its packages that has program options of its own.
void loadEverything(const ManagerFixture& manager) {
    const auto names = texts(manager.members().m_programOptionPackages);
    for (const std::string& family : AcdStore::families()) {
        const auto devices = AcdStore::devices(family);
        for (const std::string& device : devices) {
            static_cast<void>(manager->getDeviceOperations(device.c_str(), BS, PARALLEL));
            static_cast<void>(manager->getProgramOptions(device.c_str(), BS, PARALLEL, nullptr));
            for (const std::string& name : names) {
                const std::string package = packageIn(name, device, devices);
                if (!package.empty()) {
                    static_cast<void>(
                        manager->getProgramOptions(device.c_str(), BS, PARALLEL, package.c_str()));
                }
            }
        }
    }
    for (const std::string& name : texts(manager.members().m_supportedDevices)) {
        static_cast<void>(manager->getDeviceOperations(name.c_str(), BS, PARALLEL));
    }
}

void compare(const std::string& dumped, const std::string& name) {
    const std::string path = SOURCE_DIRECTORY + "/tests/data/dumps/" + name;
    if (std::getenv("TARVIK_RENEW_GOLDEN") != nullptr) {
        std::ofstream(path, std::ios::binary) << dumped;
        GTEST_SKIP() << path << " was written anew";
    }
    std::ifstream file(path, std::ios::binary);
    ASSERT_TRUE(file) << path;
    std::ostringstream golden;
    golden << file.rdbuf();
    EXPECT_EQ(dumped, golden.str()) << "TARVIK_RENEW_GOLDEN=1 writes " << path << " anew";
}

class DumpGoldens : public testing::Test {
protected:
    DumpGoldens() { loadEverything(m_manager); }

    std::string recorded(void (ConstraintsManager::*dump)(TarvikSmokeMgr*)) {
        TarvikSmokeMgr recorder;
        ((*m_manager).*dump)(&recorder);
        return {recorder.text().c_str(), recorder.text().GetLength()};
    }

    ManagerFixture m_manager{SearchPath(SOURCE_DIRECTORY + "/database")};
};

} // namespace

TEST_F(DumpGoldens, Operations) {
    compare(recorded(&ConstraintsManager::dumpOperationsTable), "operations.txt");
}

TEST_F(DumpGoldens, BoundaryScanOperations) {
    compare(recorded(&ConstraintsManager::dumpBsdlOperationsTable), "bsdl.txt");
}

TEST_F(DumpGoldens, ProgramOptions) {
    compare(recorded(&ConstraintsManager::dumpProgramOptionsTable), "options.txt");
}

TEST_F(DumpGoldens, CachedFamilies) {
    compare(recorded(&ConstraintsManager::dumpCachedDeviceFamilies), "families.txt");
}

TEST_F(DumpGoldens, MultibootTypes) {
    static_cast<void>(m_manager.messages());
    m_manager->dumpMbBpiSpi();
    std::string dumped;
    for (const IssuedMessage& message : m_manager.messages()) {
        dumped += message.text;
    }
    compare(dumped, "multiboot.txt");
}

TEST_F(DumpGoldens, TheWholeDatabaseLoadsInSilence) {
    for (const IssuedMessage& message : m_manager.messages()) {
        ADD_FAILURE() << message;
    }
}
