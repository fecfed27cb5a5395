#include "services/media/playlists/LeftOut.h"

#include <filesystem>
#include <string>

#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/stat.h>

#include "services/media/MusicFolder.h"
#include "services/media/playlists/PlaylistContent.h"
#include "tests/base/TemporaryDirectory.h"
#include "tests/media/Inventories.h"
#include "tests/media/WithoutPrivileges.h"

namespace quorl::media::test {

using tests::TemporaryDirectory;

namespace {

using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

constexpr std::string_view track = "<track><location>one.mp3</location></track>";

/// The one thing that is left out, which says why.
LeftOut onlyOneOf(const Inventory& inventory) {
    EXPECT_EQ(inventory.leftOut.size(), 1U);
    return inventory.leftOut.at(0);
}

} // namespace

TEST(LeftOutTest, ARecordTellsPlaylistEntryAndReasonAndTheOtherEntriesStay) {
    const TemporaryDirectory folder;
    folder.writeSongs({"one.mp3", "two.mp3"});
    folder.write("lists/List.m3u", "../one.mp3\n..\\gone%20away.mp3\n../two.mp3\n");

    const auto inventory = scan(folder.path());

    EXPECT_THAT(songsOf(*inventory, "lists/List.m3u"), ElementsAre("one.mp3", "two.mp3"));
    EXPECT_EQ(onlyOneOf(*inventory),
              (LeftOut{"lists/List.m3u", "..\\gone%20away.mp3", Reason::Missing}));
}

TEST(LeftOutTest, RecordsAreInTheOrderOfPathsAndEntries) {
    const TemporaryDirectory folder;
    folder.write("b.m3u", "#PLAYLIST:A\nz\ny\n");
    folder.write("a.m3u", "#PLAYLIST:B\nx\n");

    const auto inventory = scan(folder.path());

    EXPECT_THAT(inventory->leftOut, ElementsAre(LeftOut{"a.m3u", "x", Reason::Missing},
                                                LeftOut{"b.m3u", "z", Reason::Missing},
                                                LeftOut{"b.m3u", "y", Reason::Missing}));
}

TEST(LeftOutTest, AnEntryThatIsNotUtf8IsRecordedInUtf8) {
    const TemporaryDirectory folder;
    folder.write("List.m3u", "F\xFC\xDF"
                             "e.mp3\n");

    EXPECT_EQ(onlyOneOf(*scan(folder.path())).entry, "Füße.mp3");
}

TEST(LeftOutTest, AddressesOnOtherMachines) {
    const TemporaryDirectory folder;
    folder.write("a.m3u", "http://radio.example/stream.mp3\nmms://a.example/b\n"
                          "SMB://server/share/one.mp3\nfile://server/share/one.mp3\n");
    folder.write("b.xspf", "<playlist><trackList><track><location>https://a.example/1.mp3"
                           "</location></track></trackList></playlist>");

    const auto inventory = scan(folder.path());

    EXPECT_THAT(reasonsFor(*inventory, "a.m3u"),
                ElementsAre(Reason::RemoteAddress, Reason::RemoteAddress, Reason::RemoteAddress,
                            Reason::RemoteAddress));
    EXPECT_THAT(reasonsFor(*inventory, "b.xspf"), ElementsAre(Reason::RemoteAddress));
}

TEST(LeftOutTest, AbsolutePathsOfOtherSystems) {
    const TemporaryDirectory folder;
    folder.write("a.m3u", "C:\\Music\\one.mp3\nd:/Music/one.mp3\n\\\\server\\share\\one.mp3\n"
                          "\\Music\\one.mp3\nfile:///C:/Music/one.mp3\nfile://C:/Music/one.mp3\n"
                          "/D:/one.mp3\n");
    folder.write("b.xspf", "<playlist><trackList><track><location>C%3A%5Cone.mp3</location>"
                           "</track></trackList></playlist>");

    const auto inventory = scan(folder.path());

    EXPECT_THAT(reasonsFor(*inventory, "a.m3u"), testing::Each(Reason::OtherSystem));
    EXPECT_EQ(reasonsFor(*inventory, "a.m3u").size(), 7U);
    EXPECT_THAT(reasonsFor(*inventory, "b.xspf"), ElementsAre(Reason::OtherSystem));
}

TEST(LeftOutTest, FilesOutsideTheFolderWhetherTheyExistOrNot) {
    const TemporaryDirectory folder;
    folder.writeSongs({"outside.mp3", "MusicOther/one.mp3"});
    folder.link("Music/link.mp3", "../outside.mp3");
    folder.link("Music/linked", "../MusicOther");
    folder.write("Music/List.m3u",
                 (folder / "outside.mp3").string() + "\n" + //
                     "../outside.mp3\n..\\outside.mp3\nlink.mp3\nlinked/one.mp3\n../gone.mp3\n"
                     "/gone/away.mp3\n../MusicOther/one.mp3\n");

    const auto inventory = scan(folder / "Music");

    EXPECT_THAT(reasonsFor(*inventory, "List.m3u"), testing::Each(Reason::OutsideFolder));
    EXPECT_EQ(reasonsFor(*inventory, "List.m3u").size(), 8U);
    EXPECT_EQ(inventory->songs.size(), 0U);
    EXPECT_FALSE(inventory->hasAudio);
}

TEST(LeftOutTest, FilesThatAreMissing) {
    const TemporaryDirectory folder;
    folder.writeSongs({"one.mp3"});
    folder.link("dangling.mp3", "nowhere.mp3");
    folder.link("circle.mp3", "circle.mp3");
    folder.write("List.m3u", "gone.mp3\nno/such/directory.mp3\none.mp3/two.mp3\ndangling.mp3\n"
                             "circle.mp3\n" +
                                 (folder / "gone.mp3").string() + "\n" + std::string(5000, 'x') +
                                 "\n");

    const auto inventory = scan(folder.path());

    EXPECT_THAT(reasonsFor(*inventory, "List.m3u"), testing::Each(Reason::Missing));
    EXPECT_EQ(reasonsFor(*inventory, "List.m3u").size(), 7U);
}

TEST(LeftOutTest, FilesThatAreMissingBehindALinkToTheFolder) {
    const TemporaryDirectory folder;
    folder.makeDirectory("disk");
    folder.link("Music", "disk");
    folder.write("disk/List.m3u", (folder / "Music/gone.mp3").string() + "\n" +
                                      (folder / "disk/gone.mp3").string() + "\n");

    EXPECT_THAT(reasonsFor(*scan(folder / "Music"), "List.m3u"),
                ElementsAre(Reason::Missing, Reason::Missing));
}

TEST(LeftOutTest, FilesInADirectoryThatMayNotBeEntered) {
    const TemporaryDirectory folder;
    folder.writeSongs({"locked/one.mp3"});
    folder.write("List.m3u", "locked/one.mp3\n");
    folder.setPermissions("locked", std::filesystem::perms::none);
    const WithoutPrivileges ordinary;

    const auto inventory = scan(folder.path());

    EXPECT_THAT(inventory->leftOut,
                ElementsAre(LeftOut{"List.m3u", "locked/one.mp3", Reason::Unreachable},
                            LeftOut{"locked", "", Reason::DirectoryUnreadable}));
}

TEST(LeftOutTest, AFolderThatMayNotBeReadIsNamedItself) {
    const TemporaryDirectory folder;
    folder.setPermissions("", std::filesystem::perms::owner_exec);
    const WithoutPrivileges ordinary;

    const auto inventory = scan(folder.path());

    EXPECT_TRUE(inventory->rootFound);
    EXPECT_EQ(onlyOneOf(*inventory), (LeftOut{"", "", Reason::DirectoryUnreadable}));
}

TEST(LeftOutTest, HiddenFiles) {
    const TemporaryDirectory folder;
    folder.writeSongs({".one.mp3", ".trash/one.mp3"});
    folder.link("link", ".trash");
    folder.write("List.m3u", ".one.mp3\n.trash/one.mp3\nlink/one.mp3\n");

    EXPECT_THAT(reasonsFor(*scan(folder.path()), "List.m3u"),
                ElementsAre(Reason::Hidden, Reason::Hidden, Reason::Hidden));
}

TEST(LeftOutTest, DirectoriesAndPipes) {
    const TemporaryDirectory folder;
    folder.makeDirectory("Album.mp3");
    ASSERT_EQ(mkfifo((folder / "pipe.mp3").c_str(), 0644), 0);
    folder.link("link.mp3", "pipe.mp3");
    folder.write("List.m3u", "Album.mp3\nAlbum.mp3/\npipe.mp3\nlink.mp3\n.\n..\n");

    EXPECT_THAT(reasonsFor(*scan(folder.path()), "List.m3u"),
                ElementsAre(Reason::NotRegularFile, Reason::NotRegularFile, Reason::NotRegularFile,
                            Reason::NotRegularFile, Reason::NotRegularFile, Reason::OutsideFolder));
}

TEST(LeftOutTest, FilesThatAreNeitherAudioNorVideo) {
    const TemporaryDirectory folder;
    folder.write("cover.jpg", "");
    folder.write("other.m3u", "");
    folder.link("linked.jpg", "cover.jpg");
    folder.write("List.m3u", "cover.jpg\nother.m3u\nList.m3u\nlinked.jpg\n");

    EXPECT_THAT(
        reasonsFor(*scan(folder.path()), "List.m3u"),
        ElementsAre(Reason::NotMusic, Reason::NotMusic, Reason::NotMusic, Reason::NotMusic));
}

TEST(LeftOutTest, TracksWithoutAddress) {
    const TemporaryDirectory folder;
    folder.write("a.xspf", "<playlist><trackList><track><title>One</title></track>"
                           "<track><location> </location></track></trackList></playlist>");
    folder.write("b.pls", "[playlist]\nFile1=\n");

    const auto inventory = scan(folder.path());

    EXPECT_THAT(reasonsFor(*inventory, "a.xspf"),
                ElementsAre(Reason::NoAddress, Reason::NoAddress));
    EXPECT_THAT(reasonsFor(*inventory, "b.pls"), ElementsAre(Reason::NoAddress));
}

// Whole playlists.

TEST(LeftOutTest, APlaylistThatMayNotBeRead) {
    const TemporaryDirectory folder;
    folder.write("List.m3u", "");
    folder.setPermissions("List.m3u", std::filesystem::perms::none);
    const WithoutPrivileges ordinary;

    const auto inventory = scan(folder.path());

    EXPECT_THAT(inventory->playlists, IsEmpty());
    EXPECT_EQ(onlyOneOf(*inventory), (LeftOut{"List.m3u", "", Reason::PlaylistUnreadable}));
}

TEST(LeftOutTest, APlaylistOfMoreThan64MiBButNotOneOfExactlyThat) {
    const TemporaryDirectory folder;
    folder.write("large.m3u", std::string(maximumPlaylistBytes + 1, '#'));
    folder.write("largest.m3u", std::string(maximumPlaylistBytes, '#'));

    const auto inventory = scan(folder.path());

    EXPECT_THAT(namesOf(*inventory), ElementsAre("largest"));
    EXPECT_THAT(reasonsFor(*inventory, "large.m3u"), ElementsAre(Reason::PlaylistTooLarge));
}

TEST(LeftOutTest, BrokenXml) {
    const TemporaryDirectory folder;
    folder.write("cut off.xspf", "<playlist><trackList>" + std::string(track));
    folder.write("empty.xspf", "");
    folder.write("html.xspf", "<html><body/></html>");

    const auto inventory = scan(folder.path());

    EXPECT_THAT(inventory->playlists, IsEmpty());
    EXPECT_THAT(inventory->leftOut, ElementsAre(LeftOut{"cut off.xspf", "", Reason::PlaylistBroken},
                                                LeftOut{"empty.xspf", "", Reason::PlaylistBroken},
                                                LeftOut{"html.xspf", "", Reason::PlaylistBroken}));
}

TEST(LeftOutTest, APlaylistThatIsAPipeIsNotWaitedFor) {
    const TemporaryDirectory folder;
    ASSERT_EQ(mkfifo((folder / "pipe.m3u").c_str(), 0644), 0);
    folder.link("link.pls", "pipe.m3u");

    const auto inventory = scan(folder.path());

    EXPECT_THAT(inventory->playlists, IsEmpty());
    EXPECT_THAT(inventory->leftOut, ElementsAre(LeftOut{"link.pls", "", Reason::NotRegularFile},
                                                LeftOut{"pipe.m3u", "", Reason::NotRegularFile}));
}

TEST(LeftOutTest, APlaylistThatIsALinkOutOfTheFolderOrToNowhere) {
    const TemporaryDirectory folder;
    folder.write("secret.m3u", "");
    folder.link("Music/out.m3u", "../secret.m3u");
    folder.link("Music/nowhere.m3u", "gone.m3u");

    const auto inventory = scan(folder / "Music");

    EXPECT_THAT(inventory->playlists, IsEmpty());
    EXPECT_THAT(inventory->leftOut, ElementsAre(LeftOut{"nowhere.m3u", "", Reason::Missing},
                                                LeftOut{"out.m3u", "", Reason::OutsideFolder}));
}

TEST(LeftOutTest, EntriesAfterTheFirstMillion) {
    const TemporaryDirectory folder;
    folder.writeSongs({"a.mp3"});
    std::string bytes;
    for (std::uint32_t entry = 0; entry < maximumEntries; ++entry) {
        bytes += "a.mp3\n";
    }
    folder.write("full.m3u", bytes);
    folder.write("over.m3u", bytes + "a.mp3\n");

    const auto inventory = scan(folder.path());

    EXPECT_EQ(playlistAt(*inventory, "full.m3u").songs.size(), maximumEntries);
    EXPECT_EQ(playlistAt(*inventory, "over.m3u").songs.size(), maximumEntries);
    EXPECT_EQ(onlyOneOf(*inventory), (LeftOut{"over.m3u", "", Reason::TooManyEntries}));
}

TEST(LeftOutTest, OfTwoPlaylistsWhosePathsDifferInStoredAccentsOnlyOneIsThere) {
    const TemporaryDirectory folder;
    folder.write("Caf\u00E9.m3u", "");
    folder.write("Cafe\u0301.m3u", "");

    const auto inventory = scan(folder.path());

    EXPECT_EQ(inventory->playlists.size(), 1U);
    EXPECT_EQ(onlyOneOf(*inventory).reason, Reason::SameAsAnother);
}

// Words.

TEST(LeftOutTest, EveryReasonHasAnEnglishSentence) {
    for (auto reason = static_cast<unsigned>(Reason::NoAddress);
         reason <= static_cast<unsigned>(Reason::DirectoryUnreadable); ++reason) {
        const std::string_view text = sentence(static_cast<Reason>(reason));
        EXPECT_TRUE(text.ends_with('.')) << reason;
        EXPECT_GT(text.size(), 20U) << reason;
    }
}

TEST(LeftOutTest, ARecordIsPrintedInOneLine) {
    EXPECT_EQ(describe({"Rock.m3u", "gone.mp3", Reason::NotMusic}),
              "Rock.m3u: gone.mp3: It is neither audio nor video.");
    EXPECT_EQ(describe({"Rock.m3u", "", Reason::NotRegularFile}),
              "Rock.m3u: It is not a regular file.");
    EXPECT_THAT(describe({"", "", Reason::DirectoryUnreadable}), HasSubstr("The music folder: "));
}

TEST(LeftOutTest, WhatIsPrintedCannotSteerTheTerminal) {
    EXPECT_EQ(describe({"R\xFFock\n.m3u", "\x1B[2Jgone\u009B.mp3", Reason::NotMusic}),
              "R\uFFFDock\uFFFD.m3u: \uFFFD[2Jgone\uFFFD.mp3: It is neither audio nor video.");
}

} // namespace quorl::media::test
