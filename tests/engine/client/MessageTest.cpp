// What the engine tells, as people read it.

#include "services/engine/Message.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "services/engine/Codes.h"
#include "services/media/playlists/LeftOut.h"
#include "services/wearable/Unseen.h"

namespace {

using namespace quorl::engine;
namespace unseen = quorl::wearable::unseen;
using quorl::media::Reason;
using ::testing::ElementsAre;
using ::testing::HasSubstr;

TEST(Message, IsWordedWithItsArguments) {
    EXPECT_EQ(sentence({code::syncOff}), "Music sync is switched off.");
    EXPECT_EQ(sentence({code::synced, {"1"}}), "1 song synced to Velora.");
    EXPECT_EQ(sentence({code::synced, {"2"}}), "2 songs synced to Velora.");
    EXPECT_EQ(sentence({code::syncedBut, {"0", "3"}}),
              "0 songs synced to Velora. 3 songs could not be found or read.");
    EXPECT_EQ(sentence({code::upToDateBut, {"1"}}),
              "Everything that could be found is on the Velora. 1 song could not be found or "
              "read.");
    EXPECT_EQ(sentence({code::wentAway, {"Input/output error"}}),
              "The Velora went away: Input/output error. Connect it again.");
    EXPECT_EQ(sentence({code::obstructed}),
              "On the Velora, “Music” or “.quorl” is not a directory. Give it another name, or "
              "remove it.");
    EXPECT_EQ(sentence(other("The store is full.")), "The store is full.");
}

TEST(Message, RoundsSpaceUp) {
    EXPECT_THAT(sentence({code::notEnoughSpace, {"1048577", "1048576"}}),
                HasSubstr("2 MB are needed for new songs, 1 MB are available"));
    EXPECT_THAT(sentence({code::notEnoughSpace, {"18446744073709551615", "0"}}),
                HasSubstr("17,592,186,044,416 MB are needed for new songs, 0 MB are available"));
}

TEST(Message, NamesASongWhereItIsGiven) {
    EXPECT_EQ(sentence({code::songGone, {"a/b.mp3"}}),
              "“a/b.mp3” is no longer in the music folder.");
    EXPECT_EQ(sentence({code::songGone}), "It is no longer in the music folder.");
    EXPECT_EQ(sentence({code::songUnreadable, {"b.mp3", "Permission denied"}}),
              "“b.mp3” cannot be read: Permission denied.");
    EXPECT_EQ(sentence({code::songUnreadable}), "It cannot be read.");
}

TEST(Message, TellsWhatIsTheMatterWithASong) {
    EXPECT_EQ(sentence({code::songNotAFile, {"a.mp3"}}), "“a.mp3” is not a file any more.");
    EXPECT_EQ(sentence({code::songChanged, {"a.mp3"}}),
              "“a.mp3” has just been changed. It will be sent once it stays as it is.");
    EXPECT_EQ(sentence({code::songTooLarge, {"a.mp3"}}),
              "“a.mp3” is larger than a file on the Velora can be.");
}

TEST(Message, TellsWhyAWearableCannotBeLookedAt) {
    EXPECT_EQ(sentence({unseen::unreachable, {"/media/a\nb", "Permission denied"}}),
              "The Velora at /media/a\uFFFDb cannot be reached: Permission denied.");
    EXPECT_EQ(sentence({unseen::silent}), "The Velora does not answer. Check its connection.");
    EXPECT_EQ(sentence({unseen::notPluggedIn}),
              "The Velora that was chosen is not plugged in. Plug it in.");
    const std::string rest =
        " is at /media/a in its place. Plug in the one that was chosen, or choose this one.";
    EXPECT_EQ(sentence({unseen::otherDrive, {"/media/a"}}),
              "The Velora that was chosen is not connected. Another drive" + rest);
    EXPECT_EQ(sentence({unseen::otherDrive, {"/media/a", "STICK"}}),
              "The Velora that was chosen is not connected. Another drive, “STICK”," + rest);
}

TEST(Message, HasTitles) {
    EXPECT_EQ(sentence({code::titleSynced}), "Music synced");
    EXPECT_EQ(sentence({code::titleNotSynced}), "Music not synced");
}

TEST(Message, TellsTheFirstSongThatIsLeftOutAndHowManyMoreThereAre) {
    EXPECT_EQ(sentence({code::songsLeftOut, {"1", "song-gone", "a.mp3"}}),
              "“a.mp3” is no longer in the music folder.");
    EXPECT_EQ(sentence({code::songsLeftOut, {"2", "song-gone", "a.mp3"}}),
              "“a.mp3” is no longer in the music folder. 1 more song could not be sent.");
    EXPECT_EQ(sentence({code::songsLeftOut, {"3", "song-unreadable", "a.mp3", "No."}}),
              "“a.mp3” cannot be read: No.. 2 more songs could not be sent.");
}

TEST(Message, TellsWhatEndsASync) {
    const Message why{code::notEnoughSpace, {"0", "0"}};
    const Message stopping{code::stopping, flat(why)};
    EXPECT_THAT(stopping.arguments, ElementsAre("not-enough-space", "0", "0"));
    EXPECT_EQ(sentence(stopping), "Ending the sync. " + sentence(why));
}

TEST(Message, HasTheSentencesOfWhatAPlaylistNamesAndTheMusicFolderHasNot) {
    EXPECT_EQ(sentence({"missing"}), quorl::media::sentence(Reason::Missing));
    for (auto reason = Reason::NoAddress; reason <= Reason::DirectoryUnreadable;
         reason = static_cast<Reason>(static_cast<int>(reason) + 1)) {
        const std::string code(quorl::media::code(reason));
        EXPECT_EQ(quorl::media::reasonOf(code), reason) << code;
        EXPECT_EQ(sentence({code}), quorl::media::sentence(reason));
    }
}

TEST(Message, OfAnotherEngineMayBeAnything) {
    EXPECT_EQ(sentence({}), "");
    EXPECT_EQ(sentence({"weather", {"fine"}}), "");
    EXPECT_EQ(sentence({code::synced}), " synced to Velora.");
    EXPECT_EQ(sentence({code::synced, {"many"}}), "many synced to Velora.");
    EXPECT_THAT(sentence({code::notEnoughSpace, {"much", "little"}}),
                HasSubstr("much are needed for new songs, little are available"));
    EXPECT_EQ(sentence({code::syncOff, std::vector<std::string>(8)}),
              "Music sync is switched off.");
    EXPECT_EQ(sentence({code::syncOff, std::vector<std::string>(9)}), "");
    EXPECT_EQ(sentence({code::stopping}), "Ending the sync. ");
    EXPECT_EQ(sentence({code::songsLeftOut}), "");
    EXPECT_EQ(sentence({code::songGone, {"\x1B[2J"}}), sentence({code::songGone, {"\uFFFD[2J"}}));
    EXPECT_EQ(sentence({code::stopping, std::vector<std::string>(100'000, code::stopping)}), "");
}

} // namespace
