// Files taken apart keep every byte, and are what the readers make of them.
#include "edit/SourceFile.h"

#include "host/database/HostileTexts.h"

#include <gtest/gtest.h>

#include <filesystem>

using edit::Element;
using edit::SourceFile;

namespace {

std::string whole(const SourceFile& file) {
    std::string text(file.byteOrderMark());
    for (const Element& element : file.elements()) {
        text += element.source;
    }
    return text;
}

/// Compares a file with the lines and comments that the readers have in it.
void compare(const std::string& text) {
    const SourceFile file(text, "k.acd", "k");
    ASSERT_EQ(whole(file), text);
    const AcdLines read(text);
    std::size_t lines = 0;
    std::size_t comments = 0;
    for (const Element& element : file.elements()) {
        if (element.kind == Element::Kind::COMMENT) {
            ASSERT_LT(comments, read.comments().size()) << text;
            const AcdLines::Comment& comment = read.comments()[comments++];
            EXPECT_NE(element.source.find(comment.text), element.source.npos);
            EXPECT_TRUE(text.substr(file.offsetOf(comment.line, comment.column)).starts_with(comment.text));
        } else if (element.kind == Element::Kind::LINE) {
            ASSERT_LT(lines, read.lines().size()) << text;
            const AcdLines::Line& line = read.lines()[lines++];
            if (element.source.starts_with("\xEF\xBB\xBF")) {
                continue; // alone it would begin a file
            }
            // The lines of the file alone are read as they are read in it.
            const AcdLines alone(element.source);
            ASSERT_EQ(alone.lines().size(), 1U) << element.source;
            EXPECT_EQ(alone.lines()[0].kind, line.kind);
            EXPECT_EQ(alone.lines()[0].name, line.name);
            EXPECT_EQ(alone.lines()[0].value, line.value);
            EXPECT_EQ(alone.lines()[0].error, line.error);
            EXPECT_EQ(element.line->line, line.line);
            if (!line.name.empty()) {
                EXPECT_EQ(text[file.offsetOf(line.line, line.column)], line.name.front());
            }
        }
    }
    EXPECT_EQ(lines, read.lines().size()) << text;
    EXPECT_EQ(comments, read.comments().size()) << text;
}

} // namespace

TEST(SourceFiles, AreTheirElements) {
    const SourceFile file("\xEF\xBB\xBF# a\r\n\r\nA = 1 \\\r\n  2\r\n[KS50]\r\n  nonsense", "k.acd", "k");
    ASSERT_EQ(file.elements().size(), 5U);
    EXPECT_EQ(file.elements()[0].source, "# a\r\n");
    EXPECT_EQ(file.elements()[1].kind, Element::Kind::BLANK);
    EXPECT_EQ(file.elements()[2].source, "A = 1 \\\r\n  2\r\n");
    EXPECT_EQ(file.elements()[2].line->value, "12");
    EXPECT_EQ(file.elements()[3].line->kind, AcdLines::Kind::HEADER);
    EXPECT_EQ(file.elements()[4].source, "  nonsense");
    EXPECT_EQ(file.lineEnd(), "\r\n");
    EXPECT_EQ(file.text()[file.offsetOf(1, 1)], '#');
    EXPECT_EQ(file.text()[file.offsetOf(4, 3)], '2');
    EXPECT_EQ(file.offsetOf(7, 1), file.text().size());
}

TEST(SourceFiles, KeepEveryByteOfTheDatabasesOfTheRepository) {
    std::size_t files = 0;
    for (const auto& entry : std::filesystem::recursive_directory_iterator(TARVIK_SOURCE_DIRECTORY)) {
        if (entry.path().extension() == ".acd" && entry.is_regular_file()) {
            ++files;
            compare(edit::readFile(entry.path().string()));
        }
    }
    EXPECT_GT(files, 100U);
}

TEST(SourceFiles, KeepEveryByteOfHostileTexts) {
    HostileTexts random(3);
    for (int i = 0; i < 3000 && !HasFailure(); ++i) {
        compare(random.next(60));
        compare(random.noise(200));
    }
}
