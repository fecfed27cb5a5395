// The list of our files on a device, step by step.

#include "quorl-syncd/transfer/Ledger.h"

#include <cerrno>
#include <system_error>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "tests/engine/Folders.h"
#include "tests/engine/transfer/ObservedVolume.h"

namespace {

using namespace quorl::syncd;
using namespace quorl::syncd::testing;
using quorl::wearable::Entry;
using quorl::wearable::hashOf;
using quorl::wearable::Manifest;
using quorl::wearable::Selection;
using ::testing::ElementsAre;
using ::testing::IsEmpty;

Entry entry(const std::string& name) { return {name, "from " + name, 3, 1, hashOf("contents")}; }

class Ledgers : public ::testing::Test {
  protected:
    /// What another program would read.
    [[nodiscard]] Manifest onDevice() const { return player_.manifest(); }

    void songsCome(const std::vector<Entry>& songs) {
        ledger_.announce(songs);
        ledger_.songsAreThere(songs);
    }

    Player player_;
    int writes_ = 0;
    bool failsSync_ = false;
    Device device_{std::make_unique<ObservedVolume>(
        openPosixVolume(player_.wearable()), [this](const Step& step) {
            writes_ += step.operation == "write" ? 1 : 0;
            if (failsSync_ && step.operation == "fsync") {
                throw std::system_error(EIO, std::generic_category());
            }
        })};
    Ledger ledger_{device_};
    const Entry one_ = entry("one");
    const Entry two_ = entry("two");
    const Entry list_ = entry("List.m3u8");
};

TEST_F(Ledgers, IsEmptyOnANewDeviceAndWritesNothingUntilItChanges) {
    ledger_.save();

    EXPECT_EQ(ledger_.manifest(), Manifest());
    EXPECT_TRUE(ledger_.isSaved());
    EXPECT_EQ(writes_, 0);
}

TEST_F(Ledgers, WritesEachStateOnce) {
    ledger_.announce(std::vector{one_});
    EXPECT_FALSE(ledger_.isSaved());

    ledger_.save();
    ledger_.save();

    EXPECT_EQ(writes_, 1);
    EXPECT_EQ(onDevice(), ledger_.manifest());
}

TEST_F(Ledgers, TakesAnnouncedFilesForStraysUntilTheyAreThere) {
    ledger_.announce(std::vector{one_, two_});
    EXPECT_THAT(ledger_.manifest().strays, ElementsAre(one_, two_));

    ledger_.songsAreThere(std::vector{two_});

    EXPECT_THAT(ledger_.manifest().strays, ElementsAre(one_));
    EXPECT_THAT(ledger_.manifest().songs, ElementsAre(two_));
    ledger_.revoke("one");
    EXPECT_THAT(ledger_.manifest().strays, IsEmpty());
}

TEST_F(Ledgers, AnnouncesANameOnce) {
    ledger_.announce(std::vector{one_});
    auto other = one_;
    other.size = 4;

    ledger_.announce(std::vector{other});

    EXPECT_THAT(ledger_.manifest().strays, ElementsAre(other));
}

TEST_F(Ledgers, AdoptsWhatIsComplete) {
    ledger_.announce(std::vector{one_, two_});

    ledger_.adopt(std::vector{one_});

    EXPECT_THAT(ledger_.manifest().songs, ElementsAre(one_));
    EXPECT_THAT(ledger_.manifest().strays, ElementsAre(two_));
}

TEST_F(Ledgers, DoesNotTakeForThereWhatHasNoHashOrWasNotAnnounced) {
    auto withoutHash = one_;
    withoutHash.hash.reset();
    ledger_.announce(std::vector{withoutHash});

    ledger_.songsAreThere(std::vector{withoutHash, two_});

    EXPECT_THAT(ledger_.manifest().strays, ElementsAre(withoutHash));
    EXPECT_THAT(ledger_.manifest().songs, IsEmpty());
    EXPECT_THAT(ledger_.announced(), ElementsAre("one"));
}

TEST_F(Ledgers, ForgetsWhatIsNotThereAndIsOnlyThenNotSaved) {
    songsCome({one_, two_});
    ledger_.save();
    const Hashes hashes{[](const Entry&) { return hashOf("contents"); },
                        [](const auto&) { return hashOf("contents"); }};
    const quorl::base::FileState there{3, 1};

    ledger_.keepWhatIsThere([&](const auto&) { return std::optional(there); }, hashes);
    EXPECT_TRUE(ledger_.isSaved());

    ledger_.keepWhatIsThere(
        [&](const auto& name) { return name == "one" ? std::nullopt : std::optional(there); },
        hashes);
    EXPECT_FALSE(ledger_.isSaved());
    EXPECT_THAT(ledger_.manifest().songs, ElementsAre(two_));
}

TEST_F(Ledgers, KeepsWhatIsToBeRemovedAsStraysUntilItIsGone) {
    songsCome({one_, two_});
    ledger_.announce(std::vector{entry("never came")});

    ledger_.keepOnly({two_});

    EXPECT_THAT(ledger_.manifest().songs, ElementsAre(two_));
    EXPECT_THAT(ledger_.manifest().strays, ElementsAre(entry("never came"), one_));
    ledger_.putAside({two_});
    EXPECT_THAT(ledger_.manifest().songs, IsEmpty());
    ledger_.straysAreGone();
    EXPECT_THAT(ledger_.manifest().strays, IsEmpty());
}

TEST_F(Ledgers, HasThePlaylistInsteadOfItsAnnouncement) {
    ledger_.announce(std::vector{list_});

    ledger_.playlistIsThere(list_);

    EXPECT_EQ(ledger_.manifest().playlist, list_);
    EXPECT_THAT(ledger_.manifest().strays, IsEmpty());
    ledger_.playlistIsGone();
    EXPECT_FALSE(ledger_.manifest().playlist);
}

TEST_F(Ledgers, SaysThatAllWasSentUntilThatIsWithdrawn) {
    const Selection selection{1, 2, 3, 4};
    ledger_.wasSent(selection);
    ledger_.save();
    EXPECT_EQ(onDevice().sent, selection);

    ledger_.withdrawClaim();
    ledger_.save();

    EXPECT_FALSE(onDevice().sent);
}

TEST_F(Ledgers, DoesNotTakeForSavedWhatCouldNotBe) {
    ledger_.announce(std::vector{one_});
    failsSync_ = true;
    EXPECT_THROW(ledger_.save(), std::system_error);
    EXPECT_FALSE(ledger_.isSaved());
    failsSync_ = false;

    ledger_.save();

    EXPECT_EQ(onDevice(), ledger_.manifest());
}

TEST_F(Ledgers, GoesOnWithWhatIsOnTheDevice) {
    songsCome({one_});
    ledger_.save();

    const Ledger next(device_);

    EXPECT_EQ(next.manifest(), ledger_.manifest());
    EXPECT_TRUE(next.isSaved());
}

} // namespace
