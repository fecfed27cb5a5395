#include <cstdlib>
#include <filesystem>
#include <optional>
#include <ostream>
#include <string>

#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/stat.h>

#include "services/media/MusicFolder.h"
#include "tests/base/TemporaryDirectory.h"
#include "tests/media/Inventories.h"

namespace quorl::media::test {

using tests::TemporaryDirectory;

namespace {

using testing::ElementsAre;
using testing::IsEmpty;

// NOLINTBEGIN(concurrency-mt-unsafe): the tests of this file start no threads

/// Sets a variable of the environment, and puts it back.
class Environment {
  public:
    Environment(const char* name, const char* value) : name_(name) {
        if (const char* const before = std::getenv(name)) {
            before_ = before;
        }
        setenv(name, value, 1);
    }

    ~Environment() {
        if (before_) {
            setenv(name_, before_->c_str(), 1);
        } else {
            unsetenv(name_);
        }
    }

    Environment(const Environment&) = delete;
    Environment& operator=(const Environment&) = delete;

  private:
    const char* name_;
    std::optional<std::string> before_;
};

// NOLINTEND(concurrency-mt-unsafe)

std::string xspf(const std::string& inside) {
    return R"(<?xml version="1.0" encoding="UTF-8"?><playlist version="1" xmlns="http://xspf.org/ns/0/">)" +
           inside + "</playlist>";
}

std::string xspfTracks(const std::string& tracks) {
    return xspf("<trackList>" + tracks + "</trackList>");
}

} // namespace

TEST(ScanTest, AnEmptyFolderIsAnEmptyLibrary) {
    const TemporaryDirectory folder;

    const auto inventory = scan(folder.path());

    EXPECT_TRUE(inventory->rootFound);
    EXPECT_EQ(inventory->root, folder.path());
    EXPECT_THAT(inventory->playlists, IsEmpty());
    EXPECT_THAT(inventory->leftOut, IsEmpty());
    EXPECT_EQ(inventory->songs.size(), 0U);
    EXPECT_FALSE(inventory->hasAudio);
    EXPECT_FALSE(inventory->hasMusicVideo);
}

TEST(ScanTest, AMissingFolderIsAnEmptyLibraryThatSaysSo) {
    const TemporaryDirectory folder;

    const auto inventory = scan(folder / "Music");

    EXPECT_FALSE(inventory->rootFound);
    EXPECT_THAT(inventory->playlists, IsEmpty());
}

TEST(ScanTest, AFileInPlaceOfTheFolderIsAnEmptyLibraryThatSaysSo) {
    const TemporaryDirectory folder;
    folder.write("Music", "no directory");

    EXPECT_FALSE(scan(folder / "Music")->rootFound);
}

TEST(ScanTest, AFolderGivenRelativeToTheWorkingDirectoryAndWithASlashAtItsEndIsFound) {
    const TemporaryDirectory folder;
    folder.writeSongs({"one.mp3"});
    folder.write("List.m3u", (folder / "one.mp3").string());
    const auto relative = std::filesystem::relative(folder.path()).string() + "/";

    const auto inventory = scan(relative);

    EXPECT_EQ(inventory->root, folder.path());
    EXPECT_THAT(songsOf(*inventory, "List.m3u"), ElementsAre("one.mp3"));
}

TEST(ScanTest, PlaylistsOfEveryFormatListTheirSongsInOrder) {
    const TemporaryDirectory folder;
    folder.writeSongs({"one.mp3", "two.ogg"});
    folder.write("a.m3u", "two.ogg\none.mp3\n");
    folder.write("b.M3U8", "two.ogg\none.mp3");
    folder.write("c.pls", "[playlist]\nFile1=two.ogg\nTitle1=Two\nLength1=-1\nFile2=one.mp3\n"
                          "NumberOfEntries=2\nVersion=2\n");
    folder.write("d.xspf", xspfTracks("<track><location>two.ogg</location></track>"
                                      "<track><location>one.mp3</location></track>"));

    const auto inventory = scan(folder.path());

    for (const char* const playlist : {"a.m3u", "b.M3U8", "c.pls", "d.xspf"}) {
        EXPECT_THAT(songsOf(*inventory, playlist), ElementsAre("two.ogg", "one.mp3")) << playlist;
    }
    EXPECT_THAT(inventory->leftOut, IsEmpty());
}

TEST(ScanTest, PlaylistsAtAnyDepthListSongsRelativeToThemselves) {
    const TemporaryDirectory folder;
    folder.writeSongs({"top.mp3", "a/b/c/deep.mp3", "a/other.mp3"});
    folder.write("a/b/c/List.m3u", "deep.mp3\n../../other.mp3\n../../../top.mp3\n./deep.mp3\n"
                                   "..//../b/c/deep.mp3\n");

    EXPECT_THAT(songsOf(*scan(folder.path()), "a/b/c/List.m3u"),
                ElementsAre("a/b/c/deep.mp3", "a/other.mp3", "top.mp3", "a/b/c/deep.mp3",
                            "a/b/c/deep.mp3"));
}

TEST(ScanTest, ASongThatIsListedTwiceIsThereTwice) {
    const TemporaryDirectory folder;
    folder.writeSongs({"one.mp3", "two.mp3"});
    folder.write("List.m3u", "one.mp3\ntwo.mp3\none.mp3\n");

    const auto inventory = scan(folder.path());

    EXPECT_THAT(songsOf(*inventory, "List.m3u"), ElementsAre("one.mp3", "two.mp3", "one.mp3"));
    EXPECT_EQ(inventory->songs.size(), 2U);
}

TEST(ScanTest, SongsKnowTheirDirectoryNameSizeTimeAndKind) {
    const TemporaryDirectory folder;
    folder.writeSongs({"Album/one.mp3"}, 1234);
    folder.setModified("Album/one.mp3", 1'600'000'000'123'456'789);
    folder.write("List.m3u", "Album/one.mp3");

    const auto inventory = scan(folder.path());

    ASSERT_EQ(inventory->songs.size(), 1U);
    const Song song = inventory->songs[0];
    EXPECT_EQ(song.directory, "Album");
    EXPECT_EQ(song.name, "one.mp3");
    EXPECT_EQ(song.path(), "Album/one.mp3");
    EXPECT_EQ(song.size, 1234U);
    EXPECT_EQ(song.modified, 1'600'000'000'123'456'789);
    EXPECT_EQ(song.kind, Kind::Audio);
}

TEST(ScanTest, ASongOf2046KeepsItsTime) {
    constexpr std::int64_t year2046 = 2'398'377'600'000'000'001; // beyond 32 bits of seconds
    const TemporaryDirectory folder;
    folder.writeSongs({"one.mp3"});
    folder.setModified("one.mp3", year2046);
    folder.write("List.m3u", "one.mp3");

    const auto inventory = scan(folder.path());

    ASSERT_EQ(inventory->songs.size(), 1U);
    EXPECT_EQ(inventory->songs[0].modified, year2046);
}

TEST(ScanTest, ASongOfMoreThanFourGigabytesKeepsItsSize) {
    const TemporaryDirectory folder;
    folder.writeSongs({"long.flac"});
    std::filesystem::resize_file(folder / "long.flac", 5'000'000'000);
    folder.write("List.m3u", "long.flac");

    EXPECT_EQ(scan(folder.path())->songs[0].size, 5'000'000'000U);
}

// Encodings and line ends.

TEST(ScanTest, PlaylistsInUtf8AreReadWithAndWithoutByteOrderMark) {
    const TemporaryDirectory folder;
    folder.writeSongs({"Füße.mp3"});
    folder.write("plain.m3u", "Füße.mp3\n");
    folder.write("marked.m3u", "\uFEFFFüße.mp3\n");
    folder.write("marked.pls", "\uFEFF[playlist]\nFile1=Füße.mp3\n");
    folder.write("marked.xspf",
                 "\uFEFF" + xspfTracks("<track><location>Füße.mp3</location></track>"));

    const auto inventory = scan(folder.path());

    for (const char* const playlist : {"plain.m3u", "marked.m3u", "marked.pls", "marked.xspf"}) {
        EXPECT_THAT(songsOf(*inventory, playlist), ElementsAre("Füße.mp3")) << playlist;
    }
}

TEST(ScanTest, TextThatIsNotUtf8IsTakenAsLatin1) {
    const TemporaryDirectory folder;
    folder.writeSongs({"Füße.mp3"});
    folder.write("a.m3u", "#PLAYLIST:F\xFC\xDF"
                          "e\nF\xFC\xDF"
                          "e.mp3\n");
    folder.write("b.pls", "[playlist]\nFile1=F\xFC\xDF"
                          "e.mp3\n");
    folder.write("c.xspf", "<playlist><title>F\xFC\xDF"
                           "e</title><trackList><track><location>F\xFC\xDF"
                           "e.mp3</location></track></trackList></playlist>");

    const auto inventory = scan(folder.path());

    for (const char* const playlist : {"a.m3u", "b.pls", "c.xspf"}) {
        EXPECT_THAT(songsOf(*inventory, playlist), ElementsAre("Füße.mp3")) << playlist;
    }
    EXPECT_EQ(playlistAt(*inventory, "a.m3u").name, "Füße");
    EXPECT_EQ(playlistAt(*inventory, "c.xspf").name, "Füße");
}

TEST(ScanTest, QuotationMarksThatWindowsWritesInLatin1AreUnderstood) {
    const TemporaryDirectory folder;
    folder.writeSongs({"Don’t.mp3"});
    folder.write("List.m3u", "Don\x92t.mp3\n");

    EXPECT_THAT(songsOf(*scan(folder.path()), "List.m3u"), ElementsAre("Don’t.mp3"));
}

TEST(ScanTest, OneLineInLatin1LeavesTheOthersInUtf8) {
    const TemporaryDirectory folder;
    folder.writeSongs({"Füße.mp3", "Käse.mp3"});
    folder.write("List.m3u", "K\xE4se.mp3\nFüße.mp3\n");

    EXPECT_THAT(songsOf(*scan(folder.path()), "List.m3u"), ElementsAre("Käse.mp3", "Füße.mp3"));
}

TEST(ScanTest, XmlMayDeclareItsEncoding) {
    const TemporaryDirectory folder;
    folder.writeSongs({"Füße.mp3"});
    folder.write("List.xspf",
                 "<?xml version=\"1.0\" encoding=\"ISO-8859-1\"?><playlist><trackList><track>"
                 "<location>F\xFC\xDF"
                 "e.mp3</location></track></trackList></playlist>");

    EXPECT_THAT(songsOf(*scan(folder.path()), "List.xspf"), ElementsAre("Füße.mp3"));
}

TEST(ScanTest, LinesMayEndInAnyWayAndCommentsAndBlankLinesAreNoEntries) {
    const TemporaryDirectory folder;
    folder.writeSongs({"one.mp3", "two.mp3", "three.mp3"});
    folder.write("windows.m3u", "#EXTM3U\r\n\r\n#EXTINF:12,One\r\none.mp3\r\n  \r\ntwo.mp3");
    folder.write("classic.m3u", "one.mp3\rtwo.mp3\r");
    folder.write("blanks.m3u", "\n \t one.mp3 \t\n# three.mp3\ntwo.mp3\n");
    folder.write("windows.pls", "[playlist]\r\nFile1=one.mp3\r\n; File3=three.mp3\r\n"
                                "# File4=three.mp3\r\n File2 = two.mp3 \r\n");

    const auto inventory = scan(folder.path());

    for (const char* const playlist : {"windows.m3u", "classic.m3u", "blanks.m3u", "windows.pls"}) {
        EXPECT_THAT(songsOf(*inventory, playlist), ElementsAre("one.mp3", "two.mp3")) << playlist;
    }
    EXPECT_THAT(inventory->leftOut, IsEmpty());
}

TEST(ScanTest, EntriesOfAPlsFileAreInTheOrderOfTheirNumbers) {
    const TemporaryDirectory folder;
    folder.writeSongs({"one.mp3", "two.mp3", "ten.mp3"});
    folder.write("List.pls", "[playlist]\nFile10=ten.mp3\nfile2=two.mp3\nFILE1=one.mp3\n"
                             "FileX=ten.mp3\nFile=ten.mp3\nFile99999999999999999999=ten.mp3\n");

    EXPECT_THAT(songsOf(*scan(folder.path()), "List.pls"),
                ElementsAre("one.mp3", "two.mp3", "ten.mp3"));
}

// Ways to write an entry.

TEST(ScanTest, BackslashesAreSeparatorsWhereNoFileHasThemInItsName) {
    const TemporaryDirectory folder;
    folder.writeSongs({"Album/one.mp3", "back\\slash.mp3"});
    folder.write("a.m3u", "Album\\one.mp3\nback\\slash.mp3\n");
    folder.write("lists/b.m3u", "..\\Album\\one.mp3\n");
    folder.write("c.xspf", xspfTracks("<track><location>Album\\one.mp3</location></track>"));

    const auto inventory = scan(folder.path());

    EXPECT_THAT(songsOf(*inventory, "a.m3u"), ElementsAre("Album/one.mp3", "back\\slash.mp3"));
    EXPECT_THAT(songsOf(*inventory, "lists/b.m3u"), ElementsAre("Album/one.mp3"));
    EXPECT_THAT(songsOf(*inventory, "c.xspf"), ElementsAre("Album/one.mp3"));
}

TEST(ScanTest, PercentEncodedEntriesAreDecodedWhereNoFileHasTheCodesInItsName) {
    const TemporaryDirectory folder;
    folder.writeSongs({"My Album/one.mp3", "100%25 pure.mp3", "50% off.mp3"});
    folder.write("a.m3u", "My%20Album/one.mp3\n100%25 pure.mp3\n50% off.mp3\n");
    folder.write("b.xspf", xspfTracks("<track><location>My%20Album/one.mp3</location></track>"
                                      "<track><location>My Album/one.mp3</location></track>"
                                      "<track><location>100%2525%20pure.mp3</location></track>"));

    const auto inventory = scan(folder.path());

    EXPECT_THAT(songsOf(*inventory, "a.m3u"),
                ElementsAre("My Album/one.mp3", "100%25 pure.mp3", "50% off.mp3"));
    EXPECT_THAT(songsOf(*inventory, "b.xspf"),
                ElementsAre("My Album/one.mp3", "My Album/one.mp3", "100%25 pure.mp3"));
}

TEST(ScanTest, FileAddressesAreUnderstood) {
    const TemporaryDirectory folder;
    folder.writeSongs({"My Album/one.mp3"});
    const std::string path = folder.path().string();
    folder.write("List.m3u", "file://" + path + "/My%20Album/one.mp3\n" +              //
                                 "FILE://localhost" + path + "/My%20Album/one.mp3\n" + //
                                 "file:" + path + "/My Album/one.mp3\n" +              //
                                 "file:My%20Album/one.mp3\n");

    EXPECT_THAT(songsOf(*scan(folder.path()), "List.m3u"),
                ElementsAre("My Album/one.mp3", "My Album/one.mp3", "My Album/one.mp3",
                            "My Album/one.mp3"));
}

TEST(ScanTest, AbsolutePathsInTheFolderAreUnderstoodAlsoThroughALinkToTheFolder) {
    const TemporaryDirectory folder;
    folder.writeSongs({"disk/one.mp3"});
    folder.link("Music", "disk");
    folder.write("disk/List.m3u", (folder / "disk/one.mp3").string() + "\n" +
                                      (folder / "Music/one.mp3").string() + "\n" +
                                      (folder / "Music/../disk/./one.mp3").string() + "\n");

    EXPECT_THAT(songsOf(*scan(folder / "Music"), "List.m3u"),
                ElementsAre("one.mp3", "one.mp3", "one.mp3"));
}

TEST(ScanTest, AnEntryThatLeavesTheFolderAndComesBackIsInTheFolder) {
    const TemporaryDirectory folder;
    folder.writeSongs({"Music/one.mp3"});
    folder.write("Music/List.m3u", "../Music/one.mp3\n");

    EXPECT_THAT(songsOf(*scan(folder / "Music"), "List.m3u"), ElementsAre("one.mp3"));
}

TEST(ScanTest, AccentsMayBeStoredOtherwiseInThePlaylistThanInTheFileName) {
    const TemporaryDirectory folder;
    folder.writeSongs({"Caf\u00E9.mp3", "Bje\u0301.mp3"});
    folder.write("List.m3u", "Cafe\u0301.mp3\nBj\u00E9.mp3\n");

    EXPECT_THAT(songsOf(*scan(folder.path()), "List.m3u"),
                ElementsAre("Caf\u00E9.mp3", "Bje\u0301.mp3"));
}

TEST(ScanTest, OfSeveralLocationsOfATrackTheOneOnThisMachineCounts) {
    const TemporaryDirectory folder;
    folder.writeSongs({"one.mp3"});
    folder.write("List.xspf",
                 xspfTracks("<track><title>One</title><location>http://a.example/1.mp3</location>"
                            "<location>\n  one.mp3\n</location></track>"));

    EXPECT_THAT(songsOf(*scan(folder.path()), "List.xspf"), ElementsAre("one.mp3"));
}

TEST(ScanTest, XspfWithANamespacePrefixIsUnderstood) {
    const TemporaryDirectory folder;
    folder.writeSongs({"R&B.mp3"});
    folder.write("List.xspf",
                 R"(<x:playlist xmlns:x="http://xspf.org/ns/0/"><x:title>Prefix</x:title>
        <x:trackList><x:track><x:location><![CDATA[R&B.mp3]]></x:location></x:track>
        <x:track><x:location>R&amp;B.mp3</x:location></x:track></x:trackList></x:playlist>)");

    const auto inventory = scan(folder.path());

    EXPECT_THAT(songsOf(*inventory, "List.xspf"), ElementsAre("R&B.mp3", "R&B.mp3"));
    EXPECT_EQ(playlistAt(*inventory, "List.xspf").name, "Prefix");
}

// Names, order and folders.

TEST(ScanTest, APlaylistHasTheNameThatItGivesItselfElseThatOfItsFile) {
    const TemporaryDirectory folder;
    folder.write("a.m3u", "#EXTM3U\n#PLAYLIST: Road Trip \n");
    folder.write("b.xspf", xspf("<title>Quiet Evening</title>"));
    folder.write("lists/Long Run.v2.pls", "[playlist]\n");
    folder.write("d.m3u", "#PLAYLIST:\n");
    folder.write("broken \xFF name.m3u", "");

    const auto inventory = scan(folder.path());

    EXPECT_EQ(playlistAt(*inventory, "a.m3u").name, "Road Trip");
    EXPECT_EQ(playlistAt(*inventory, "b.xspf").name, "Quiet Evening");
    EXPECT_EQ(playlistAt(*inventory, "lists/Long Run.v2.pls").name, "Long Run.v2");
    EXPECT_EQ(playlistAt(*inventory, "d.m3u").name, "d");
    EXPECT_EQ(playlistAt(*inventory, "broken \xFF name.m3u").name, "broken \uFFFD name");
}

TEST(ScanTest, ANameTooLongToBeOneIsIgnored) {
    const TemporaryDirectory folder;
    folder.write("a.m3u", "#PLAYLIST:" + std::string(100'000, 'x') + "\n");

    EXPECT_THAT(namesOf(*scan(folder.path())), ElementsAre("a"));
}

TEST(ScanTest, PlaylistsAreInTheOrderOfTheUsersLanguage) {
    const TemporaryDirectory folder;
    for (const char* const file : {"Zebra.m3u", "Ärger.m3u", "apfel.m3u", "Banane.m3u"}) {
        folder.write(file, "");
    }
    const Environment noOverride("LC_ALL", "");

    const Environment german("LC_COLLATE", "de_DE.UTF-8");
    EXPECT_THAT(namesOf(*scan(folder.path())), ElementsAre("apfel", "Ärger", "Banane", "Zebra"));

    const Environment swedish("LC_COLLATE", "sv_SE.UTF-8");
    EXPECT_THAT(namesOf(*scan(folder.path())), ElementsAre("apfel", "Banane", "Zebra", "Ärger"));

    const Environment none("LC_COLLATE", "C.UTF-8");
    EXPECT_THAT(namesOf(*scan(folder.path())), ElementsAre("apfel", "Ärger", "Banane", "Zebra"));
}

TEST(ScanTest, PlaylistsOfTheSameNameAreInTheOrderOfTheirPaths) {
    const TemporaryDirectory folder;
    for (const char* const file : {"c.m3u", "a.m3u", "b/x.m3u"}) {
        folder.write(file, "#PLAYLIST:Same\n");
    }

    const auto inventory = scan(folder.path());

    std::vector<std::string> paths;
    for (const Playlist& playlist : inventory->playlists) {
        paths.push_back(playlist.path);
    }
    EXPECT_THAT(paths, ElementsAre("b", "a.m3u", "b/x.m3u", "c.m3u"));
}

TEST(ScanTest, ADirectoryThatHoldsPlaylistsIsAFolderWithTheirSongsInTheirOrder) {
    const TemporaryDirectory folder;
    folder.writeSongs({"one.mp3", "two.mp3", "three.mp3"});
    folder.write("Workout/Z first.m3u", "#PLAYLIST:Abc\n../three.mp3\n../one.mp3\n");
    folder.write("Workout/A second.m3u", "#PLAYLIST:Xyz\n../one.mp3\n../two.mp3\n");
    folder.write("Workout/Inner/Deep.m3u", "../../two.mp3\n");
    folder.write("Top.m3u", "one.mp3\n");

    const auto inventory = scan(folder.path());

    EXPECT_THAT(namesOf(*inventory), ElementsAre("Abc", "Deep", "Inner", "Top", "Workout", "Xyz"));
    const Playlist& workout = playlistAt(*inventory, "Workout");
    EXPECT_TRUE(workout.folder);
    EXPECT_EQ(workout.generated, Generated::No);
    EXPECT_THAT(songsOf(*inventory, "Workout"),
                ElementsAre("three.mp3", "one.mp3", "one.mp3", "two.mp3"));
    EXPECT_TRUE(playlistAt(*inventory, "Workout/Inner").folder);
    EXPECT_FALSE(playlistAt(*inventory, "Top.m3u").folder);
}

TEST(ScanTest, ADirectoryOfDirectoriesOrOfBrokenPlaylistsIsNoFolder) {
    const TemporaryDirectory folder;
    folder.write("Outer/Inner/List.m3u", "");
    folder.write("Broken/List.xspf", "<playlist>");

    EXPECT_THAT(namesOf(*scan(folder.path())), ElementsAre("Inner", "List"));
}

struct Marked {
    std::string situation;
    std::string file;
    std::string bytes;
    Generated generated;
};

void PrintTo(const Marked& marked, std::ostream* stream) { *stream << marked.situation; }

class MarkerTest : public testing::TestWithParam<Marked> {};

TEST_P(MarkerTest, TellsWhetherAProgramMadeThePlaylist) {
    const TemporaryDirectory folder;
    folder.write(GetParam().file, GetParam().bytes);

    EXPECT_EQ(playlistAt(*scan(folder.path()), GetParam().file).generated, GetParam().generated);
}

INSTANTIATE_TEST_SUITE_P(
    Markers, MarkerTest,
    testing::Values(
        Marked{"NoneInM3u", "a.m3u", "#EXTM3U\n", Generated::No},
        Marked{"PlainInM3u", "a.m3u", "#GENERATED\n", Generated::Playlist},
        Marked{"PlaylistInM3u8", "a.m3u8", "#EXTM3U\r\n#GENERATED:playlist\r\n",
               Generated::Playlist},
        Marked{"MixInM3u8", "a.m3u8", "#EXTM3U\n#GENERATED:mix \n", Generated::Mix},
        Marked{"UnknownValueInM3u", "a.m3u", "#GENERATED:radio\n", Generated::Playlist},
        Marked{"SimilarCommentsInM3u", "a.m3u", "#GENERATEDLY\n#generated\n# GENERATED\n",
               Generated::No},
        Marked{"NoneInPls", "a.pls", "[playlist]\nGENERATED=mix\n", Generated::No},
        Marked{"MixInPls", "a.pls", "[playlist]\n#GENERATED:mix\n", Generated::Mix},
        Marked{"MixWithSemicolonInPls", "a.pls", "[playlist]\n;GENERATED:mix\n", Generated::Mix},
        Marked{"PlainWithSemicolonInPls", "a.pls", "[playlist]\n;GENERATED\n", Generated::Playlist},
        Marked{"NoneInXspf", "a.xspf", xspf(R"(<meta rel="urn:other">mix</meta>)"), Generated::No},
        Marked{"MixInXspf", "a.xspf", xspf(R"(<meta rel="urn:quorl:generated">mix</meta>)"),
               Generated::Mix},
        Marked{"PlaylistInXspf", "a.xspf",
               xspf(R"(<meta rel="urn:quorl:generated">playlist</meta>)"), Generated::Playlist},
        Marked{"EmptyInXspf", "a.xspf", xspf(R"(<meta rel="urn:quorl:generated"/>)"),
               Generated::Playlist}),
    [](const auto& marked) { return marked.param.situation; });

// What is a song, and what is not looked at.

TEST(ScanTest, SongsAreToldByTheirContentType) {
    const TemporaryDirectory folder;
    folder.writeSongs({"a.mp3", "b.FLAC", "c.opus", "d.m4a", "e.ogg", "f.mp4", "g.mkv", "h.webm"});
    folder.write("List.m3u", "a.mp3\nb.FLAC\nc.opus\nd.m4a\ne.ogg\nf.mp4\ng.mkv\nh.webm\n");

    const auto inventory = scan(folder.path());

    ASSERT_EQ(inventory->songs.size(), 8U);
    for (SongIndex song = 0; song < 5; ++song) {
        EXPECT_EQ(inventory->songs[song].kind, Kind::Audio) << inventory->songs[song].name;
    }
    for (SongIndex song = 5; song < 8; ++song) {
        EXPECT_EQ(inventory->songs[song].kind, Kind::MusicVideo) << inventory->songs[song].name;
    }
}

TEST(ScanTest, FirstBytesTellWhereTheNameDoesNot) {
    const TemporaryDirectory folder;
    folder.write("song", "fLaC" + std::string(100, '\0'));
    folder.write("Artist. Song no. 5", "fLaC" + std::string(100, '\0'));
    folder.write("notes", "just text\n");
    folder.write("named.txt", "fLaC" + std::string(100, '\0'));
    folder.write("List.m3u", "song\nArtist. Song no. 5\nnotes\nnamed.txt\n");

    const auto inventory = scan(folder.path());

    EXPECT_THAT(songsOf(*inventory, "List.m3u"), ElementsAre("song", "Artist. Song no. 5"));
    EXPECT_TRUE(inventory->hasAudio);
}

TEST(ScanTest, AudioAndVideoAreNoticedAlsoInNoPlaylist) {
    const TemporaryDirectory audio;
    audio.writeSongs({"deep/down/one.mp3"});
    EXPECT_TRUE(scan(audio.path())->hasAudio);
    EXPECT_FALSE(scan(audio.path())->hasMusicVideo);

    const TemporaryDirectory video;
    video.writeSongs({"one.mp4"});
    EXPECT_FALSE(scan(video.path())->hasAudio);
    EXPECT_TRUE(scan(video.path())->hasMusicVideo);
}

TEST(ScanTest, PlaylistsAndTextsAreNoAudio) {
    const TemporaryDirectory folder;
    for (const char* const file :
         {"a.m3u", "b.m3u8", "c.pls", "d.txt", "e.jpg", "f.asx", "g.m4u"}) {
        folder.write(file, "");
    }
    folder.write("e.xspf", xspf(""));

    const auto inventory = scan(folder.path());

    EXPECT_FALSE(inventory->hasAudio);
    EXPECT_FALSE(inventory->hasMusicVideo);
}

TEST(ScanTest, HiddenFilesAndDirectoriesAreSkipped) {
    const TemporaryDirectory folder;
    folder.writeSongs({".hidden.mp3", ".trash/one.mp3"});
    folder.write(".hidden.m3u", "");
    folder.write(".trash/List.m3u", "one.mp3");

    const auto inventory = scan(folder.path());

    EXPECT_THAT(inventory->playlists, IsEmpty());
    EXPECT_THAT(inventory->leftOut, IsEmpty());
    EXPECT_FALSE(inventory->hasAudio);
}

TEST(ScanTest, LinkedDirectoriesAreNotWalked) {
    const TemporaryDirectory folder;
    folder.writeSongs({"Album/one.mp3"});
    folder.write("Album/List.m3u", "one.mp3");
    folder.link("Album/loop", "..");
    folder.link("again", "Album");

    EXPECT_THAT(namesOf(*scan(folder.path())), ElementsAre("Album", "List"));
}

TEST(ScanTest, LinksToFilesInTheFolderAreSongsAndPlaylists) {
    const TemporaryDirectory folder;
    folder.writeSongs({"Album/one.mp3"}, 77);
    folder.link("favourite.mp3", "Album/one.mp3");
    folder.write("lists/real.m3u", "favourite.mp3\nAlbum/one.mp3\nagain/one.mp3\n");
    folder.link("linked.m3u", folder / "lists/real.m3u");
    folder.link("again", "Album");

    const auto inventory = scan(folder.path());

    EXPECT_THAT(songsOf(*inventory, "linked.m3u"),
                ElementsAre("favourite.mp3", "Album/one.mp3", "Album/one.mp3"));
    EXPECT_EQ(inventory->songs[0].size, 77U);
}

TEST(ScanTest, FoldersDeeperThanAPathCanSayDoNoHarm) {
    const TemporaryDirectory folder;
    folder.writeSongs({"one.mp3"});
    folder.write("List.m3u", "one.mp3");
    const std::string name(200, 'd');
    const auto before = std::filesystem::current_path();
    std::filesystem::current_path(folder.path());
    for (int depth = 0; depth < 30; ++depth) {
        std::filesystem::create_directory(name);
        std::filesystem::current_path(name);
    }
    std::filesystem::current_path(before);

    const auto inventory = scan(folder.path());

    EXPECT_THAT(songsOf(*inventory, "List.m3u"), ElementsAre("one.mp3"));
    ASSERT_EQ(inventory->leftOut.size(), 1U);
    EXPECT_EQ(inventory->leftOut[0].reason, Reason::DirectoryUnreadable);
}

} // namespace quorl::media::test
