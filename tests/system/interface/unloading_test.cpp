// Loads and unloads the libraries over and over, as an application with plug-ins does.
#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <string>

#include <dlfcn.h>
#include <malloc.h>

namespace {

bool loadAndUnload(const char* file) {
    void* const library = dlopen(file, RTLD_NOW | RTLD_LOCAL);
    return library != nullptr && dlclose(library) == 0;
}

/// How many areas of memory the process has.
std::ptrdiff_t mappings() {
    std::ifstream maps("/proc/self/maps");
    return std::count(std::istreambuf_iterator<char>(maps), std::istreambuf_iterator<char>(), '\n');
}

class LibraryUnloading : public testing::TestWithParam<const char*> {};

TEST_P(LibraryUnloading, AThousandTimesLeavesNothingBehind) {
    // The first rounds fill what the loader and the allocator keep for good.
    for (int round = 0; round < 10; ++round) {
        ASSERT_TRUE(loadAndUnload(GetParam())) << dlerror();
    }
    const std::ptrdiff_t mappingsBefore = mappings();
    const std::size_t allocatedBefore = mallinfo2().uordblks;
    for (int round = 0; round < 1000; ++round) {
        ASSERT_TRUE(loadAndUnload(GetParam())) << dlerror();
    }
    // Sanitizers map something for themselves now and then, far less often than once a round.
    EXPECT_LT(mappings(), mappingsBefore + 100);
    EXPECT_LE(mallinfo2().uordblks, allocatedBefore + 4096);
}

TEST_P(LibraryUnloading, TakesTheLibraryOutOfTheProcess) {
    ASSERT_TRUE(loadAndUnload(GetParam())) << dlerror();
    EXPECT_EQ(dlopen(GetParam(), RTLD_NOW | RTLD_NOLOAD), nullptr);
}

INSTANTIATE_TEST_SUITE_P(Manager, LibraryUnloading, testing::Values(TARVIK_MANAGER_LIBRARY));
INSTANTIATE_TEST_SUITE_P(CInterface, LibraryUnloading, testing::Values(TARVIK_C_LIBRARY));

/// Loads a plug-in, asks it for the vendor of KS50 in a database that says so, and unloads it.
std::string vendorInPlugin(const std::string& vendor) {
    const std::string directory = testing::TempDir() + "tarvik_plugin_" + vendor;
    std::filesystem::create_directories(directory);
    std::ofstream(directory + "/base.acd") << "DEVICE_SUPPORTED = kestrel\n";
    std::ofstream(directory + "/kestrel.acd") << "[KS50]\nPROPERTY = VENDOR," << vendor << "\n";
    void* const plugin = dlopen(TARVIK_PLUGIN, RTLD_NOW | RTLD_LOCAL);
    if (plugin == nullptr) {
        return dlerror();
    }
    using VendorOf = int (*)(const char*, const char*, char*, int);
    std::array<char, 64> answer{};
    // NOLINTNEXTLINE(cppcoreguidelines-pro-type-reinterpret-cast)
    const auto vendorOf = reinterpret_cast<VendorOf>(dlsym(plugin, "vendorOf"));
    const int messages = vendorOf("KS50", directory.c_str(), answer.data(), 63);
    EXPECT_EQ(messages, 0);
    dlclose(plugin);
    std::filesystem::remove_all(directory);
    return answer.data();
}

TEST(Unloading, OfAPluginLetsTheNextOneAnswerFromAnotherDatabase) {
    EXPECT_EQ(vendorInPlugin("Korvel"), "Korvel");
    for (const char* const library : {TARVIK_PLUGIN, TARVIK_MANAGER_LIBRARY, TARVIK_HOST_LIBRARY}) {
        EXPECT_EQ(dlopen(library, RTLD_NOW | RTLD_NOLOAD), nullptr) << library;
    }
    EXPECT_EQ(vendorInPlugin("Zorva"), "Zorva");
}

} // namespace
