// Several files are written together, or none of them.
#include "DirectoryFiles.h"

#include "edit/FileWriter.h"
#include "term/ExitCode.h"

#include <gmock/gmock.h>

using edit::Rewrite;
using edit::writeAll;

TEST(FileWriter, WritesCreatesRenamesAndRemoves) {
    const DatabaseDirectory directory({{"a", "1"}, {"b", "2"}, {"c", "3"}});
    writeAll({{directory.path("a"), "new"},
              {directory.path("d"), "renamed", directory.path("b")},
              {directory.path("c"), std::nullopt},
              {directory.path("e"), "created"}});
    EXPECT_EQ(textsIn(directory),
              (DatabaseDirectory::Files{{"a", "new"}, {"d", "renamed"}, {"e", "created"}}));
}

TEST(FileWriter, PutsAllBackWhenOneFails) {
    const DatabaseDirectory::Files files{{"a", "1"}, {"b", "2"}, {"c", "3"}};
    const DatabaseDirectory directory(files);
    EXPECT_THROW(writeAll({{directory.path("a"), "new"},
                           {directory.path("d"), "renamed", directory.path("b")},
                           {directory.path("c"), std::nullopt},
                           {directory.path("e"), "created"},
                           {directory.path("nowhere/f"), "created"}}),
                 CommandError);
    EXPECT_EQ(textsIn(directory), files);
}

TEST(FileWriter, NeverReplacesAFileByARenamedOne) {
    const DatabaseDirectory::Files files{{"a", "1"}, {"b", "2"}};
    const DatabaseDirectory directory(files);
    EXPECT_THROW(writeAll({{directory.path("b"), "1", directory.path("a")}}), CommandError);
    EXPECT_EQ(textsIn(directory), files);
}
