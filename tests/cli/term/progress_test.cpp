// The progress bar, by a clock that the test sets.
#include "term/Progress.h"

#include <gmock/gmock.h>

namespace {

using namespace std::chrono_literals;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

class ProgressBar : public testing::Test {
protected:
    [[nodiscard]] Progress make(std::size_t width) {
        return {"counting", width, [this] { return m_now; },
                [this](std::string_view text) { m_written.emplace_back(text); }};
    }

    std::chrono::steady_clock::time_point m_now{100s};
    std::vector<std::string> m_written;
};

TEST_F(ProgressBar, ShowsNothingInTheFirstSecond) {
    {
        Progress progress = make(80);
        m_now += 999ms;
        progress.reach(1, 2);
    }
    EXPECT_THAT(m_written, IsEmpty());
}

TEST_F(ProgressBar, ShowsHowFarItIs) {
    Progress progress = make(80);
    m_now += 1s;
    progress.reach(1, 3);
    EXPECT_THAT(m_written, ElementsAre("\rtarvik: counting:  33 % [##########....................]"));
}

TEST_F(ProgressBar, IsRedrawnTenTimesASecondAtMost) {
    Progress progress = make(80);
    m_now += 1s;
    progress.reach(1, 100);
    m_now += 99ms;
    progress.reach(2, 100);
    EXPECT_EQ(m_written.size(), 1U);
    m_now += 1ms;
    progress.reach(3, 100);
    ASSERT_EQ(m_written.size(), 2U);
    EXPECT_THAT(m_written.back(), HasSubstr("  3 %"));
}

TEST_F(ProgressBar, IsWipedAtTheEnd) {
    std::size_t shown = 0;
    {
        Progress progress = make(80);
        m_now += 2s;
        progress.reach(3, 3);
        shown = m_written.back().size() - 1;
    }
    EXPECT_EQ(m_written.back(), '\r' + std::string(shown, ' ') + '\r');
}

TEST_F(ProgressBar, FitsANarrowTerminal) {
    for (const std::size_t width : {1U, 5U, 30U, 40U}) {
        Progress progress = make(width);
        m_now += 2s;
        progress.reach(1, 2);
        EXPECT_LT(m_written.back().size() - 1, width);
    }
}

TEST_F(ProgressBar, ShowsNothingWithoutATerminal) {
    {
        Progress progress = make(0);
        m_now += 5s;
        progress.reach(1, 2);
    }
    EXPECT_THAT(m_written, IsEmpty());
}

TEST_F(ProgressBar, TakesWorkThatIsNoneAndWorkThatIsMoreThanSaid) {
    Progress progress = make(80);
    m_now += 2s;
    progress.reach(0, 0);
    EXPECT_THAT(m_written, IsEmpty());
    progress.reach(5, 4);
    EXPECT_THAT(m_written.back(), HasSubstr("100 %"));
}

} // namespace
