#include "DatabaseFixtures.h"

#include "database/Catalogue.h"

#include <gmock/gmock.h>

// Files that an editor holds count among those of their directory, whether or not they exist yet.

namespace {

using testing::ElementsAre;

class UnsavedFiles : public DatabaseTest {
protected:
    [[nodiscard]] std::vector<std::string> families(const std::vector<std::string>& unsaved) const {
        acd::DeferredMessages reports;
        const acd::Catalogue catalogue({m_directory.path()}, reports, unsaved);
        std::vector<std::string> names;
        for (const auto& family : catalogue.families()) {
            names.push_back(family->name);
        }
        return names;
    }

    TemporaryDirectory m_directory;
};

TEST_F(UnsavedFiles, AreListedWithTheOthers) {
    m_directory.write("kestrel.acd", "[KS50]\n");
    EXPECT_THAT(families({}), ElementsAre("kestrel"));
    EXPECT_THAT(families({m_directory.path("base.acd"), m_directory.path("sparrow.acd")}),
                ElementsAre("base", "kestrel", "sparrow"));
}

TEST_F(UnsavedFiles, ThatExistAreListedOnce) {
    m_directory.write("kestrel.acd", "[KS50]\n");
    EXPECT_THAT(families({m_directory.path("kestrel.acd")}), ElementsAre("kestrel"));
}

TEST_F(UnsavedFiles, OfOtherDirectoriesAreNot) {
    m_directory.write("kestrel.acd", "[KS50]\n");
    EXPECT_THAT(families({"/elsewhere/sparrow.acd", m_directory.path("folder/finch.acd"), "osprey.acd"}),
                ElementsAre("kestrel"));
}

} // namespace
