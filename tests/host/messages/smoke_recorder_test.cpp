// The recorder of smoke tests: how pieces become one text.
#include <TarvikSmokeMgr.h>

#include <gtest/gtest.h>

#include <string>

namespace {

// Volatile, so that no compiler knows it for a null that it would warn of.
const char* volatile noText = nullptr;

std::string textOf(const TarvikSmokeMgr& recorder) {
    return {recorder.text().c_str(), recorder.text().GetLength()};
}

TEST(SmokeRecorder, StartsEmpty) { EXPECT_EQ(textOf(TarvikSmokeMgr()), ""); }

TEST(SmokeRecorder, JoinsPiecesAsTheyCome) {
    TarvikSmokeMgr recorder;
    recorder.smokeStatus("1 ");
    recorder.smokeStatus("0 ");
    recorder.smokeStatus("\n");
    EXPECT_EQ(textOf(recorder), "1 0 \n");
}

TEST(SmokeRecorder, IsSafeWhateverAPieceHolds) {
    TarvikSmokeMgr recorder;
    recorder.smokeStatus("%s%n 100%% 50%");
    EXPECT_EQ(textOf(recorder), "%s%n 100% 50%");
}

TEST(SmokeRecorder, TakesAPieceThatIsNoConstant) {
    const std::string name = "%sKS50%";
    TarvikSmokeMgr recorder;
    recorder.smokeStatus(name.c_str());
    EXPECT_EQ(textOf(recorder), name);
}

TEST(SmokeRecorder, FormatsWhatComesWithArguments) {
    TarvikSmokeMgr recorder;
    recorder.smokeStatus("%-4.4s|", "kestrel");
    recorder.smokeStatus("%d %s", 7, noText);
    EXPECT_EQ(textOf(recorder), "kest|7 (null)");
}

TEST(SmokeRecorder, RecordsNulsThatAFormatGives) {
    TarvikSmokeMgr recorder;
    recorder.smokeStatus("a%cb", '\0');
    recorder.smokeStatus("c");
    EXPECT_EQ(textOf(recorder), std::string("a\0bc", 4));
}

TEST(SmokeRecorder, RecordsNothingForNull) {
    TarvikSmokeMgr recorder;
    recorder.smokeStatus(noText);
    recorder.smokeStatus(noText, 1);
    EXPECT_EQ(textOf(recorder), "");
}

TEST(SmokeRecorder, CanRecordItsOwnText) {
    TarvikSmokeMgr recorder;
    recorder.smokeStatus("a longer text than any small buffer holds");
    recorder.smokeStatus(recorder.text().c_str());
    recorder.smokeStatus("%s", recorder.text().c_str());
    const std::string once = "a longer text than any small buffer holds";
    EXPECT_EQ(textOf(recorder), once + once + once + once);
}

TEST(SmokeRecorder, IsCopiedWithItsText) {
    TarvikSmokeMgr recorder;
    recorder.smokeStatus("one");
    TarvikSmokeMgr copy = recorder;
    copy.smokeStatus(" two");
    EXPECT_EQ(textOf(copy), "one two");
    EXPECT_EQ(textOf(recorder), "one");
}

} // namespace
