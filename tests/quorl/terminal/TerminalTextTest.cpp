#include "quorl/terminal/sheets/TerminalText.h"

#include <gmock/gmock.h>

namespace quorl::tests {

namespace {

using testing::ElementsAre;

constexpr const char* family = "\U0001F468\u200D\U0001F469\u200D\U0001F467"; // one sign

TEST(TerminalText, hasTwoColumnsForAWideCharacterAndNoneForAMark) {
    EXPECT_EQ(columnsOf("abc"), 3);
    EXPECT_EQ(columnsOf("夜"), 2);
    EXPECT_EQ(columnsOf("e\u0301"), 1);
    EXPECT_EQ(columnsOf("\u2764\uFE0F"), 2);
    EXPECT_EQ(columnsOf("\u2068a\u2069"), 1);
    EXPECT_EQ(columnsOf(""), 0);
}

TEST(TerminalText, isShortenedBetweenCharacters) {
    EXPECT_EQ(shortened("abcdef", 6), "abcdef");
    EXPECT_EQ(shortened("abcdef", 5), "abcd…");
    EXPECT_EQ(shortened("夜の音楽", 6), "夜の…");
    EXPECT_EQ(shortened("夜の音楽", 5), "夜の…");
    EXPECT_EQ(shortened("夜の音楽", 4), "夜…");
    EXPECT_EQ(shortened("ae\u0301e\u0301e\u0301", 3), "ae\u0301…");
    EXPECT_EQ(shortened("abc", 1), "…");
    EXPECT_EQ(shortened("abc", 0), "");
}

TEST(TerminalText, keepsSignsWhole) {
    EXPECT_EQ(shortened(std::string("ab") + family + "c", 6), "ab…");
    EXPECT_EQ(withoutLastCharacter(std::string("ab") + family), "ab");
    EXPECT_EQ(withoutLastCharacter("ae\u0301"), "a");
    EXPECT_EQ(withoutLastCharacter(""), "");
}

TEST(TerminalText, isShortenedAtItsBeginningToo) {
    EXPECT_EQ(shortenedToEnd("abcdef", 4), "…def");
    EXPECT_EQ(shortenedToEnd("夜の音楽", 6), "…音楽");
    EXPECT_EQ(shortenedToEnd("abc", 3), "abc");
}

TEST(TerminalText, isIsolatedWhereItRunsFromRightToLeft) {
    EXPECT_EQ(isolated("abc"), "abc");
    EXPECT_EQ(isolated("1 שיר"), "\u20681 שיר\u2069");
    EXPECT_EQ(isolated("أغنية"), "\u2068أغنية\u2069");
}

TEST(TerminalText, isWrappedAtSpaces) {
    EXPECT_THAT(wrapped("one two three\n\nfour", 8, " ", LongWords::Whole),
                ElementsAre(" one two", " three", "", " four"));
    EXPECT_THAT(wrapped("夜の 音楽", 8, "", LongWords::Whole), ElementsAre("夜の", "音楽"));
}

TEST(TerminalText, breaksLongWordsWhereItIsToldTo) {
    EXPECT_THAT(wrapped("a /long/path b", 6, "", LongWords::Whole),
                ElementsAre("a", "/long/path", "b"));
    EXPECT_THAT(wrapped("a /long/path b", 6, "", LongWords::Broken),
                ElementsAre("a", "/long/", "path b"));
    EXPECT_THAT(wrapped("夜の音楽", 5, " ", LongWords::Broken), ElementsAre(" 夜の", " 音楽"));
}

} // namespace

} // namespace quorl::tests
