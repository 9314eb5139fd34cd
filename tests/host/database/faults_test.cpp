#include "DatabaseFixtures.h"

#include "database/ParseError.h"

#include <iomanip>
#include <sstream>

// What is wrong with a line costs that line and gives one message with its place; reading goes on behind it.

using std::nullopt;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::Optional;
using namespace std::string_view_literals;

class Faults : public DatabaseTest {
protected:
    /// Expects one message for the file, and that the line AFTER is read.
    void expectFault(std::string_view text, int line, const std::string& message) {
        EXPECT_THAT(valueIn(text, "AFTER"), Optional("ok"sv));
        EXPECT_THAT(messages.take(), ElementsAre(info(line, "kestrel.acd:" + message + "\n")));
    }

    /// Expects that a header is refused, and that the keys behind it are nobody's.
    void expectBadHeader(std::string_view header, const std::string& message) {
        const std::string text = "OWN = f\n[A]\nBEFORE = a\n" + std::string(header) +
                                 "\nLOST = x\nOWN = y\nbroken\n[B]\nKEY = b\n";
        useFiles({{"kestrel.acd", text}});
        EXPECT_THAT(AcdStore::devices("kestrel"), ElementsAre("A", "B"));
        EXPECT_THAT(messages.take(),
                    ElementsAre(info(4, "kestrel.acd:4:" + message +
                                            "; the keys up to the next header are dropped\n"),
                                info(7, "kestrel.acd:7:1: no '=' in 'broken'\n")));
        EXPECT_EQ(valueOf("A", "LOST"), nullopt);
        EXPECT_EQ(valueOf("B", "LOST"), nullopt);
        EXPECT_EQ(valueOf("kestrel", "LOST"), nullopt);
        EXPECT_THAT(valueOf("A", "OWN"), Optional("f"sv));
        EXPECT_THAT(valueOf("A", "BEFORE"), Optional("a"sv));
        EXPECT_THAT(valueOf("B", "KEY"), Optional("b"sv));
        EXPECT_THAT(messages.take(), IsEmpty());
    }
};

TEST_F(Faults, ALineWithoutEqualsSign) {
    expectFault("\n  KEY a\nAFTER = ok\n", 2, "2:3: no '=' in 'KEY a'");
}

TEST_F(Faults, AnEmptyKey) { expectFault("\t= a\nAFTER = ok\n", 1, "1:2: no key before the '=' of '= a'"); }

TEST_F(Faults, AnEmptyKeyOfAnAppend) {
    expectFault("+= a\nAFTER = ok\n", 1, "1:1: no key before the '=' of '+= a'");
}

TEST_F(Faults, ABlankInAKey) {
    expectFault("KEY\tTWO = a\nAFTER = ok\n", 1, "1:4: blank in the key 'KEY\\x09TWO'");
}

TEST_F(Faults, ABlankBeforeThePlusThatIsNotRightBeforeTheSign) {
    expectFault("AFTER = ok\nAFTER + = a\n", 2, "2:6: blank in the key 'AFTER +'");
}

TEST_F(Faults, ABlankInAKeyOnAContinuedLine) {
    expectFault("K\\\n  EY TWO = a\nAFTER = ok\n", 2, "2:5: blank in the key 'KEY TWO'");
}

TEST_F(Faults, ANulInAValue) {
    expectFault("KEY = a\0b\nAFTER = ok\n"sv, 1, "1:8: NUL byte in 'KEY = a\\x00b'");
}

TEST_F(Faults, ANulInAKey) { expectFault("K\0Y = a\nAFTER = ok\n"sv, 1, "1:2: NUL byte in 'K\\x00Y = a'"); }

TEST_F(Faults, ANulWithoutEqualsSign) { expectFault("\0\nAFTER = ok\n"sv, 1, "1:1: NUL byte in '\\x00'"); }

TEST_F(Faults, ANulThatIsAllOfAFile) {
    EXPECT_THAT(devicesIn("\0"sv), IsEmpty());
    EXPECT_EQ(valueOf("kestrel", "KEY"), nullopt);
    EXPECT_THAT(messages.take(), ElementsAre(info(1, "kestrel.acd:1:1: NUL byte in '\\x00'\n")));
}

TEST_F(Faults, ANulOnAContinuedLine) {
    expectFault("KEY = a\\\n b\0\nAFTER = ok\n"sv, 2, "2:3: NUL byte in 'KEY = ab\\x00'");
}

TEST_F(Faults, ABackslashAtTheEnd) {
    expectFault("AFTER = ok\nKEY = a\\", 2, "2:8: the file ends where this line should go on: 'KEY = a\\'");
}

TEST_F(Faults, ABackslashAtTheEndBeforeALineEnd) {
    expectFault("AFTER = ok\nKEY = a \\\r\n", 2,
                "2:9: the file ends where this line should go on: 'KEY = a \\'");
}

TEST_F(Faults, ABackslashAtTheEndOfAContinuedLine) {
    expectFault("AFTER = ok\nKEY = a\\\n  b\\", 3,
                "3:4: the file ends where this line should go on: 'KEY = ab\\'");
}

TEST_F(Faults, ALoneBackslashAtTheEnd) {
    expectFault("AFTER = ok\n\\", 2, "2:1: the file ends where this line should go on: '\\'");
}

TEST_F(Faults, ALoneBackslashThatGoesOnWithNothing) {
    expectFault("\\\n\nAFTER = ok\n", 1, "1:1: no '=' in ''");
}

TEST_F(Faults, ALineOverSixteenMebibytes) {
    const std::string text = "KEY = " + std::string((std::size_t{16} << 20) - 5, 'a') + "\nAFTER = ok\n";
    expectFault(text, 1, "1:1: line of more than 16 MiB: 'KEY = " + std::string(54, 'a') + "...'");
    EXPECT_EQ(valueOf("kestrel", "KEY"), nullopt);
}

TEST_F(Faults, ALineOverSixteenMebibytesOnceJoined) {
    std::string text = "\nKEY = ";
    while (text.size() < std::size_t{17} << 20) {
        text += std::string(1000, 'a') + "\\\n";
    }
    expectFault(text + "b\nAFTER = ok\n", 2,
                "2:1: line of more than 16 MiB: 'KEY = " + std::string(54, 'a') + "...'");
}

TEST_F(Faults, ACommentOverSixteenMebibytesIsNone) {
    EXPECT_THAT(valueIn("#" + std::string(std::size_t{17} << 20, 'a') + "\nAFTER = ok\n", "AFTER"),
                Optional("ok"sv));
    EXPECT_THAT(messages.take(), IsEmpty());
}

TEST_F(Faults, AnUnclosedHeader) { expectBadHeader(" [KS50", "2: header without ']': '[KS50'"); }

TEST_F(Faults, AHeaderOfABracketAlone) { expectBadHeader("[", "1: header without ']': '['"); }

TEST_F(Faults, AHeaderWithoutAName) { expectBadHeader("[]", "1: header without a name: '[]'"); }

TEST_F(Faults, AHeaderOfBlanks) { expectBadHeader("[ ]", "2: blank in the name of a header: '[ ]'"); }

TEST_F(Faults, ABlankInAHeader) { expectBadHeader("[KS 50]", "4: blank in the name of a header: '[KS 50]'"); }

TEST_F(Faults, TextBehindAHeader) {
    expectBadHeader("[KS50] # fast", "7: text behind a header: '[KS50] # fast'");
}

TEST_F(Faults, ASecondBracketBehindAHeader) {
    expectBadHeader("[KS50]]", "7: text behind a header: '[KS50]]'");
}

TEST_F(Faults, AnAssignmentBehindAHeader) {
    expectBadHeader("[KS50]=a", "7: text behind a header: '[KS50]=a'");
}

TEST_F(Faults, ANulInAHeader) { expectBadHeader("[KS\0]"sv, "4: NUL byte in '[KS\\x00]'"); }

TEST_F(Faults, AnOverlongHeader) {
    expectBadHeader("[" + std::string(std::size_t{16} << 20, 'a') + "]",
                    "1: line of more than 16 MiB: '[" + std::string(59, 'a') + "...'");
}

TEST_F(Faults, AHeaderThatTheFileCutsShort) {
    EXPECT_THAT(devicesIn("[A]\n[B]\\"), ElementsAre("A"));
    EXPECT_THAT(
        messages.take(),
        ElementsAre(info(2, "kestrel.acd:2:4: the file ends where this line should go on: '[B]\\'; the "
                            "keys up to the next header are dropped\n")));
}

TEST_F(Faults, OfAHeaderOnAContinuedLine) {
    EXPECT_THAT(devicesIn("[A\\\n  ] x\n"), IsEmpty());
    EXPECT_THAT(messages.take(),
                ElementsAre(info(2, "kestrel.acd:2:4: text behind a header: '[A] x'; the keys "
                                    "up to the next header are dropped\n")));
}

TEST_F(Faults, BeforeTheFirstSectionLeaveTheFamilysKeys) {
    EXPECT_THAT(valueIn("KEY = a\nbroken\nOTHER = b\n", "KEY"), Optional("a"sv));
    EXPECT_THAT(valueOf("kestrel", "OTHER"), Optional("b"sv));
}

TEST_F(Faults, ALineInASectionLeavesItOpen) {
    EXPECT_THAT(valueIn("[A]\nbroken\nKEY = a\n", "KEY", "A"), Optional("a"sv));
}

TEST_F(Faults, AreReportedInOrderEachOnce) {
    EXPECT_THAT(valueIn("one\n= two\n[three\nKEY = a\n", "KEY"), nullopt);
    EXPECT_THAT(
        messages.take(),
        ElementsAre(info(1, "kestrel.acd:1:1: no '=' in 'one'\n"),
                    info(2, "kestrel.acd:2:1: no key before the '=' of '= two'\n"),
                    info(3,
                         "kestrel.acd:3:1: header without ']': '[three'; the keys up to the next header are "
                         "dropped\n")));
    const AcdReader again("kestrel");
    EXPECT_THAT(messages.take(), IsEmpty());
}

TEST_F(Faults, AreNotReportedByTheIndex) {
    useFiles({{"kestrel.acd", "broken\n[A]\n[B\n"}});
    EXPECT_THAT(familyOf("A"), Optional("kestrel"sv));
    EXPECT_THAT(messages.take(), IsEmpty());
}

TEST_F(Faults, AreSignedByTheDatabase) {
    std::vector<std::string> signatures;
    Port_MsgManData::setSink([&](const Port_MsgManData::Message& message) {
        signatures.push_back(std::string(message.product) + '|' + std::string(message.source) + '|' +
                             std::string(message.revision));
        EXPECT_EQ(message.channel, Port_MsgManData::Channel::INFO);
    });
    EXPECT_THAT(valueIn("broken\n", "KEY"), nullopt);
    EXPECT_THAT(signatures, ElementsAre("Tarvik|host/database|1.0"));
}

TEST_F(Faults, PercentSignsStandAsTheyAre) {
    useFiles({{"%s.acd", "100%% %n\n"}});
    const AcdReader reader("%s");
    EXPECT_THAT(messages.take(), ElementsAre(info(1, "%s.acd:1:1: no '=' in '100%% %n'\n")));
}

TEST_F(Faults, LongFragmentsAreCut) {
    expectFault("AFTER = ok\n" + std::string(61, 'a') + "\n", 2,
                "2:1: no '=' in '" + std::string(60, 'a') + "...'");
}

TEST_F(Faults, FragmentsOfSixtyBytesAreNot) {
    expectFault("AFTER = ok\n" + std::string(60, 'a') + "\n", 2,
                "2:1: no '=' in '" + std::string(60, 'a') + "'");
}

TEST_F(Faults, LongFragmentsAreCutBetweenCharacters) {
    expectFault("AFTER = ok\n" + std::string(59, 'a') + "\xC3\xA4\xC3\xA4\n", 2,
                "2:1: no '=' in '" + std::string(59, 'a') + "...'");
}

TEST_F(Faults, TheFragmentOfANulIsWhatStandsAroundIt) {
    expectFault("AFTER = ok\nKEY = " + std::string(100, 'a') + std::string(1, '\0') + "b\n", 2,
                "2:107: NUL byte in '" + std::string(20, 'a') + "\\x00b'");
}

TEST_F(Faults, ControlBytesAreShownHarmlessly) {
    expectFault("AFTER = ok\n\x1B[2J\x07\x7F\xC2\x9B\xC3\xA4\r\xFF\n", 2,
                "2:1: no '=' in '\\x1b[2J\\x07\\x7f\\xc2\\x9b\xC3\xA4\\x0d\xFF'");
}

TEST_F(Faults, OfAMessageThatRaisesAreNotRepeated) {
    useFiles({{"kestrel.acd", "one\ntwo\nKEY = a\n"}});
    Port_MsgManData::setSink([](const Port_MsgManData::Message&) { throw std::runtime_error("no room"); });
    EXPECT_THROW(AcdReader("kestrel"), std::runtime_error);

    MessageRecorder later;
    EXPECT_THAT(valueOf("kestrel", "KEY"), Optional("a"sv));
    EXPECT_THAT(later.take(), ElementsAre(info(2, "kestrel.acd:2:1: no '=' in 'two'\n")));
}

TEST_F(Faults, MayBeReceivedByAReaderOfDatabases) {
    useFiles({{"kestrel.acd", "broken\n[A]\n"}, {"merlin.acd", "[B]\nKEY = b\n"}});
    std::vector<std::string> received;
    Port_MsgManData::setSink([&](const Port_MsgManData::Message& message) {
        received.emplace_back(message.text);
        EXPECT_THAT(valueOf("B", "KEY"), Optional("b"sv));
        if (received.size() == 1) {
            AcdStore::setMemoryFiles({}); // too late
        }
    });
    EXPECT_STREQ(AcdReader("A").getPM(), "kestrel");
    EXPECT_THAT(received,
                ElementsAre("kestrel.acd:1:1: no '=' in 'broken'\n", testing::HasSubstr("ignored")));
    EXPECT_EQ(familyOf("A"), "kestrel");
}

namespace {

/// The byte as a text shows it that a terminal would obey.
std::string escaped(int byte) {
    std::ostringstream text;
    text << "\\x" << std::hex << std::setw(2) << std::setfill('0') << byte;
    return text.str();
}

} // namespace

TEST(PrintableText, EscapesControlBytes) {
    for (int byte = 0; byte < 256; ++byte) {
        const std::string text(1, static_cast<char>(byte));
        const bool isControl = byte < 0x20 || byte == 0x7F;
        EXPECT_EQ(acd::printable(text), isControl ? escaped(byte) : text) << byte;
        EXPECT_EQ(acd::printable("a" + text + "b"), "a" + (isControl ? escaped(byte) : text) + "b") << byte;
    }
}

TEST(PrintableText, EscapesTheControlCharactersOfUtf8) {
    for (int byte = 0x80; byte < 0xC0; ++byte) {
        const std::string text{'\xC2', static_cast<char>(byte)};
        const std::string shown = byte < 0xA0 ? escaped(0xC2) + escaped(byte) : text;
        EXPECT_EQ(acd::printable(text), shown) << byte;
        EXPECT_EQ(acd::printable("a" + text + "b"), "a" + shown + "b") << byte;
        const std::string letter{'\xC3', static_cast<char>(byte)};
        EXPECT_EQ(acd::printable(letter), letter) << byte;
    }
}

TEST(Excerpts, OfTextsThatAreNotUtf8AreCutAllTheSame) {
    EXPECT_EQ(acd::excerpt(std::string(61, '\x80')), std::string(56, '\x80') + "...");
    EXPECT_EQ(acd::excerpt(std::string(60, '\x80')), std::string(60, '\x80'));
}

TEST(Excerpts, AreCutBeforeTheCharacterThatTheyWouldCutApart) {
    const std::string characters[] = {"\xC3\xA4", "\xE2\x82\xAC", "\xF0\x9F\x94\xA7"};
    for (const std::string& character : characters) {
        for (std::size_t left = 0; left <= character.size(); ++left) {
            const std::string before(60 - left, 'a');
            EXPECT_EQ(acd::excerpt(before + character + "behind"),
                      before + (left == character.size() ? character : "") + "...");
        }
    }
}
