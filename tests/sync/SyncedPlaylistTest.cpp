#include <gmock/gmock.h>

#include "sync/LMSyncDefaults+Extras.h"
#include "tests/support/TestHost.h"
#include "tests/support/VirtualRun.h"

namespace {

using quorl::PlaylistDouble;
using quorl::SyncPreference;
using quorl::tests::drain;
using quorl::tests::TestHost;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::SizeIs;

class SyncedPlaylist : public testing::Test {
  protected:
    /// Stores what the test begins with, unseen by the journal.
    void choose(std::optional<std::uint64_t> persistentID, bool enabled = true) {
        (void)host_->preferences.setValue(SyncPreference::AssetSyncEnabled, enabled ? 1 : 0);
        (void)host_->preferences.setValue(SyncPreference::AssetSyncPlaylistPersistentID,
                                          persistentID);
    }

    static std::shared_ptr<MPMediaPlaylist> resolve() {
        return assetSyncPlaylist(LMSyncDefaults::sharedDefaults());
    }

    static void store(const std::shared_ptr<MPMediaPlaylist>& playlist) {
        setAssetSyncPlaylist(LMSyncDefaults::sharedDefaults(), playlist);
    }

    [[nodiscard]] std::vector<std::string> queries() const {
        return host_->journal.lines({"query"});
    }

    void changeLibrary() {
        host_->mediaLibrary().beginGeneratingLibraryChangeNotifications();
        host_->mediaLibrary().contentsDidChange();
        host_->mediaLibrary().endGeneratingLibraryChangeNotifications();
    }

    std::shared_ptr<TestHost> host_ = TestHost::installed();
    std::shared_ptr<PlaylistDouble> morning_ = host_->mediaLibrary().addPlaylist(7, "Morning");
    std::shared_ptr<PlaylistDouble> evening_ =
        host_->mediaLibrary().addPlaylist(0x1'0000'0007, "Evening");
};

TEST_F(SyncedPlaylist, IsNoneWhileSyncIsOffAndNothingElseIsAsked) {
    choose(7, false);

    EXPECT_EQ(resolve(), nullptr);

    EXPECT_THAT(host_->journal.lines({"read", "query", "observe"}),
                ElementsAre("read assetSyncEnabled"));
}

TEST_F(SyncedPlaylist, ComesBackWhenSyncIsSwitchedOnAgain) {
    choose(7, false);
    ASSERT_EQ(resolve(), nullptr);

    LMSyncDefaults::sharedDefaults().setAssetSyncEnabled(true);

    EXPECT_EQ(resolve(), morning_);
}

TEST_F(SyncedPlaylist, IsNoneWhereNoneWasChosen) {
    choose(std::nullopt);

    EXPECT_EQ(resolve(), nullptr);

    EXPECT_THAT(host_->journal.lines({"read", "query", "observe"}),
                ElementsAre("read assetSyncEnabled", "read assetSyncPlaylistPersistentID"));
}

TEST_F(SyncedPlaylist, StaysRememberedWhileNoIdIsStored) {
    choose(7);
    ASSERT_EQ(resolve(), morning_);

    choose(std::nullopt);
    EXPECT_EQ(resolve(), nullptr);

    choose(7);
    EXPECT_EQ(resolve(), morning_);
    EXPECT_THAT(queries(), SizeIs(1));
}

TEST_F(SyncedPlaylist, StaysRememberedWhileSyncIsOff) {
    choose(7);
    ASSERT_EQ(resolve(), morning_);

    choose(7, false);
    EXPECT_EQ(resolve(), nullptr);

    choose(7);
    EXPECT_EQ(resolve(), morning_);
    EXPECT_THAT(queries(), SizeIs(1));
}

TEST_F(SyncedPlaylist, IsFoundByItsIdWithOneQueryAndThenRemembered) {
    choose(7);

    EXPECT_EQ(resolve(), morning_);
    EXPECT_EQ(resolve(), morning_);
    EXPECT_EQ(resolve(), morning_);

    EXPECT_THAT(queries(), ElementsAre("query MPMediaPlaylistPropertyPersistentID=7"));
}

TEST_F(SyncedPlaylist, IsFoundByAll64BitsOfItsId) {
    choose(0x1'0000'0007);
    EXPECT_EQ(resolve(), evening_);

    choose(7);
    EXPECT_EQ(resolve(), morning_);
}

TEST_F(SyncedPlaylist, IsAskedForAgainEachTimeWhereTheLibraryLacksIt) {
    choose(99);

    EXPECT_EQ(resolve(), nullptr);
    EXPECT_EQ(resolve(), nullptr);

    EXPECT_THAT(queries(), SizeIs(2));
    EXPECT_EQ(host_->preferences.value(SyncPreference::AssetSyncPlaylistPersistentID), 99U);
}

TEST_F(SyncedPlaylist, IsFoundOnceItHasComeIntoTheLibrary) {
    choose(99);
    ASSERT_EQ(resolve(), nullptr);

    const auto arrived = host_->mediaLibrary().addPlaylist(99, "Late");

    EXPECT_EQ(resolve(), arrived);
}

TEST_F(SyncedPlaylist, IsTheFirstOfSeveralWithOneId) {
    host_->mediaLibrary().addPlaylist(7, "Morning once more");
    choose(7);

    EXPECT_EQ(resolve(), morning_);
}

TEST_F(SyncedPlaylist, FollowsAnIdThatSomebodyElseStored) {
    choose(7);
    ASSERT_EQ(resolve(), morning_);

    choose(0x1'0000'0007);

    EXPECT_EQ(resolve(), evening_);
    EXPECT_EQ(resolve(), evening_);
    EXPECT_THAT(queries(), SizeIs(2));
}

TEST_F(SyncedPlaylist, IsForgottenWhenSomebodyElseStoredAnIdThatTheLibraryLacks) {
    choose(7);
    ASSERT_EQ(resolve(), morning_);
    choose(99);
    ASSERT_EQ(resolve(), nullptr);

    choose(7);

    EXPECT_EQ(resolve(), morning_);
    EXPECT_THAT(queries(), SizeIs(3)) << "the null result took the place of the playlist";
}

TEST_F(SyncedPlaylist, IsForgottenWhenTheLibraryChanges) {
    choose(7);
    ASSERT_EQ(resolve(), morning_);

    host_->mediaLibrary().removePlaylist(morning_);
    changeLibrary();
    EXPECT_THAT(queries(), SizeIs(1)) << "the change itself asks nothing";

    EXPECT_EQ(resolve(), nullptr);
    EXPECT_EQ(resolve(), nullptr);
    EXPECT_THAT(queries(), SizeIs(3));
    EXPECT_EQ(host_->preferences.value(SyncPreference::AssetSyncPlaylistPersistentID), 7U);
}

TEST_F(SyncedPlaylist, OutlivesAnEditOfTheLibraryThatNobodyWantedToHearOf) {
    choose(7);
    ASSERT_EQ(resolve(), morning_);

    host_->mediaLibrary().removePlaylist(morning_);
    host_->mediaLibrary().contentsDidChange();

    EXPECT_EQ(resolve(), morning_);
}

TEST_F(SyncedPlaylist, IsThereWithoutAQueryAfterItWasChosen) {
    choose(std::nullopt);

    store(evening_);

    EXPECT_EQ(resolve(), evening_);
    EXPECT_THAT(queries(), IsEmpty());
    EXPECT_THAT(host_->journal.lines({"write"}),
                ElementsAre("write assetSyncPlaylistPersistentID 4294967303"));
}

TEST_F(SyncedPlaylist, KeepsTheSwitchAsItIsWhenItIsChosen) {
    choose(std::nullopt, false);

    store(morning_);

    EXPECT_EQ(resolve(), nullptr);
    EXPECT_EQ(host_->preferences.value(SyncPreference::AssetSyncEnabled), 0U);
    EXPECT_EQ(host_->preferences.value(SyncPreference::AssetSyncPlaylistPersistentID), 7U);
}

TEST_F(SyncedPlaylist, IsClearedByNull) {
    choose(7);
    ASSERT_EQ(resolve(), morning_);

    store(nullptr);

    EXPECT_EQ(resolve(), nullptr);
    EXPECT_EQ(host_->preferences.value(SyncPreference::AssetSyncPlaylistPersistentID),
              std::nullopt);
    EXPECT_EQ(host_->preferences.value(SyncPreference::AssetSyncEnabled), 1U);
    choose(7);
    EXPECT_EQ(resolve(), morning_);
    EXPECT_THAT(queries(), SizeIs(2)) << "the memory was emptied too";
}

/// Resolves the playlist at the moment of the announcement that its choice caused.
class Reader : public NSObject {
  public:
    void read() { seen = assetSyncPlaylist(LMSyncDefaults::sharedDefaults()); }

    std::shared_ptr<MPMediaPlaylist> seen;
};

TEST_F(SyncedPlaylist, IsThereForWhoeverHearsOfTheChoice) {
    choose(7);
    ASSERT_EQ(resolve(), morning_);
    const auto reader = create<Reader>();
    NSNotificationCenter::defaultCenter().addObserver_selector_name_object(
        reader.get(), NSNotificationSelector::of<&Reader::read>("read"),
        LMSyncPreferencesDidChangeNotification, nullptr);

    store(evening_);
    drain();

    EXPECT_EQ(reader->seen, evening_);
    EXPECT_THAT(queries(), SizeIs(1));
}

/// A store that looks the playlist up at the moment at which its id is being written.
class NosyDefaults final : public quorl::SyncDefaults {
  public:
    using SyncDefaults::SyncDefaults;

    void setAssetSyncPlaylistPersistentID(std::shared_ptr<NSNumber> persistentID) override {
        SyncDefaults::setAssetSyncPlaylistPersistentID(std::move(persistentID));
        seen = assetSyncPlaylist(*this);
    }

    std::shared_ptr<MPMediaPlaylist> seen;
};

TEST_F(SyncedPlaylist, IsRememberedBeforeItsIdIsWritten) {
    choose(std::nullopt);
    const auto defaults = std::make_shared<NosyDefaults>(host_->preferences);

    setAssetSyncPlaylist(*defaults, morning_);

    EXPECT_EQ(defaults->seen, morning_);
    EXPECT_THAT(queries(), IsEmpty());
}

TEST_F(SyncedPlaylist, IsRememberedByEachPreferencesObjectByItselfAndDiesWithIt) {
    choose(7);
    auto other = std::make_shared<quorl::SyncDefaults>(host_->preferences);
    ASSERT_EQ(resolve(), morning_);

    EXPECT_EQ(assetSyncPlaylist(*other), morning_);
    EXPECT_THAT(queries(), SizeIs(2));
    const auto holders = morning_.use_count();
    other.reset();

    EXPECT_EQ(morning_.use_count(), holders - 1);
    EXPECT_EQ(host_->journal.count("leave"), 1U);
}

TEST_F(SyncedPlaylist, ListensToTheLibraryFromItsFirstUseOnAndOnceOnly) {
    choose(7);
    (void)resolve();
    (void)resolve();
    store(evening_);

    EXPECT_THAT(host_->journal.lines({"observe"}),
                ElementsAre("observe MPMediaLibraryDidChangeNotification "
                            "_mediaLibraryDidChangeNotification: any"));
}

} // namespace
