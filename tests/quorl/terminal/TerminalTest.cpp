#include <csignal>
#include <limits>

#include <gmock/gmock.h>
#include <sys/wait.h>

#include "platform/NSInteger.h"
#include "tests/quorl/SampleMusic.h"
#include "tests/quorl/StoredPreferences.h"
#include "tests/quorl/terminal/PseudoTerminal.h"

namespace quorl::tests {

namespace {

using testing::HasSubstr;
using testing::Not;
using testing::StartsWith;

constexpr PseudoTerminal::Size usual{80, 24};
constexpr const char* overview =
    "A number chooses, b goes back, / searches, + - turn pages, ? explains, q leaves.";

/// The Music pane in a terminal.
class Terminal : public testing::Test {
  protected:
    [[nodiscard]] static PseudoTerminal open(PseudoTerminal::Size size,
                                             const Environment& environment = {}) {
        return PseudoTerminal({QUORL_PROGRAM, "--text"}, size, environment);
    }

    void addPlaylists(int count) const {
        for (int number = 1; number <= count; ++number) {
            music_.addPlaylist("Evening " + std::to_string(1000 + number));
        }
    }

    /// Opens the playlist chooser, which shows `row`.
    static void choosePlaylist(PseudoTerminal& terminal, const std::string& row) {
        terminal.waitFor("  1  Synced Playlist");
        terminal.type("1\r");
        terminal.waitFor(row);
    }

    SampleMusic music_;
};

TEST_F(Terminal, saysInItsFirstLineHowToGoOn) {
    auto terminal = open(usual);
    terminal.waitFor("Synced Playlist: None");
    EXPECT_EQ(terminal.lines()[0], overview);
    EXPECT_THAT(terminal.screen(), HasSubstr("\n\nMusic\n\nMusic Syncing\n  1  Synced"));
    EXPECT_EQ(terminal.lines()[23], ">");
    EXPECT_EQ(terminal.cursorColumn(), 2);
}

TEST_F(Terminal, rewritesOnlyTheLineThatChanges) {
    auto terminal = open(usual);
    terminal.waitFor("  2  Playlist Limit: 500 MB");
    terminal.waitFor("\n>");
    const auto before = terminal.lines();
    (void)terminal.takeWritten();
    storePreference("asset-sync-limit", "just 1024");
    terminal.waitFor("  2  Playlist Limit: 1 GB");
    EXPECT_THAT(terminal.takeWritten(), Not(HasSubstr("Synced Playlist")));
    auto after = terminal.lines();
    for (std::size_t line = 0; line < after.size(); ++line) {
        if (after[line] != "  2  Playlist Limit: 1 GB") {
            EXPECT_EQ(after[line], before[line]);
        }
    }
}

TEST_F(Terminal, whatIsTypedStaysWhileRowsChange) {
    auto terminal = open(usual);
    terminal.waitFor("  2  Playlist Limit: 500 MB");
    terminal.type("/tri\x7fpp");
    terminal.waitFor("> /trpp");
    storePreference("asset-sync-limit", "just 1024");
    terminal.waitFor("Playlist Limit: 1 GB");
    EXPECT_EQ(terminal.lines()[23], "> /trpp");
    EXPECT_EQ(terminal.cursorColumn(), 7);
}

TEST_F(Terminal, aPlaylistIsChosenByItsNumber) {
    auto terminal = open(usual);
    choosePlaylist(terminal, "  2  Road Trip");
    terminal.type("2\r");
    terminal.waitFor("  2  ✓ Road Trip: Sync Pending…");
    EXPECT_EQ(storedPreference("asset-sync-enabled"), "true");
    terminal.type("b\r");
    terminal.waitFor("Synced Playlist: Sync Pending…");
    EXPECT_THAT(terminal.screen(), Not(HasSubstr("Long Run")));
}

TEST_F(Terminal, wordsFindRowsAsInTheWindow) {
    auto terminal = open(usual);
    choosePlaylist(terminal, "  2  Road Trip");
    terminal.type("/rÖAD\r");
    terminal.waitFor("  1  Road Trip");
    EXPECT_THAT(terminal.screen(), HasSubstr("1 of 3 rows have “rÖAD” in their names"));
    EXPECT_THAT(terminal.screen(), Not(HasSubstr("Long Run")));
    terminal.type("1\r");
    terminal.waitFor("  1  ✓ Road Trip");
    terminal.type("b\r");
    terminal.waitFor("  1  Long Run");
}

TEST_F(Terminal, aNumberWithoutARowSaysWhichThereAre) {
    auto terminal = open(usual);
    terminal.waitFor("Playlist Limit");
    terminal.type("99\r");
    terminal.waitFor("There is no row 99. There are rows 1 to ");
    terminal.type("99999999999999999999\r");
    terminal.waitFor("There is no row " + std::to_string(std::numeric_limits<NSInteger>::max()) +
                     ".");
    terminal.type("hello\r");
    terminal.waitFor("“hello” is not understood. A number chooses,");
    EXPECT_EQ(terminal.lines()[23], ">");
}

TEST_F(Terminal, aLongListHasPages) {
    addPlaylists(60);
    auto terminal = open(usual);
    choosePlaylist(terminal, "  1  Evening 1001");
    terminal.waitFor("Rows 1 to 15 of 63: + shows what comes after, - what comes before.");
    terminal.type("+\r");
    terminal.waitFor("Rows 16 to 34 of 63");
    EXPECT_THAT(terminal.screen(), HasSubstr(" 34  Evening 1034"));
    terminal.type("\x1b[6~"); // the key Page Down
    terminal.waitFor("Rows 35 to 53 of 63");
    terminal.type("+\r");
    terminal.waitFor(" None");
    terminal.type("+\r");
    terminal.waitFor("This is the last page.");
    terminal.type("\x1b[5~"); // the key Page Up
    terminal.waitFor("Evening 1030");
}

TEST_F(Terminal, aRowOfAnotherPageIsShownBeforeItIsChosen) {
    addPlaylists(60);
    auto terminal = open(usual);
    choosePlaylist(terminal, "  1  Evening 1001");
    terminal.type("40\r");
    terminal.waitFor(" 40  Evening 1040");
    EXPECT_THAT(terminal.screen(), HasSubstr("Row 40 was on another page. Type 40 again"));
    EXPECT_EQ(storedPreference("asset-sync-enabled"), "false");
    terminal.type("40\r");
    terminal.waitFor(" 40  ✓ Evening 1040");
}

TEST_F(Terminal, anotherSizeShowsMoreOrLess) {
    addPlaylists(60);
    auto terminal = open(usual);
    choosePlaylist(terminal, "Rows 1 to 15 of 63");
    terminal.type("/ev");
    terminal.waitFor("> /ev");
    terminal.resize({40, 12});
    terminal.waitFor("Rows 1 to 2 of 63");
    EXPECT_EQ(terminal.lines()[0], "? explains, q leaves");
    EXPECT_EQ(terminal.lines()[11], "> /ev");
    terminal.resize({100, 40});
    terminal.waitFor("Rows 1 to 31 of 63");
    EXPECT_EQ(terminal.lines()[0], overview);
    EXPECT_EQ(terminal.lines()[39], "> /ev");
}

TEST_F(Terminal, twentyColumnsHoldNameAndValue) {
    auto terminal = open({20, 30});
    terminal.waitFor("  2  Playli…: 500 MB");
    EXPECT_EQ(terminal.lines()[0], "? explains, q leaves");
    terminal.type("99\r");
    terminal.waitFor("There are rows 1 to");
}

TEST_F(Terminal, wideCharactersAreNotCutInHalf) {
    music_.addPlaylist("夜の音楽を聴く時間");
    music_.addPlaylist("ééééééééééééééééé");
    auto terminal = open({20, 24});
    terminal.waitFor("  1  ");
    terminal.type("1\r");
    terminal.waitFor("  4  夜の音楽を聴く…");
    terminal.waitFor("éééééééééééééé…");
}

TEST_F(Terminal, titlesFromRightToLeftStayWhereTheyAre) {
    music_.addPlaylist("שירים");
    auto terminal = open(usual);
    choosePlaylist(terminal, "שירים");
    EXPECT_THAT(terminal.takeWritten(), HasSubstr("  3  \u2068שירים\u2069"));
}

TEST_F(Terminal, noticesAreOnThePage) {
    storePreference("music-folder", "/nonexistent");
    auto terminal = open(usual);
    terminal.waitFor("/nonexistent");
    EXPECT_EQ(terminal.lines()[23], ">");
}

TEST_F(Terminal, whatIsTypedBeforeTheFirstPageIsTaken) {
    auto terminal = open(usual);
    terminal.type("2\r2\r");
    terminal.waitFor("  2  ");
    terminal.type("q\r");
    EXPECT_EQ(terminal.end(), 0);
}

TEST_F(Terminal, hasItsUsualModeAndItsOldScreenInTheEnd) {
    auto terminal = open(usual);
    terminal.waitFor("Synced Playlist");
    EXPECT_FALSE(terminal.hasUsualMode());
    terminal.type("q\r");
    EXPECT_EQ(terminal.end(), 0);
    EXPECT_TRUE(terminal.hasUsualMode());
    EXPECT_THAT(terminal.screen(), Not(HasSubstr("Synced Playlist")));
}

TEST_F(Terminal, endOfInputLeaves) {
    auto terminal = open(usual);
    terminal.waitFor("Synced Playlist");
    terminal.type("\x04");
    EXPECT_EQ(terminal.end(), 0);
}

class SignalledTerminal : public Terminal, public testing::WithParamInterface<int> {};

TEST_P(SignalledTerminal, isPutInOrderBeforeTheEnd) {
    auto terminal = open(usual);
    terminal.waitFor("Synced Playlist");
    terminal.signal(GetParam());
    const int status = terminal.end();
    EXPECT_TRUE(WIFSIGNALED(status));
    EXPECT_EQ(WTERMSIG(status), GetParam());
    EXPECT_TRUE(terminal.hasUsualMode());
    EXPECT_THAT(terminal.screen(), Not(HasSubstr("Synced Playlist")));
}

INSTANTIATE_TEST_SUITE_P(By, SignalledTerminal, testing::Values(SIGINT, SIGTERM, SIGHUP));

TEST_F(Terminal, isTheShellsWhileTheAppIsStopped) {
    PseudoTerminal terminal({"sh", "-i"}, usual, {{"PS1", "shell>"}});
    terminal.waitFor("shell>");
    terminal.type("'" QUORL_PROGRAM "' --text\r");
    terminal.waitFor("Synced Playlist: None");
    terminal.type("\x1a");
    terminal.waitFor("Stopped");
    terminal.waitUntilGone("Synced Playlist");
    EXPECT_TRUE(terminal.hasUsualMode());
    terminal.type("fg\r");
    terminal.waitFor("Synced Playlist: None");
    EXPECT_FALSE(terminal.hasUsualMode());
    terminal.type("1\r");
    terminal.waitFor("Long Run");
    terminal.type("q\r");
    terminal.waitUntilGone("Synced Playlist");
    terminal.type("echo it en''ded\r");
    terminal.waitFor("it ended");
    EXPECT_TRUE(terminal.hasUsualMode());
}

TEST_F(Terminal, thatOnlyAddsLinesGetsThoseThatChange) {
    // What it says of the engine, at any time, is no part of the page.
    PseudoTerminal terminal({"sh", "-c", "exec '" QUORL_PROGRAM "' --text 2>/dev/null"}, usual,
                            {{"TERM", "dumb"}});
    terminal.waitFor("  2  Playlist Limit: 500 MB");
    terminal.waitForEnding("playback.\r\n\r\n");
    EXPECT_TRUE(terminal.hasUsualMode());
    EXPECT_THAT(terminal.screen(), StartsWith(overview));
    (void)terminal.takeWritten();
    storePreference("asset-sync-limit", "just 1024");
    terminal.waitForEnding("\n");
    EXPECT_EQ(terminal.takeWritten(), "  2  Playlist Limit: 1 GB\r\n");
    terminal.type("q\r");
    EXPECT_EQ(terminal.end(), 0);
}

} // namespace

} // namespace quorl::tests
