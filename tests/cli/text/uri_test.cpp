#include "text/Uri.h"

#include <gtest/gtest.h>

namespace {

TEST(Uris, OfPathsKeepLettersAndEscapeTheRest) {
    EXPECT_EQ(asUri("/data/base.acd"), "file:///data/base.acd");
    EXPECT_EQ(asUri("/a b/100%/\xC3\xA4;#?.acd"), "file:///a%20b/100%25/%C3%A4%3B%23%3F.acd");
    EXPECT_EQ(asUri("base.acd"), "base.acd");
}

TEST(Uris, NameTheirPaths) {
    EXPECT_EQ(pathOf("file:///data/base.acd"), "/data/base.acd");
    EXPECT_EQ(pathOf("file://localhost/data/base.acd"), "/data/base.acd");
    EXPECT_EQ(pathOf("file:///a%20b/100%25/%c3%A4%3b.acd"), "/a b/100%/\xC3\xA4;.acd");
    EXPECT_EQ(pathOf("file:///data/layer/../base.acd"), "/data/base.acd");
}

TEST(Uris, ThatNameNoPath) {
    for (const char* const uri :
         {"", "data", "http://localhost/data", "file:", "file://", "file://host", "file://host/data"}) {
        EXPECT_EQ(pathOf(uri), "") << uri;
    }
}

TEST(Uris, WithBrokenEscapesAreReadAsTheyStand) {
    EXPECT_EQ(pathOf("file:///100%"), "/100%");
    EXPECT_EQ(pathOf("file:///%4"), "/%4");
    EXPECT_EQ(pathOf("file:///%zz%4g%G4"), "/%zz%4g%G4");
}

TEST(Uris, OfAnyPathLeadBackToIt) {
    std::string path = "/";
    for (int byte = 1; byte < 256; ++byte) {
        if (byte != '/' && byte != '\\') {
            path += static_cast<char>(byte);
        }
    }
    EXPECT_EQ(pathOf(asUri(path)), path);
}

} // namespace
