// Names that every wearable can hold, whatever the song is called.

#include "quorl-syncd/transfer/device/DeviceNames.h"

#include <set>

#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <unicode/unistr.h>

namespace {

using namespace quorl::syncd;
using ::testing::EndsWith;

struct Named {
    std::string song;
    std::string onDevice;
};

class DeviceName : public ::testing::TestWithParam<Named> {};

TEST_P(DeviceName, IsOneThatFatCanHold) {
    EXPECT_EQ(deviceName(GetParam().song), GetParam().onDevice);
}

INSTANTIATE_TEST_SUITE_P(
    Song, DeviceName,
    ::testing::Values(Named{"Song.mp3", "Song.mp3"},
                      Named{"What? \"No\": a*b|c<d>e\\f/g.mp3", "What_ _No__ a_b_c_d_e_f_g.mp3"},
                      Named{"tab\tnewline\ndel\x7F.mp3", "tab_newline_del_.mp3"},
                      Named{"ends with a dot.", "ends with a dot"},
                      Named{"ends with blanks . . ", "ends with blanks"},
                      Named{"CON.mp3", "_CON.mp3"}, Named{"nul", "_nul"},
                      Named{"com7.tar.gz", "_com7.tar.gz"}, Named{"LPT¹.mp3", "_LPT¹.mp3"},
                      Named{"aux .mp3", "_aux .mp3"}, Named{"Console.mp3", "Console.mp3"},
                      Named{"com10.mp3", "com10.mp3"}, Named{"..", "_"}, Named{".", "_"},
                      Named{"", "_"}, Named{" ", "_"}, Named{".hidden.mp3", "_.hidden.mp3"},
                      Named{"../up.mp3", "_.._up.mp3"}, Named{"Bj\xF6rk.mp3", "Bj\uFFFDrk.mp3"},
                      Named{"Bjo\u0308rk.mp3", "Björk.mp3"},
                      Named{"日本語 🎵.mp3", "日本語 🎵.mp3"}));

TEST(DeviceNames, KeepTheirExtensionAndWholeCharactersWhenTheyAreTooLong) {
    for (const std::string character : {"x", "ö", "語", "🎵"}) {
        std::string song;
        while (song.size() < 400) {
            song += character;
        }

        const auto name = deviceName(song + ".mp3");

        EXPECT_LE(name.size(), 255);
        EXPECT_GT(name.size(), 245) << "no more is cut off than need be";
        EXPECT_THAT(name, EndsWith(character + ".mp3"));
        EXPECT_LE(icu::UnicodeString::fromUTF8(name).length(), 255);
    }
}

TEST(DeviceNames, ThatFoldToOneAreToldApart) {
    TakenNames names;
    EXPECT_EQ(names.take("Song.mp3"), "Song.mp3");
    EXPECT_EQ(names.take("SONG.mp3"), "SONG (2).mp3");
    EXPECT_EQ(names.take("song.MP3"), "song (3).MP3");
    EXPECT_EQ(names.take("Ärger.mp3"), "Ärger.mp3");
    EXPECT_EQ(names.take("a\u0308RGER.mp3"), "äRGER (2).mp3");
    EXPECT_EQ(names.take("a?.mp3"), "a_.mp3");
    EXPECT_EQ(names.take("a*.mp3"), "a_ (2).mp3");
}

TEST(DeviceNames, AreFoundForManySongsOfOneNameWithoutTryingAllNumbersEachTime) {
    constexpr std::size_t songs = 20'000;
    TakenNames names;
    std::set<std::string> taken;
    for (std::size_t song = 0; song < songs; ++song) {
        taken.insert(names.take("Intro.mp3"));
    }

    EXPECT_EQ(taken.size(), songs);
    EXPECT_LE(names.lookUps(), 2 * songs);
}

TEST(DeviceNames, ThatAreTooLongStayToldApart) {
    TakenNames names;
    const auto first = names.take(std::string(300, 'x') + ".mp3");

    const auto second = names.take(std::string(300, 'x') + ".mp3");

    EXPECT_NE(first, second);
    EXPECT_LE(second.size(), 255);
    EXPECT_THAT(second, EndsWith("x (2).mp3"));
}

TEST(DeviceNames, LeaveAFileThatSomebodyElsePutThereItsName) {
    TakenNames names;
    names.add("Song.MP3");

    EXPECT_EQ(names.take("song.mp3"), "song (2).mp3");
}

} // namespace
