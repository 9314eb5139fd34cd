// Loads and unloads the libraries over and over, as an application with plug-ins does.
#include <gtest/gtest.h>

#include <algorithm>
#include <fstream>
#include <iterator>
#include <malloc.h>

#include <dlfcn.h>

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

class Unloading : public testing::TestWithParam<const char*> {};

TEST_P(Unloading, AThousandTimesLeavesNothingBehind) {
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

TEST_P(Unloading, TakesTheLibraryOutOfTheProcess) {
    ASSERT_TRUE(loadAndUnload(GetParam())) << dlerror();
    EXPECT_EQ(dlopen(GetParam(), RTLD_NOW | RTLD_NOLOAD), nullptr);
}

INSTANTIATE_TEST_SUITE_P(Manager, Unloading, testing::Values(TARVIK_MANAGER_LIBRARY));
INSTANTIATE_TEST_SUITE_P(CInterface, Unloading, testing::Values(TARVIK_C_LIBRARY));

} // namespace
