// The canonical form of database files.
#include "edit/Format.h"

#include "host/database/HostileTexts.h"

#include <gtest/gtest.h>

#include <filesystem>

using edit::SourceFile;

namespace {

std::string format(const std::string& text, const std::string& family = "kestrel") {
    return edit::joined(edit::formatted(SourceFile(text, family + ".acd", family)));
}

} // namespace

TEST(Format, IsTheFormOfTheDemonstration) {
    for (const auto& entry : std::filesystem::directory_iterator(TARVIK_SOURCE_DIRECTORY "/database")) {
        const std::string text = edit::readFile(entry.path().string());
        EXPECT_EQ(format(text, entry.path().stem().string()), text) << entry.path();
    }
}

TEST(Format, AlignsTheEqualsSignsOfASubject) {
    EXPECT_EQ(format("A=1\nLONGER  =\t2\n\nB = 3\n\n# Another subject.\nC =4\n[D1]\nPROPERTY=A,1\n"),
              "A      = 1\nLONGER = 2\n\nB      = 3\n\n# Another subject.\nC = 4\n\n[D1]\nPROPERTY = A,1\n");
    EXPECT_EQ(format("A = 1\n# of the same\nLONG = 2\n"), "A    = 1\n# of the same\nLONG = 2\n");
}

TEST(Format, AlignsWhatIsAppendedToWithItsAppends) {
    EXPECT_EQ(format("A = 1\nB = 1\n\n# More.\nB+=,2\n"), "A  = 1\nB  = 1\n\n# More.\nB += ,2\n");
    EXPECT_EQ(format("B = 1\n[D1]\nB += 2\n"), "B = 1\n\n[D1]\nB += 2\n");
}

TEST(Format, PutsEachRecordOfATableOnALineOfItsOwn) {
    EXPECT_EQ(format("OPERATION = VERIFY,Bscan,USB2:ERASE,Bscan,USB2\n"),
              "OPERATION = VERIFY,Bscan,USB2: \\\n            ERASE,Bscan,USB2\n");
    EXPECT_EQ(format("OPERATION += :VERIFY,Bscan,USB2: \\\n ERASE,Bscan,USB2\n"),
              "OPERATION += :VERIFY,Bscan,USB2: \\\n              ERASE,Bscan,USB2\n");
    EXPECT_EQ(format("BS = outputs,USB2:families,kestrel\n", "base"),
              "BS = outputs,USB2: \\\n     families,kestrel\n");
}

TEST(Format, FillsListsAndShortRecords) {
    std::string list = "DEVICE_SUPPORTED = base";
    std::string properties = "PROPERTY = A,1";
    for (int i = 100; i < 130; ++i) {
        list += ",KS" + std::to_string(i);
        properties += ":P" + std::to_string(i) + ",1";
    }
    const std::string formattedList = format(list + '\n', "base");
    EXPECT_EQ(formattedList.find('\n'), 104U); // 102 columns and the backslash
    EXPECT_EQ(formattedList.find("\n                   KS"), formattedList.find('\n'));
    EXPECT_EQ(format(properties + '\n').find('\n'), 108U); // one more record would end after column 110
    EXPECT_EQ(format("PROPERTY = A,1: \\\n   B,2\n"), "PROPERTY = A,1:B,2\n");
}

TEST(Format, BreaksNoLineWhereTheReadersWouldDropABlank) {
    EXPECT_EQ(format("OPERATION = VERIFY,Bscan,USB2: ERASE,Bscan,USB2:A,B,C\n"),
              "OPERATION = VERIFY,Bscan,USB2: ERASE,Bscan,USB2: \\\n            A,B,C\n");
}

TEST(Format, KeepsUnknownKeysBrokenWhereTheyAre) {
    EXPECT_EQ(format("ODD = a,b: \\\nc:d\\\n  e\n"), "ODD = a,b: \\\n      c:d \\\n      e\n");
}

TEST(Format, KeepsCommentsByteForByte) {
    const std::string comments = "  # indented \t \n#\\\n# \xFF\r\n";
    EXPECT_EQ(format(comments + "A = 1\n"), comments + "A = 1\n");
}

TEST(Format, KeepsLinesThatAreNotValid) {
    EXPECT_EQ(format("  no sense  \nA=1\n[ x ]\nB  =  2\n"), "  no sense  \nA = 1\n[ x ]\nB = 2\n");
    EXPECT_EQ(format("A = 1 \\"), "A = 1 \\");
}

TEST(Format, KeepsByteOrderMarkAndLineEnds) {
    EXPECT_EQ(format("\xEF\xBB\xBF\r\nA=1\r\n\r\n\r\nB=2"), "\xEF\xBB\xBF"
                                                            "A = 1\r\n\r\nB = 2\r\n");
}

TEST(Format, LeavesOneBlankLineInAPlace) {
    EXPECT_EQ(format("\n\nA = 1\n \t\n\n[D1]\n\n\n"), "A = 1\n\n[D1]\n");
    EXPECT_EQ(format("[D1]\n[D2]\nA = 1\n# of D3\n[D3]\n"), "[D1]\n[D2]\nA = 1\n# of D3\n[D3]\n");
}

TEST(Format, KeepsWhatItsOwnFormWouldMisread) {
    EXPECT_EQ(format("A = 1\\ \nB = 2\n"), "A = 1\\ \nB = 2\n"); // a backslash as the last byte of a value
    EXPECT_EQ(format("A = \r"), "A = \r");
}

TEST(Format, OfAnyTextIsReadAlikeAndIsItsOwnForm) {
    HostileTexts random(4);
    for (int i = 0; i < 20000 && !HasFailure(); ++i) {
        const std::string text = i % 2 == 0 ? random.next(60) : random.noise(100);
        // A mark inside the file may come to its start.
        if (text.find("\xEF\xBB\xBF", 1) == text.npos) {
            const std::string once = format(text);
            EXPECT_TRUE(edit::readsAlike(AcdLines(text), AcdLines(once))) << text << "\nbecomes\n" << once;
            EXPECT_EQ(format(once), once) << text;
        }
    }
}
