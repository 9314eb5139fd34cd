// The framing of messages: what arrives in pieces, and what is no message.
#include "lsp/MessageReader.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

namespace {

using lsp::MessageReader;

/// The contents, and "!" for each fault.
std::vector<std::string> read(MessageReader& reader) {
    std::vector<std::string> all;
    while (const auto message = reader.next()) {
        all.push_back(message->fault.empty() ? message->content : "!");
    }
    return all;
}

std::vector<std::string> read(const std::string& bytes) {
    MessageReader reader;
    reader.append(bytes);
    return read(reader);
}

using Texts = std::vector<std::string>;

} // namespace

TEST(MessageReader, TakesMessagesApart) {
    EXPECT_EQ(read("Content-Length: 2\r\n\r\n{}Content-Length: 0\r\n\r\nContent-Length: 1\r\n\r\n7"),
              (Texts{"{}", "", "7"}));
}

TEST(MessageReader, ReadsOtherHeadersInAnyOrderAndCase) {
    EXPECT_EQ(read("Content-Type: application/vscode-jsonrpc; charset=utf-8\r\ncontent-length:2\r\n\r\n{}"),
              Texts{"{}"});
}

TEST(MessageReader, WaitsForEachByte) {
    const std::string bytes = "Content-Length: 2\r\n\r\n{}Content-Length: 3\r\n\r\n[7]";
    MessageReader reader;
    Texts all;
    for (const char byte : bytes) {
        reader.append(std::string(1, byte));
        for (const std::string& message : read(reader)) {
            all.push_back(message);
        }
    }
    EXPECT_EQ(all, (Texts{"{}", "[7]"}));
}

TEST(MessageReader, ReportsHeadersWithoutAValidLengthOnce) {
    for (const char* const bad :
         {"Content-Type: x\r\n\r\n", "Content-Length: x\r\n\r\n", "Content-Length: -1\r\n\r\n",
          "Content-Length: 1x\r\n\r\n", "Content-Length:\r\n\r\n", "no header\r\n\r\n",
          "Content-Length: 99999999999999999999999\r\n\r\n", "Content-Length: 2000000000\r\n\r\n",
          "\r\n\r\n"}) {
        const Texts all = read(std::string(bad) + "Content-Length: 2\r\n\r\n{}");
        ASSERT_FALSE(all.empty()) << bad;
        EXPECT_EQ(all.front(), "!") << bad;
        EXPECT_EQ(all.back(), "{}") << bad;
    }
}

TEST(MessageReader, RefusesTwoLengths) {
    const Texts all = read("Content-Length: 1\r\nContent-Length: 2\r\n\r\n[]");
    ASSERT_EQ(all.size(), 2U);
    EXPECT_EQ(all.front(), "!");
    EXPECT_EQ(all.back(), "[]");
}

TEST(MessageReader, FindsTheNextMessageAfterGarbage) {
    const std::string garbage(100'000, 'x');
    MessageReader reader;
    reader.append(garbage);
    EXPECT_EQ(read(reader), Texts{"!"});
    reader.append(garbage + "Content-Len");
    EXPECT_EQ(read(reader), Texts{});
    reader.append("gth: 2\r\n\r\n{}");
    EXPECT_EQ(read(reader), Texts{"{}"});
}

TEST(MessageReader, KeepsZeroBytes) {
    EXPECT_EQ(read(std::string("Content-Length: 3\r\n\r\na\0b", 24)), Texts{std::string("a\0b", 3)});
}

TEST(MessageReader, KeepsNothingOfMessagesThatWereTaken) {
    MessageReader reader;
    const std::string message = "Content-Length: 100000\r\n\r\n" + std::string(100'000, ' ');
    for (int i = 0; i < 1000; ++i) {
        reader.append(message);
        ASSERT_EQ(read(reader).size(), 1U);
    }
}
