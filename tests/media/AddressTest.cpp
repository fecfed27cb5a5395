#include "services/media/playlists/Address.h"

#include <string>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "services/media/MusicFolder.h"
#include "services/media/playlists/PlaylistContent.h"
#include "tests/base/TemporaryDirectory.h"
#include "tests/media/Inventories.h"

namespace quorl::media::test {

namespace {

using testing::ElementsAre;
using testing::IsEmpty;
using tests::TemporaryDirectory;

struct Reference {
    std::string_view base;
    std::string_view text;
    std::string_view meaning;
};

class ReferenceTest : public testing::TestWithParam<Reference> {};

std::string track(const std::string& location) { return "<track>" + location + "</track>"; }

} // namespace

TEST_P(ReferenceTest, MeansTheAddressThatTheBaseGivesIt) {
    EXPECT_EQ(resolved(GetParam().base, GetParam().text), GetParam().meaning);
}

INSTANTIATE_TEST_SUITE_P(
    Absolute, ReferenceTest,
    testing::Values(Reference{"http://a/b/c/d;p?q", "g", "http://a/b/c/g"},
                    Reference{"http://a/b/c/d;p?q", "./g/", "http://a/b/c/g/"},
                    Reference{"http://a/b/c/d;p?q", "/g", "http://a/g"},
                    Reference{"http://a/b/c/d;p?q", "//g", "http://g"},
                    Reference{"http://a/b/c/d;p?q", "g:h", "g:h"},
                    Reference{"http://a/b/c/d;p?q", ".", "http://a/b/c/"},
                    Reference{"http://a/b/c/d;p?q", "..", "http://a/b/"},
                    Reference{"http://a/b/c/d;p?q", "../../../g", "http://a/g"},
                    Reference{"http://a/b/c/d;p?q", "/./g", "http://a/g"},
                    Reference{"http://a/b/c/d;p?q", "/../g", "http://a/g"},
                    Reference{"http://a/b/c/d;p?q", "./g/./h/../i", "http://a/b/c/g/i"},
                    Reference{"http://a", "g", "http://a/g"},
                    Reference{"file:///home/me/Music/", "one.mp3", "file:///home/me/Music/one.mp3"},
                    Reference{"file:///home/me/Music", "one.mp3", "file:///home/me/one.mp3"}));

INSTANTIATE_TEST_SUITE_P(Relative, ReferenceTest,
                         testing::Values(Reference{"", "one.mp3", "one.mp3"},
                                         Reference{"Album/", "", "Album/"},
                                         Reference{"Album/", "one.mp3", "Album/one.mp3"},
                                         Reference{"Album", "one.mp3", "one.mp3"},
                                         Reference{"Album/#x/", "one.mp3", "Album/one.mp3"},
                                         Reference{"Album/", "#1.mp3", "Album/#1.mp3"},
                                         Reference{"Album/", "../one.mp3", "one.mp3"},
                                         Reference{"../Album/", "../../one.mp3", "../../one.mp3"},
                                         Reference{"Album/", "/one.mp3", "/one.mp3"},
                                         Reference{"Album/", "12: one.mp3", "Album/12: one.mp3"}));

TEST(AddressBaseTest, LocationsStartFromTheBasesAroundThem) {
    const TemporaryDirectory folder;
    folder.writeSongs({"lists/My Album/Disc 1/one.mp3", "lists/My Album/two.mp3", "lists/three.mp3",
                       "four.mp3", "lists/Other/five.mp3"});
    folder.write("lists/List.xspf",
                 "<playlist xml:base='My%20Album/'><trackList xml:base='Disc%201/'>" +
                     track("<location>one.mp3</location>") +
                     track("<location>../two.mp3</location>") +
                     "<track xml:base='../../'><location>three.mp3</location></track>" +
                     track("<location xml:base='../../../'>four.mp3</location>") +
                     track("<location xml:base='" + (folder / "lists").string() +
                           "/Other/'>five.mp3</location>") +
                     track("<location>" + (folder / "four.mp3").string() + "</location>") +
                     "</trackList></playlist>");

    const auto inventory = scan(folder.path());

    EXPECT_THAT(inventory->leftOut, IsEmpty());
    EXPECT_THAT(songsOf(*inventory, "lists/List.xspf"),
                ElementsAre("lists/My Album/Disc 1/one.mp3", "lists/My Album/two.mp3",
                            "lists/three.mp3", "four.mp3", "lists/Other/five.mp3", "four.mp3"));
}

TEST(AddressBaseTest, ABaseLeadsNoFurtherThanALocationDoes) {
    const TemporaryDirectory folder;
    folder.writeSongs({"Music/one.mp3", "outside.mp3"});
    folder.write(
        "Music/List.xspf",
        "<playlist><trackList><track xml:base='../'><location>outside.mp3</location></track>"
        "<track xml:base='http://a.example/'><location>one.mp3</location></track>"
        "<track xml:base='one.mp3'><location/></track></trackList></playlist>");

    EXPECT_THAT(reasonsFor(*scan(folder / "Music"), "List.xspf"),
                ElementsAre(Reason::OutsideFolder, Reason::RemoteAddress, Reason::NoAddress));
}

TEST(AddressBaseTest, ALongBaseIsNotRepeatedWithEveryTrack) {
    const auto content = parsePlaylist(
        Format::Xspf, "<playlist xml:base='" + std::string(1'000'000, 'b') + "/'><trackList>" +
                          track("<location xml:base='c/'>a</location>") +
                          "</trackList></playlist>");

    ASSERT_TRUE(content.has_value());
    EXPECT_LT(content->entries[0].size(), 5000U);
}

TEST(AddressBaseTest, EntriesThatABaseMakesLongerThanAPlaylistFileAreIgnoredFromThereOn) {
    PlaylistContent content;
    const std::string longest(maximumPlaylistBytes, 'a');
    for (int count = 0; count < 5; ++count) {
        content.add(longest);
    }
    content.add("short");

    EXPECT_TRUE(content.truncated);
    EXPECT_EQ(content.entries.size(), 2U);
}

} // namespace quorl::media::test
