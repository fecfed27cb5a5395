#include <sstream>

#include <gmock/gmock.h>

#include "tests/quorl/QuorlProcess.h"
#include "tests/quorl/SampleMusic.h"
#include "tests/quorl/StoredPreferences.h"

namespace quorl::tests {

namespace {

using testing::HasSubstr;
using testing::Not;

constexpr const char* overview =
    "A number chooses, b goes back, / searches, + - turn pages, ? explains, q leaves.";

class Text : public testing::Test {
  protected:
    [[nodiscard]] std::vector<std::string> arguments() const { return {"--text"}; }

    SampleMusic music_;
};

TEST_F(Text, rootPaneHasNumberedRowsWithTheirValues) {
    QuorlProcess quorl(arguments());
    quorl.say("q");
    EXPECT_EQ(quorl.end(), 0);
    EXPECT_THAT(quorl.output(), HasSubstr("Music\n\nMusic Syncing\n  1  Synced Playlist: None\n"));
    EXPECT_THAT(quorl.output(), HasSubstr("  2  Playlist Limit: 500 MB\n"));
}

TEST_F(Text, footersAreWrappedToEightyColumnsWithoutATerminal) {
    QuorlProcess quorl(arguments());
    EXPECT_EQ(quorl.end(), 0);
    EXPECT_THAT(quorl.output(), HasSubstr("      This playlist syncs when"));
    std::istringstream lines(quorl.output());
    for (std::string line; std::getline(lines, line);) {
        EXPECT_LE(line.size(), 80U) << line;
    }
}

TEST_F(Text, paneAndAppSpeakOneLanguage) {
    for (const auto* languages : {"de", "xx:de_AT:fr"}) {
        QuorlProcess quorl(arguments(), {{"LANGUAGE", languages}});
        quorl.readUntil("Synchronisierte Playlist: Keine\n");
        quorl.say("b");
        quorl.readUntil("Der Synchronisierungsdienst läuft nicht");
        EXPECT_EQ(quorl.end(), 0);
    }
}

TEST_F(Text, endOfInputLeaves) {
    QuorlProcess quorl(arguments());
    quorl.closeInput();
    EXPECT_EQ(quorl.end(), 0);
}

TEST_F(Text, tappedPlaylistIsCheckedAndStored) {
    QuorlProcess quorl(arguments());
    quorl.say("1");
    quorl.readUntil("  3  ✓ None\n");
    quorl.say("2");
    quorl.readUntil("  2  ✓ Road Trip: Sync Pending…\n");
    quorl.say("b");
    quorl.readUntil("Synced Playlist: Sync Pending…\n");
    EXPECT_EQ(quorl.end(), 0);
    EXPECT_EQ(storedPreference("asset-sync-enabled"), "true");
    EXPECT_THAT(storedPreference("asset-sync-playlist-persistent-id"), Not(HasSubstr("nothing")));
}

TEST_F(Text, generatedPlaylistsCannotBeChosen) {
    QuorlProcess quorl(arguments());
    quorl.say("1");
    EXPECT_THAT(quorl.readUntil("None\n\n"), Not(HasSubstr("Morning Mix")));
    EXPECT_EQ(quorl.end(), 0);
}

TEST_F(Text, lastLineWithoutALineFeedCountsToo) {
    QProcess shell;
    shell.start(QStringLiteral("sh"),
                {QStringLiteral("-c"), QStringLiteral("printf 2 | \"$0\" --text --music \"$1\""),
                 QStringLiteral(QUORL_PROGRAM), QString::fromStdString(music_.path())});
    ASSERT_TRUE(shell.waitForFinished());
    EXPECT_THAT(shell.readAllStandardOutput().toStdString(), HasSubstr("✓ 500 MB"));
}

TEST_F(Text, beginsWithHowToGoOn) {
    QuorlProcess quorl(arguments());
    EXPECT_EQ(quorl.readUntil("\n"), std::string(overview) + '\n');
    EXPECT_EQ(quorl.end(), 0);
}

TEST_F(Text, whatIsNoCommandIsToldWhatIs) {
    QuorlProcess quorl(arguments());
    quorl.readUntil("Playlist Limit: 500 MB\n");
    for (const std::string line : {"hello", "-1", "bb"}) {
        quorl.say(line);
        quorl.readUntil("“" + line + "” is not understood. A number chooses");
    }
    for (const std::string line : {"0", "7"}) {
        quorl.say(line);
        quorl.readUntil("There is no row " + line + ". There are rows 1 to ");
    }
    quorl.say("?");
    quorl.readUntil("q leaves.\n");
    EXPECT_EQ(quorl.end(), 0);
}

TEST_F(Text, emptyLineShowsThePageAgain) {
    QuorlProcess quorl(arguments());
    quorl.readUntil("Playlist Limit: 500 MB\n");
    quorl.say("");
    quorl.readUntil("Music\n\nMusic Syncing\n");
    EXPECT_EQ(quorl.end(), 0);
}

TEST_F(Text, wordsFindRows) {
    QuorlProcess quorl(arguments());
    quorl.say("1");
    quorl.say("/road");
    quorl.say("1");
    quorl.readUntil("1 of 3 rows have “road” in their names; / alone shows all.\n");
    quorl.readUntil("  1  ✓ Road Trip: Sync Pending…\n");
    quorl.say("/");
    quorl.readUntil("  2  ✓ Road Trip: Sync Pending…\n");
    EXPECT_EQ(quorl.end(), 0);
}

TEST_F(Text, onlyTheRowThatChangesIsPrinted) {
    QuorlProcess quorl(arguments());
    quorl.readUntil("Playlist Limit: 500 MB\n");
    quorl.readUntil("\n\n");
    storePreference("asset-sync-limit", "just 1024");
    EXPECT_EQ(quorl.readUntil("1 GB\n"), "  2  Playlist Limit: 1 GB\n");
    EXPECT_EQ(quorl.end(), 0);
}

TEST_F(Text, preferenceChangedByAnotherProgramShowsUp) {
    QuorlProcess quorl(arguments());
    quorl.readUntil("Playlist Limit: 500 MB");
    storePreference("asset-sync-limit", "just 1024");
    quorl.readUntil("Playlist Limit: 1 GB");
    EXPECT_EQ(quorl.end(), 0);
}

TEST_F(Text, playlistAddedOnDiskShowsUpInTheChooser) {
    QuorlProcess quorl(arguments());
    quorl.say("1");
    quorl.readUntil("  3  ✓ None");
    music_.addPlaylist("Quiet Evening");
    quorl.readUntil("  2  Quiet Evening");
    EXPECT_EQ(quorl.end(), 0);
}

TEST_F(Text, limitByNumberOfSongsIsShownOnTheRootPane) {
    QuorlProcess quorl(arguments());
    for (const char* line : {"2", "2", "5", "b"}) {
        quorl.say(line);
    }
    quorl.readUntil("Playlist Limit: 125 Songs\n");
    EXPECT_EQ(quorl.end(), 0);
    EXPECT_EQ(storedPreference("asset-sync-limit"), "@mt 125");
}

TEST_F(Text, controlCharactersInNamesDoNotReachTheTerminal) {
    music_.folder().write("Evil.m3u8", "#PLAYLIST:Evil\x1b[2J\none.flac\n");
    QuorlProcess quorl(arguments());
    quorl.say("1");
    const auto shown = quorl.readUntil("✓ None");
    EXPECT_THAT(shown, HasSubstr("Evil"));
    EXPECT_THAT(shown, Not(HasSubstr("\x1b")));
    EXPECT_EQ(quorl.end(), 0);
}

TEST_F(Text, missingMusicFolderIsToldOnStandardError) {
    QuorlProcess quorl({"--text", "--music", "/nonexistent"});
    EXPECT_EQ(quorl.end(), 0);
    EXPECT_THAT(quorl.errors(), HasSubstr("/nonexistent"));
    EXPECT_THAT(quorl.output(), HasSubstr("Synced Playlist: None"));
}

TEST_F(Text, withoutASessionBusItSaysSoAndWorksForItself) {
    QuorlProcess quorl(arguments(), {{"DBUS_SESSION_BUS_ADDRESS", ""}, {"XDG_RUNTIME_DIR", ""}});
    quorl.say("1");
    quorl.say("2");
    quorl.readUntil("✓ Road Trip");
    EXPECT_EQ(quorl.end(), 0);
    EXPECT_THAT(quorl.errors(), HasSubstr("quorl: "));
}

TEST_F(Text, neverLooksForADisplay) {
    QuorlProcess quorl(arguments(), {{"DISPLAY", ":99"}, {"QT_QPA_PLATFORM", "none-such"}});
    EXPECT_EQ(quorl.end(), 0);
}

} // namespace

} // namespace quorl::tests
