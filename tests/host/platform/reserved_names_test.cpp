#include "platform/ReservedNames.h"

#include <gtest/gtest.h>

// Which file names are devices on Windows. The rule itself is tested everywhere.

using acd::platform::isReservedName;

TEST(ReservedNames, AreDevicesInAnyCaseAndWithAnyEnding) {
    for (const char* const name :
         {"CON", "prn", "Aux.acd", "nul.tar.gz", "CONIN$", "conout$.acd", "NUL .acd", "nul:"}) {
        EXPECT_TRUE(isReservedName(name)) << name;
    }
}

TEST(ReservedNames, AreNumberedPorts) {
    for (const char* const name :
         {"COM1", "com9.acd", "LPT0", "lpt3.acd", "COM\xC2\xB9", "com\xC2\xB3.acd"}) {
        EXPECT_TRUE(isReservedName(name)) << name;
    }
}

TEST(ReservedNames, AreNoOthers) {
    for (const char* const name : {"", ".", ".acd", "CO", "COM", "COM10", "com1x.acd", "LPTX", "CONS", "xNUL",
                                   "base.acd", "console.acd", "CO\xC2\xB9", "KOM1", "COM "}) {
        EXPECT_FALSE(isReservedName(name)) << name;
    }
}
