// What the user is told of a sync.

#include "quorl-syncd/transfer/Messages.h"

#include <cerrno>
#include <cstring>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace {

using namespace quorl::syncd;
using quorl::engine::Message;
using ::testing::AllOf;
using ::testing::HasSubstr;
using ::testing::StartsWith;

std::string sentenceFor(int number) {
    return quorl::engine::sentence(messageOf(std::error_code(number, std::generic_category())));
}

TEST(Messages, SayWhatIsWrongWithADeviceAndWhatToDo) {
    for (const auto number : {ENOSPC, EDQUOT}) {
        EXPECT_EQ(sentenceFor(number), "The Velora is full. Remove something from it, or choose a "
                                       "lower limit.");
    }
    for (const auto number : {EROFS, EACCES, EPERM}) {
        EXPECT_THAT(sentenceFor(number),
                    AllOf(StartsWith("The Velora cannot be written to: "),
                          HasSubstr(std::strerror(number)), HasSubstr("write-protected")));
    }
    for (const auto number : {ENOENT, ENODEV, EIO, ESTALE}) {
        EXPECT_THAT(sentenceFor(number),
                    AllOf(StartsWith("The Velora went away: "), HasSubstr(std::strerror(number)),
                          HasSubstr("Connect it again.")));
    }
    for (const auto number : {ENOTDIR, ELOOP}) {
        EXPECT_EQ(sentenceFor(number),
                  "On the Velora, “Music” or “.quorl” is not a directory. Give "
                  "it another name, or remove it.");
    }
    EXPECT_EQ(sentenceFor(EEXIST), "The Velora could not be synced: File exists.");
}

TEST(Messages, HaveNumbersForPrograms) {
    EXPECT_EQ(notEnoughSpace((1 << 20) + 1, 7), (Message{"not-enough-space", {"1048577", "7"}}));
    EXPECT_EQ(synced(2, 0), (Message{"synced", {"2"}}));
    EXPECT_EQ(synced(2, 1), (Message{"synced-but", {"2", "1"}}));
}

TEST(Messages, TellTheFirstSongThatIsMissingAndHowManyThereAre) {
    const Message gone{"song-gone", {"a.mp3"}};
    EXPECT_EQ(notAllSent({gone}), (Message{"songs-left-out", {"1", "song-gone", "a.mp3"}}));
    EXPECT_EQ(notAllSent({gone, {}, {}}), (Message{"songs-left-out", {"3", "song-gone", "a.mp3"}}));
}

} // namespace
