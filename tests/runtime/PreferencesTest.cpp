#include <limits>

#include <gmock/gmock.h>

#include "tests/support/MainQueueRun.h"
#include "tests/support/TestHost.h"

namespace {

using quorl::SyncPreference;
using quorl::tests::runQueuedWork;
using quorl::tests::TestHost;

constexpr auto largest64 = std::numeric_limits<std::uint64_t>::max();

class Preferences : public testing::Test {
  protected:
    Preferences() { runQueuedWork(); }

    /// How often a change has been announced until now.
    [[nodiscard]] std::size_t announcements() const {
        return host_->journal.count("post LMSyncPreferencesDidChangeNotification");
    }

    /// What another process does.
    void changeElsewhere(SyncPreference preference, std::uint64_t value) {
        (void)host_->preferences.setValue(preference, value);
        quorl::SyncDefaults::announceChange();
    }

    static std::shared_ptr<NSNumber> number(std::uint64_t value) {
        return NSNumber::numberWithUnsignedLongLong(value);
    }

    std::shared_ptr<TestHost> host_ = TestHost::installed();
    LMSyncDefaults& defaults_ = LMSyncDefaults::sharedDefaults();
};

TEST_F(Preferences, AreOffAndEmptyAtFirst) {
    EXPECT_FALSE(defaults_.isAssetSyncEnabled());
    EXPECT_EQ(defaults_.assetSyncPlaylistPersistentID(), nullptr);
    EXPECT_EQ(defaults_.assetSyncLimitType(), 0U);
    EXPECT_EQ(defaults_.assetSyncLimit(), nullptr);
    EXPECT_EQ(defaults_.lastFullySentAssetSyncPlaylistPersistentID(), nullptr);
    EXPECT_EQ(defaults_.lastFullySentAssetSyncPlaylistVersion(), nullptr);
}

TEST_F(Preferences, GiveBackAtOnceWhatWasStored) {
    defaults_.setAssetSyncEnabled(true);
    defaults_.setAssetSyncPlaylistPersistentID(number(largest64));
    defaults_.setAssetSyncLimitType(1);
    defaults_.setAssetSyncLimit(number(250));

    EXPECT_TRUE(defaults_.isAssetSyncEnabled());
    EXPECT_EQ(defaults_.assetSyncPlaylistPersistentID()->unsignedLongLongValue(), largest64);
    EXPECT_EQ(defaults_.assetSyncLimitType(), 1U);
    EXPECT_EQ(defaults_.assetSyncLimit()->unsignedIntegerValue(), 250U);
}

TEST_F(Preferences, GiveTheSameNumberUntilItChanges) {
    defaults_.setAssetSyncLimit(number(250));
    const auto before = defaults_.assetSyncLimit();
    EXPECT_EQ(defaults_.assetSyncLimit(), before);

    defaults_.setAssetSyncLimit(number(500));
    EXPECT_EQ(before->unsignedIntegerValue(), 250U);
    EXPECT_EQ(defaults_.assetSyncLimit()->unsignedIntegerValue(), 500U);
}

TEST_F(Preferences, AreClearedByNull) {
    defaults_.setAssetSyncPlaylistPersistentID(number(7));
    defaults_.setAssetSyncLimit(number(15));

    defaults_.setAssetSyncPlaylistPersistentID(nullptr);
    defaults_.setAssetSyncLimit(nullptr);

    EXPECT_EQ(defaults_.assetSyncPlaylistPersistentID(), nullptr);
    EXPECT_EQ(defaults_.assetSyncLimit(), nullptr);
}

TEST_F(Preferences, AnnounceAChangeOnTheMainQueueAfterTheSetterHasReturned) {
    defaults_.setAssetSyncEnabled(true);
    EXPECT_EQ(announcements(), 0U);

    runQueuedWork();
    EXPECT_EQ(announcements(), 1U);
}

TEST_F(Preferences, AnnounceEachSetterThatChangedSomething) {
    defaults_.setAssetSyncLimit(number(250));
    defaults_.setAssetSyncLimitType(1);
    defaults_.setAssetSyncEnabled(true);
    defaults_.setAssetSyncPlaylistPersistentID(number(7));
    defaults_.setAssetSyncPlaylistPersistentID(number(8));
    runQueuedWork();

    EXPECT_EQ(announcements(), 5U);
}

TEST_F(Preferences, AnnounceNothingWhereTheValueWasTheSame) {
    defaults_.setAssetSyncEnabled(false);
    defaults_.setAssetSyncLimitType(0);
    defaults_.setAssetSyncLimit(nullptr);
    defaults_.setAssetSyncPlaylistPersistentID(nullptr);
    runQueuedWork();
    EXPECT_EQ(announcements(), 0U);

    defaults_.setAssetSyncPlaylistPersistentID(number(7));
    defaults_.setAssetSyncPlaylistPersistentID(number(7));
    runQueuedWork();
    EXPECT_EQ(announcements(), 1U);
}

TEST_F(Preferences, TellNullFromZero) {
    defaults_.setAssetSyncLimit(number(0));
    runQueuedWork();

    EXPECT_EQ(announcements(), 1U);
    ASSERT_NE(defaults_.assetSyncLimit(), nullptr);
    EXPECT_EQ(defaults_.assetSyncLimit()->unsignedIntegerValue(), 0U);
}

TEST_F(Preferences, AnnounceNothingWhereTheStoreRefused) {
    host_->preferences.refuseWrites();

    defaults_.setAssetSyncEnabled(true);
    runQueuedWork();

    EXPECT_EQ(announcements(), 0U);
    EXPECT_FALSE(defaults_.isAssetSyncEnabled());
}

TEST_F(Preferences, ShowAndAnnounceWhatAnotherProcessChanged) {
    changeElsewhere(SyncPreference::LastFullySentAssetSyncPlaylistPersistentID, 7);
    changeElsewhere(SyncPreference::LastFullySentAssetSyncPlaylistVersion, 3);

    EXPECT_EQ(defaults_.lastFullySentAssetSyncPlaylistPersistentID()->unsignedLongLongValue(), 7U);
    EXPECT_EQ(defaults_.lastFullySentAssetSyncPlaylistVersion()->unsignedLongLongValue(), 3U);
    runQueuedWork();
    EXPECT_EQ(announcements(), 2U);
}

} // namespace
