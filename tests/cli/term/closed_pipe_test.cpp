// Readers that leave before the end, as `head` does: the tool prints no error and does not crash.
#include "cli/support/DatabaseDirectory.h"

#include <gmock/gmock.h>

#include <array>
#include <cstdio>
#include <sys/wait.h>

namespace {

using testing::IsEmpty;

/// What a shell's command writes. It has to succeed.
std::string shell(const std::string& command) {
    std::string text;
    FILE* const output = ::popen(("bash -c '" + command + "'").c_str(), "r");
    std::array<char, 4096> piece{};
    for (std::size_t got = 1; got != 0;) {
        got = std::fread(piece.data(), 1, piece.size(), output);
        text.append(piece.data(), got);
    }
    EXPECT_EQ(WEXITSTATUS(::pclose(output)), 0) << command;
    return text;
}

/// Standard error and the exit status of the tool when only the first line of its output is read.
std::string heard(const std::string& database, const std::string& arguments) {
    return shell("unset TARVIK_DATABASE; { \"" TARVIK_TOOL "\" --database \"" + database + "\" " + arguments +
                 " 2>&3 | head -n 1 >/dev/null; echo ${PIPESTATUS[0]}; } 3>&1");
}

TEST(ClosedPipe, EndsQuietly) {
    const std::string database = TARVIK_SOURCE_DIRECTORY "/database";
    for (const char* const arguments :
         {"devices", "families", "vocabulary", "show KS50", "spi", "dump operations KS50", "dump multiboot",
          "which --property VENDOR=Korvel", "lint --explain all", "--help", "devices --json"}) {
        EXPECT_EQ(heard(database, arguments), "0\n") << arguments;
    }
}

TEST(ClosedPipe, EndsQuietlyWithMoreThanAnyPipeHolds) {
    std::string family;
    for (int device = 0; device < 20000; ++device) {
        family += "[DEVICE_OF_A_LARGE_FAMILY_" + std::to_string(device) + "]\n";
    }
    const DatabaseDirectory database(
        {{"base.acd", "DEVICE_SUPPORTED = finch\n"}, {"finch.acd", family}, {"spi.acd", ""}});
    EXPECT_EQ(heard(database.path(), "devices"), "0\n");
    EXPECT_EQ(heard(database.path(), "devices --json"), "0\n");
}

TEST(ClosedPipe, KeepsTheAnswerInTheExitStatus) {
    EXPECT_EQ(heard(TARVIK_SOURCE_DIRECTORY "/tests/data/bad/T101", "lint"),
              "tarvik: 1 error, 0 warnings\nT101: 1\n1\n");
}

} // namespace
