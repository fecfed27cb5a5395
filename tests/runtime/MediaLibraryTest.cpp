#include <gmock/gmock.h>

#include "tests/support/TestHost.h"

namespace {

using quorl::tests::TestHost;
using testing::ElementsAre;
using testing::IsEmpty;

class Library : public testing::Test {
  protected:
    [[nodiscard]] std::size_t announcements() const {
        return host_->journal.count("post MPMediaLibraryDidChangeNotification");
    }

    static std::vector<std::uint64_t> idsOf(const MPMediaQuery& query) {
        std::vector<std::uint64_t> ids;
        const auto collections = query.collections();
        for (const auto& playlist : elements<MPMediaPlaylist>(collections)) {
            ids.push_back(playlist->persistentID());
        }
        return ids;
    }

    static std::shared_ptr<MPMediaPropertyPredicate> equal(std::uint64_t value,
                                                           MPMediaProperty property) {
        return MPMediaPropertyPredicate::predicateWithValue_forProperty(
            NSNumber::numberWithUnsignedLongLong(value), property);
    }

    std::shared_ptr<TestHost> host_ = TestHost::installed();
    quorl::LibraryDouble& library_ = host_->mediaLibrary();
};

TEST_F(Library, AnnouncesChangesOnlyWhileSomebodyWantsToKnow) {
    library_.contentsDidChange();
    EXPECT_EQ(announcements(), 0U);

    library_.beginGeneratingLibraryChangeNotifications();
    library_.contentsDidChange();
    EXPECT_EQ(announcements(), 1U);

    library_.endGeneratingLibraryChangeNotifications();
    library_.contentsDidChange();
    EXPECT_EQ(announcements(), 1U);
}

TEST_F(Library, AnnouncesUntilTheLastWhoWantedToKnowHasLeft) {
    library_.beginGeneratingLibraryChangeNotifications();
    library_.beginGeneratingLibraryChangeNotifications();

    library_.endGeneratingLibraryChangeNotifications();
    library_.contentsDidChange();
    EXPECT_EQ(announcements(), 1U);

    library_.endGeneratingLibraryChangeNotifications();
    library_.contentsDidChange();
    EXPECT_EQ(announcements(), 1U);
}

TEST_F(Library, TakesAnEndTooManyForNothing) {
    library_.endGeneratingLibraryChangeNotifications();

    library_.beginGeneratingLibraryChangeNotifications();
    library_.contentsDidChange();

    EXPECT_EQ(announcements(), 1U);
}

class Sender : public NSObject {
  public:
    void note(const NSNotification& notification) { sender = notification.object; }

    const NSObject* sender = nullptr;
};

TEST_F(Library, IsTheSenderOfItsAnnouncements) {
    const auto observer = create<Sender>();
    NSNotificationCenter::defaultCenter().addObserver_selector_name_object(
        observer.get(), NSNotificationSelector::of<&Sender::note>("note:"),
        MPMediaLibraryDidChangeNotification, &library_);
    library_.beginGeneratingLibraryChangeNotifications();

    library_.contentsDidChange();

    EXPECT_EQ(observer->sender, &library_);
}

TEST_F(Library, GivesAllPlaylistsInItsOrderWithoutAPredicate) {
    library_.addPlaylist(3, "C");
    library_.addPlaylist(1, "A");

    EXPECT_THAT(idsOf(*MPMediaQuery::playlistsQuery()), ElementsAre(3, 1));
}

TEST_F(Library, GivesThePlaylistsThatFulfilEveryPredicate) {
    library_.addPlaylist(1, "A")->setRevision(5);
    library_.addPlaylist(2, "B")->setRevision(5);
    library_.addPlaylist(2, "another B")->setRevision(6);
    const auto query = MPMediaQuery::playlistsQuery();

    query->addFilterPredicate(equal(2, MPMediaPlaylistPropertyPersistentID));
    EXPECT_THAT(idsOf(*query), ElementsAre(2, 2));
    query->addFilterPredicate(equal(5, MPMediaEntityPropertyEntityRevision));
    EXPECT_THAT(idsOf(*query), ElementsAre(2));
    query->addFilterPredicate(equal(6, MPMediaEntityPropertyEntityRevision));
    EXPECT_THAT(idsOf(*query), IsEmpty());
}

TEST_F(Library, ComparesAll64BitsOfAnId) {
    library_.addPlaylist(0x1'0000'0007, "beyond 32 bits");
    const auto query = MPMediaQuery::playlistsQuery();

    query->addFilterPredicate(equal(7, MPMediaPlaylistPropertyPersistentID));

    EXPECT_THAT(idsOf(*query), IsEmpty());
}

TEST_F(Library, TakesAMissingPropertyForEqualToNothing) {
    library_.addPlaylist(1, "A");
    const auto query = MPMediaQuery::playlistsQuery();

    query->addFilterPredicate(equal(0, MPMediaEntityPropertyEntityRevision));

    EXPECT_THAT(idsOf(*query), IsEmpty());
}

TEST_F(Library, IsAskedAnewAtEachQuery) {
    const auto query = MPMediaQuery::playlistsQuery();
    const auto before = query->collections();
    library_.addPlaylist(1, "A");

    EXPECT_THAT(idsOf(*query), ElementsAre(1));
    EXPECT_TRUE(before->empty()) << "what a query gave stays as it was";
}

} // namespace
