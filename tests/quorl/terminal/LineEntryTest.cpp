#include "quorl/terminal/LineEntry.h"

#include <gmock/gmock.h>

namespace quorl::tests {

namespace {

class LineEntryTest : public testing::Test {
  protected:
    LineEntry entry_ = LineEntry({{"\x1b[6~", "+"}, {"\f", ""}});
};

TEST_F(LineEntryTest, givesLinesInTheirOrder) {
    entry_.take("1\n b \r2");
    EXPECT_EQ(entry_.takeLine(), "1");
    EXPECT_EQ(entry_.takeLine(), "b");
    EXPECT_EQ(entry_.takeLine(), std::nullopt);
    EXPECT_EQ(entry_.typed(), "2");
}

TEST_F(LineEntryTest, lastLineCountsWithoutAnEndToo) {
    entry_.take("1");
    entry_.end();
    EXPECT_EQ(entry_.takeLine(), "1");
    EXPECT_TRUE(entry_.isAtEnd());
}

TEST_F(LineEntryTest, takesBackWholeCharacters) {
    entry_.take("/ae\u0301");
    entry_.take("\x7f");
    EXPECT_EQ(entry_.typed(), "/a");
    entry_.take("\x15");
    EXPECT_EQ(entry_.typed(), "");
    entry_.take("\b\b1\n");
    EXPECT_EQ(entry_.takeLine(), "1");
}

TEST_F(LineEntryTest, keysStandForLinesAndLeaveWhatIsTyped) {
    entry_.take("12\x1b[");
    entry_.take("6~3");
    EXPECT_EQ(entry_.takeLine(), "+");
    EXPECT_EQ(entry_.typed(), "123");
    entry_.take("\f");
    EXPECT_EQ(entry_.takeLine(), "");
    EXPECT_EQ(entry_.typed(), "123");
}

TEST_F(LineEntryTest, unknownKeysLeaveNothing) {
    entry_.take("1\x1b[1;5C\x1bOP\x1b\x1b[A2");
    EXPECT_EQ(entry_.typed(), "12");
    EXPECT_EQ(entry_.takeLine(), std::nullopt);
}

TEST_F(LineEntryTest, endsWithControlDOnlyWhereNothingIsTyped) {
    entry_.take("1\x04");
    EXPECT_FALSE(entry_.isAtEnd());
    entry_.take("\n\x04");
    EXPECT_TRUE(entry_.isAtEnd());
    EXPECT_EQ(entry_.takeLine(), "1");
}

TEST_F(LineEntryTest, closedGivesNothingMore) {
    entry_.take("1\n2");
    entry_.close();
    EXPECT_EQ(entry_.takeLine(), std::nullopt);
    EXPECT_EQ(entry_.typed(), "");
    EXPECT_TRUE(entry_.isAtEnd());
}

} // namespace

} // namespace quorl::tests
