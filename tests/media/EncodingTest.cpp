// Playlists that other systems and programs have written, in their encodings.

#include "services/media/playlists/Encoding.h"

#include <string>

#include <glib.h>
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

constexpr std::string_view m3u = "#EXTM3U\r\n#PLAYLIST:Füße\r\nFüße 東京.mp3\r\none.mp3\r\n";
constexpr std::string_view pls = "[playlist]\r\nFile1=Füße 東京.mp3\r\nFile2=one.mp3\r\n";

std::string xspf(const std::string& encoding, const std::string& location) {
    return "<?xml version='1.0' encoding='" + encoding +
           "'?><playlist><trackList><track><location>" + location +
           "</location></track></trackList></playlist>";
}

struct Written {
    const char* encoding;
    std::string_view mark;
};

class WideText : public testing::TestWithParam<Written> {
  protected:
    /// `text` in the encoding of this test.
    static std::string written(std::string_view text) {
        gsize size = 0;
        char* const bytes = g_convert(text.data(), static_cast<gssize>(text.size()),
                                      GetParam().encoding, "UTF-8", nullptr, &size, nullptr);
        const std::string result = std::string(GetParam().mark) + std::string(bytes, size);
        g_free(bytes);
        return result;
    }
};

} // namespace

TEST_P(WideText, IsReadInEveryFormat) {
    const TemporaryDirectory folder;
    folder.writeSongs({"Füße 東京.mp3", "one.mp3"});
    folder.write("a.m3u", written(m3u));
    folder.write("b.m3u8", written(m3u));
    folder.write("c.pls", written(pls));
    folder.write("d.xspf", written(xspf("UTF-16", "Füße 東京.mp3</location></track>"
                                                  "<track><location>one.mp3")));

    const auto inventory = scan(folder.path());

    EXPECT_THAT(inventory->leftOut, IsEmpty());
    for (const char* const playlist : {"a.m3u", "b.m3u8", "c.pls", "d.xspf"}) {
        EXPECT_THAT(songsOf(*inventory, playlist), ElementsAre("Füße 東京.mp3", "one.mp3"))
            << playlist;
    }
    EXPECT_EQ(playlistAt(*inventory, "a.m3u").name, "Füße");
}

TEST_P(WideText, OfXmlIsReadWhateverItDeclares) {
    for (const char* const declared : {"UTF-8", "ISO-8859-1", "windows-1251", "none-known", ""}) {
        const auto content = parsePlaylist(Format::Xspf, written(xspf(declared, "Füße 東京.mp3")));

        ASSERT_TRUE(content.has_value()) << declared;
        ASSERT_EQ(content->entries.size(), 1U) << declared;
        EXPECT_EQ(content->entries[0], "Füße 東京.mp3") << declared;
    }
}

TEST_P(WideText, ThatWasCutWithinACharacterIsLeftOut) {
    const TemporaryDirectory folder;
    const std::string text = written(pls);
    folder.write("c.pls", std::string_view(text).substr(0, text.size() - 1));

    const auto inventory = scan(folder.path());

    EXPECT_THAT(inventory->playlists, IsEmpty());
    EXPECT_THAT(reasonsFor(*inventory, "c.pls"), ElementsAre(Reason::PlaylistBroken));
}

using namespace std::string_view_literals;
INSTANTIATE_TEST_SUITE_P(Encodings, WideText,
                         testing::Values(Written{"UTF-16LE", "\xFF\xFE"sv},
                                         Written{"UTF-16BE", "\xFE\xFF"sv},
                                         Written{"UTF-16LE", ""sv}, Written{"UTF-16BE", ""sv},
                                         Written{"UTF-32LE", "\xFF\xFE\0\0"sv},
                                         Written{"UTF-32BE", "\0\0\xFE\xFF"sv}));

TEST(EncodingTest, XmlIsReadInTheEncodingThatItDeclares) {
    const TemporaryDirectory folder;
    folder.writeSongs({"Füße.mp3", "Don’t.mp3", "Привет.mp3", "東京.mp3"});
    folder.write("latin.xspf", xspf("ISO-8859-1", "F\xFC\xDF"
                                                  "e.mp3"));
    folder.write("windows.xspf", xspf("windows-1252", "Don\x92t.mp3"));
    folder.write("cyrillic.xspf", xspf("windows-1251", "\xCF\xF0\xE8\xE2\xE5\xF2.mp3"));
    folder.write("japanese.xspf", xspf("Shift_JIS", "\x93\x8C\x8B\x9E.mp3"));

    const auto inventory = scan(folder.path());

    EXPECT_THAT(songsOf(*inventory, "latin.xspf"), ElementsAre("Füße.mp3"));
    EXPECT_THAT(songsOf(*inventory, "windows.xspf"), ElementsAre("Don’t.mp3"));
    EXPECT_THAT(songsOf(*inventory, "cyrillic.xspf"), ElementsAre("Привет.mp3"));
    EXPECT_THAT(songsOf(*inventory, "japanese.xspf"), ElementsAre("東京.mp3"));
}

TEST(EncodingTest, ADeclarationOfUtf16ThatReadsAsAsciiWasLeftBehindByAConversion) {
    const TemporaryDirectory folder;
    folder.writeSongs({"Füße.mp3"});
    folder.write("List.xspf", xspf("utf-16", "Füße.mp3"));

    EXPECT_THAT(songsOf(*scan(folder.path()), "List.xspf"), ElementsAre("Füße.mp3"));
}

TEST(EncodingTest, AnEmptyDeclarationAndOneBehindAByteOrderMarkSayNothing) {
    const TemporaryDirectory folder;
    folder.writeSongs({"Füße.mp3"});
    folder.write("empty.xspf", xspf("", "Füße.mp3"));
    folder.write("latin.xspf", xspf("", "F\xFC\xDF"
                                        "e.mp3"));
    folder.write("marked.xspf", "\uFEFF" + xspf("ISO-8859-1", "Füße.mp3"));

    const auto inventory = scan(folder.path());

    for (const char* const playlist : {"empty.xspf", "latin.xspf", "marked.xspf"}) {
        EXPECT_THAT(songsOf(*inventory, playlist), ElementsAre("Füße.mp3")) << playlist;
    }
}

TEST(EncodingTest, SongsThatAWrongDeclarationRenamesAreToldAsMissing) {
    const TemporaryDirectory folder;
    folder.writeSongs({"Füße.mp3", "one.mp3"});
    folder.write("List.xspf", xspf("windows-1252", "Füße.mp3</location></track>"
                                                   "<track><location>one.mp3"));

    const auto inventory = scan(folder.path());

    EXPECT_THAT(songsOf(*inventory, "List.xspf"), ElementsAre("one.mp3"));
    EXPECT_THAT(inventory->leftOut,
                ElementsAre(LeftOut{"List.xspf", "FÃ¼ÃŸe.mp3", Reason::Missing}));
}

TEST(EncodingTest, XmlInAnUnknownEncodingOrNotInTheOneThatItDeclaresIsLeftOut) {
    const TemporaryDirectory folder;
    folder.write("a.xspf", xspf("no-such-encoding", "one.mp3"));
    folder.write("b.xspf", xspf("windows-1252", "\x81.mp3"));
    folder.write("c.xspf", xspf("windows-1252", "one.mp3").insert(0, "\xFF\xFE"));

    const auto inventory = scan(folder.path());

    EXPECT_THAT(inventory->playlists, IsEmpty());
    EXPECT_THAT(inventory->leftOut, ElementsAre(LeftOut{"a.xspf", "", Reason::PlaylistBroken},
                                                LeftOut{"b.xspf", "", Reason::PlaylistBroken},
                                                LeftOut{"c.xspf", "", Reason::PlaylistBroken}));
}

TEST(EncodingTest, WhatIsNoTextOrOfAnotherFormatIsNotAnEmptyPlaylist) {
    const TemporaryDirectory folder;
    for (const char* const name : {"song.m3u", "song.pls"}) {
        folder.write(name, "ID3\x04\0\0\0\0\x01\x02"sv);
    }
    folder.write("east.m3u", "\x71\x67.\0m\0p\0003\0"sv); // UTF-16 that does not plainly begin so
    folder.write("nothing.pls", "");
    folder.write("other.pls", "[Desktop Entry]\nName=Music\n");
    folder.write("page.m3u", "\uFEFF\n<!DOCTYPE html><title>404</title>\n");
    folder.write("surrogate.m3u", "\xFF\xFEo\0\0\xD8.\0"sv);
    folder.write("zeros.m3u", "one.mp3\n\0\0\0\0"sv);

    const auto inventory = scan(folder.path());

    EXPECT_THAT(inventory->playlists, IsEmpty());
    EXPECT_EQ(inventory->leftOut.size(), 8U);
    EXPECT_THAT(inventory->leftOut,
                testing::Each(testing::Field(&LeftOut::reason, Reason::PlaylistBroken)));
}

TEST(EncodingTest, APlaylistThatListsNothingIsStillAPlaylist) {
    EXPECT_TRUE(parsePlaylist(Format::M3u, "").has_value());
    EXPECT_TRUE(parsePlaylist(Format::M3u, "\xFF\xFE").has_value());
    EXPECT_TRUE(parsePlaylist(Format::Pls, "[Playlist]\nNumberOfEntries=0\n").has_value());
    EXPECT_TRUE(parsePlaylist(Format::Pls, "File1=one.mp3").has_value());
}

TEST(EncodingTest, DeclarationsAreReadInEitherQuotesAndOnlyThere) {
    EXPECT_EQ(declaredEncoding("<?xml version=\"1.0\" encoding = \"a\" standalone='yes'?>"), "a");
    EXPECT_EQ(declaredEncoding("<?xml encoding='b'?>"), "b");
    EXPECT_EQ(declaredEncoding("<?xml version='1.0'?><a encoding='c'/>"), "");
    EXPECT_EQ(declaredEncoding("<a encoding='d'/>"), "");
    EXPECT_EQ(declaredEncoding("<?xml encoding"), "");
    EXPECT_EQ(declaredEncoding("<?xml encoding='e"), "e");
    EXPECT_EQ(declaredEncoding("<?xml encoding='"), "");
}

} // namespace quorl::media::test
