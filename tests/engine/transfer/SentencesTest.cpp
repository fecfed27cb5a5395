// What the user is told of a sync.

#include "quorl-syncd/transfer/Sentences.h"

#include <cerrno>
#include <cstring>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace {

using namespace quorl::syncd;
using ::testing::AllOf;
using ::testing::HasSubstr;
using ::testing::StartsWith;

std::string sentenceFor(int number) {
    const std::error_code error(number, std::generic_category());
    return sentence(troubleOf(error), error);
}

TEST(Sentences, SayWhatIsWrongWithADeviceAndWhatToDo) {
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

TEST(Sentences, RoundSpaceUpAndCountSongs) {
    EXPECT_THAT(notEnoughSpace((1 << 20) + 1, 1 << 20),
                HasSubstr("2 MB are needed for new songs, 1 MB are available"));
    EXPECT_THAT(notEnoughSpace(~std::uint64_t{0}, 0),
                HasSubstr("17592186044416 MB are needed for new songs, 0 MB are available"));
    EXPECT_EQ(synced(1), "1 song synced to Velora.");
    EXPECT_EQ(synced(2), "2 songs synced to Velora.");
}

TEST(Sentences, TellTheFirstSongThatIsMissingAndHowManyMoreThereAre) {
    EXPECT_EQ(notAllSent({"One is gone."}), "One is gone.");
    EXPECT_EQ(notAllSent({"One is gone.", "b"}), "One is gone. 1 song more could not be sent.");
    EXPECT_EQ(notAllSent({"One is gone.", "b", "c"}),
              "One is gone. 2 songs more could not be sent.");
}

} // namespace
