#include "quorl/reports/LibraryReport.h"

#include <gmock/gmock.h>

#include "tests/media/WithoutPrivileges.h"
#include "tests/quorl/QuorlProcess.h"
#include "tests/quorl/SampleMusic.h"

namespace quorl::tests {

namespace {

using testing::HasSubstr;

TEST(LibraryReport, namesEachPlaylistWithSongsSizeAndPath) {
    const SampleMusic music;
    QuorlProcess quorl({"--library", "--music", music.path()});
    EXPECT_EQ(quorl.end(), 0);
    EXPECT_THAT(quorl.output(), HasSubstr("3 playlists, 3 songs listed"));
    EXPECT_THAT(quorl.output(), HasSubstr("Long Run: 3 songs, 3 MB, Long Run.m3u8\n"));
    EXPECT_THAT(quorl.output(), HasSubstr("Road Trip: 1 song, 1 MB, Road Trip.m3u8\n"));
    EXPECT_THAT(quorl.output(), HasSubstr("Morning Mix.m3u8 (generated mix)\n"));
}

TEST(LibraryReport, saysWhatWasLeftOutAndWhy) {
    const SampleMusic music;
    QuorlProcess quorl({"--library", "--music", music.path()});
    EXPECT_EQ(quorl.end(), 0);
    EXPECT_THAT(quorl.output(), HasSubstr("Left out: 1\n"));
    EXPECT_THAT(quorl.output(), HasSubstr("Road Trip.m3u8: gone.flac: There is no such file."));
}

TEST(LibraryReport, isInTheUsersLanguage) {
    const SampleMusic music;
    QuorlProcess quorl({"--library", "--music", music.path()}, {{"LANGUAGE", "de"}});
    EXPECT_EQ(quorl.end(), 0);
    EXPECT_THAT(quorl.output(), HasSubstr(": 3 Playlists, 3 Titel darin\n"));
    EXPECT_THAT(quorl.output(), HasSubstr("Morning Mix.m3u8 (erzeugter Mix)\n"));
    EXPECT_THAT(quorl.output(), HasSubstr("\nAusgelassen: 1\n  Road Trip.m3u8: gone.flac: Diese "
                                          "Datei gibt es nicht."));
}

TEST(LibraryReport, marksFoldersOfPlaylists) {
    const SampleMusic music;
    music.folder().write("Workout/Intervals.m3u8", "../one.flac\n");
    QuorlProcess quorl({"--library", "--music", music.path()});
    EXPECT_EQ(quorl.end(), 0);
    EXPECT_THAT(quorl.output(), HasSubstr("Workout: 1 song, 1 MB, Workout (folder)\n"));
}

TEST(LibraryReport, namesSteerNoTerminal) {
    const SampleMusic music;
    music.folder().write("\x1B[2JList\xFF.m3u", "\x1B]0;title\a.mp3\n\xC2\x9B.mp3\n");
    QuorlProcess quorl({"--library", "--music", music.path()});
    EXPECT_EQ(quorl.end(), 0);
    EXPECT_THAT(quorl.output(), HasSubstr("\uFFFD[2JList\uFFFD.m3u\n"));
    EXPECT_TRUE(std::ranges::none_of(quorl.output(), [](char byte) {
        return byte != '\n' && byte >= 0 && byte < ' ';
    })) << quorl.output();
    EXPECT_THAT(quorl.output(), testing::Not(HasSubstr("\u009B")));
}

TEST(LibraryReport, missingFolderEndsWithThreeAndSaysWhatToDo) {
    QuorlProcess quorl({"--library", "--music", "/nonexistent"});
    EXPECT_EQ(quorl.end(), 3);
    EXPECT_THAT(quorl.errors(), HasSubstr("/nonexistent"));
    EXPECT_THAT(quorl.errors(), HasSubstr("Create it, or choose another one."));
}

TEST(LibraryReport, folderThatCannotBeReadIsNoSuccess) {
    const TemporaryDirectory music;
    std::filesystem::permissions(music.path(), std::filesystem::perms::none);
    const media::test::WithoutPrivileges ordinary;
    testing::internal::CaptureStderr();
    const auto code = printLibrary(music.path());
    EXPECT_THAT(testing::internal::GetCapturedStderr(),
                HasSubstr("cannot be read. Change its permissions"));
    EXPECT_EQ(code, ExitCode::Failure);
}

TEST(LibraryReport, withoutAnOptionReadsTheUsersMusicFolder) {
    const SampleMusic music;
    const TemporaryDirectory configuration;
    configuration.write("user-dirs.dirs", "XDG_MUSIC_DIR=\"" + music.path() + "\"\n");
    QuorlProcess quorl({"--library"}, {{"XDG_CONFIG_HOME", configuration.path().string()}});
    EXPECT_EQ(quorl.end(), 0);
    EXPECT_THAT(quorl.output(), HasSubstr("Road Trip"));
}

TEST(LibraryReport, listThatCannotBeWrittenIsAFailure) {
    const SampleMusic music;
    QProcess shell;
    shell.start(QStringLiteral("sh"),
                {QStringLiteral("-c"),
                 QStringLiteral("exec \"$0\" --library --music \"$1\" >/dev/full"),
                 QStringLiteral(QUORL_PROGRAM), QString::fromStdString(music.path())});
    ASSERT_TRUE(shell.waitForFinished());
    EXPECT_EQ(shell.exitCode(), 1);
}

} // namespace

} // namespace quorl::tests
