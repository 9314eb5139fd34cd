// Loads and unloads the library over and over, as an application with plug-ins does.
#include <gtest/gtest.h>

#include <algorithm>
#include <fstream>
#include <iterator>
#include <malloc.h>

#include <dlfcn.h>

namespace {

bool loadAndUnload() {
    void* const library = dlopen(TARVIK_MANAGER_LIBRARY, RTLD_NOW | RTLD_LOCAL);
    return library != nullptr && dlclose(library) == 0;
}

/// How many areas of memory the process has.
std::ptrdiff_t mappings() {
    std::ifstream maps("/proc/self/maps");
    return std::count(std::istreambuf_iterator<char>(maps), std::istreambuf_iterator<char>(), '\n');
}

TEST(Unloading, AThousandTimesLeavesNothingBehind) {
    // The first rounds fill what the loader and the allocator keep for good.
    for (int round = 0; round < 10; ++round) {
        ASSERT_TRUE(loadAndUnload()) << dlerror();
    }
    const std::ptrdiff_t mappingsBefore = mappings();
    const std::size_t allocatedBefore = mallinfo2().uordblks;
    for (int round = 0; round < 1000; ++round) {
        ASSERT_TRUE(loadAndUnload()) << dlerror();
    }
    // Sanitizers map something for themselves now and then, far less often than once a round.
    EXPECT_LT(mappings(), mappingsBefore + 100);
    EXPECT_LE(mallinfo2().uordblks, allocatedBefore + 4096);
}

TEST(Unloading, TakesTheLibraryOutOfTheProcess) {
    ASSERT_TRUE(loadAndUnload()) << dlerror();
    EXPECT_EQ(dlopen(TARVIK_MANAGER_LIBRARY, RTLD_NOW | RTLD_NOLOAD), nullptr);
}

} // namespace
