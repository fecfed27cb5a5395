#include <QTest>

#include <gmock/gmock.h>

#include "quorl/adapters/MusicLibrary.h"
#include "quorl/process/MainQueueNotifier.h"
#include "tests/quorl/SampleMusic.h"

namespace quorl::tests {

namespace {

using testing::ElementsAre;
using testing::IsEmpty;

class TheLibrary : public testing::Test {
  protected:
    TheLibrary() {
        library_->open(music_.path(), [this](const media::Inventory& /*inventory*/) { ++taken_; });
        waitFor([this] { return taken_ > 0; });
    }

    template <class Condition>
    void waitFor(Condition isDone) {
        if (!QTest::qWaitFor(isDone, 60'000)) {
            throw std::runtime_error("the library does not change");
        }
    }

    [[nodiscard]] std::vector<std::string> names() const {
        std::vector<std::string> names;
        const auto playlists = library_->playlistsMatching({});
        for (const auto& playlist : elements<MPMediaPlaylist>(playlists)) {
            names.push_back(playlist->name().value_or("none"));
        }
        return names;
    }

    [[nodiscard]] std::shared_ptr<MPMediaPlaylist> playlist(std::size_t index) const {
        return (*library_->playlistsMatching({}))[index];
    }

    SampleMusic music_;
    MainQueueNotifier mainQueue_;
    int taken_ = 0;
    std::shared_ptr<MusicLibrary> library_ = ::create<MusicLibrary>();
};

std::uint64_t number(const MPMediaEntity& entity, MPMediaProperty property) {
    const auto value = std::dynamic_pointer_cast<NSNumber>(entity.valueForProperty(property));
    return value ? value->unsignedLongLongValue() : 404;
}

TEST_F(TheLibrary, holdsThePlaylistsOfTheFolder) {
    EXPECT_THAT(names(), ElementsAre("Long Run", "Morning Mix", "Road Trip"));
    EXPECT_TRUE(library_->hasMediaOfType(MPMediaTypeMusic));
    EXPECT_FALSE(library_->hasMediaOfType(MPMediaTypeMusicVideo));
}

TEST_F(TheLibrary, leavesOutWhatAPredicateExcludes) {
    const auto ordinary =
        library_->playlistsMatching({MPMediaPropertyPredicate::predicateWithValue_forProperty(
            NSNumber::numberWithBool(false), MPMediaPlaylistPropertyIsAugurMix)});
    EXPECT_EQ(elements<MPMediaPlaylist>(ordinary).size(), 2U);
}

TEST_F(TheLibrary, itemsTellTheSizeOfTheirFiles) {
    const auto items = playlist(0)->items();
    ASSERT_EQ(items->size(), 3U);
    EXPECT_EQ(number(*items->front(), MPMediaItemPropertyFileSize), std::uint64_t{1} << 20U);
    EXPECT_EQ(items->front()->valueForProperty(MPMediaPlaylistPropertyIsFolder), nullptr);
    std::string spelt(MPMediaItemPropertyFileSize);
    EXPECT_EQ(number(*items->front(), spelt), std::uint64_t{1} << 20U);
    spelt.back() = '?';
    EXPECT_EQ(items->front()->valueForProperty(spelt), nullptr);
    EXPECT_NE((*items)[0]->persistentID(), (*items)[1]->persistentID());
}

TEST_F(TheLibrary, sameSongHasTheSameIdInEveryPlaylist) {
    EXPECT_EQ(playlist(0)->items()->front()->persistentID(),
              playlist(2)->items()->front()->persistentID());
}

TEST_F(TheLibrary, itemOutlivesPlaylistAndLibrary) {
    auto item = playlist(0)->items()->front();
    const auto size = item->valueForProperty(MPMediaItemPropertyFileSize);
    item.reset();
    library_.reset();
    EXPECT_EQ(std::dynamic_pointer_cast<NSNumber>(size)->unsignedLongLongValue(),
              std::uint64_t{1} << 20U);
}

TEST_F(TheLibrary, unchangedPlaylistsStayTheObjectsTheyWere) {
    const auto longRun = playlist(0);
    const auto roadTrip = playlist(2);
    const auto revision = number(*roadTrip, MPMediaEntityPropertyEntityRevision);
    music_.folder().replace("Road Trip.m3u8", "two.flac\nthree.flac\n");
    waitFor([this] { return playlist(2)->items()->size() == 2; });
    EXPECT_EQ(playlist(0), longRun);
    EXPECT_NE(playlist(2), roadTrip);
    EXPECT_EQ(playlist(2)->persistentID(), roadTrip->persistentID());
    EXPECT_NE(number(*playlist(2), MPMediaEntityPropertyEntityRevision), revision);
    EXPECT_EQ(roadTrip->items()->size(), 1U) << "what a query gave stays as it was";
}

TEST_F(TheLibrary, propertyIsTheSameObjectEachTime) {
    const auto longRun = playlist(0);
    const MPMediaPlaylist& entity = *longRun;
    EXPECT_EQ(entity.valueForProperty(MPMediaPlaylistPropertyPersistentID),
              entity.valueForProperty(MPMediaPlaylistPropertyPersistentID));
    EXPECT_EQ(number(entity, MPMediaPlaylistPropertyPersistentID), entity.persistentID());
    EXPECT_EQ(number(*playlist(1), MPMediaPlaylistPropertyIsAugurMix), 1U);
    EXPECT_EQ(number(*playlist(1), MPMediaPlaylistPropertyIsAugurPlaylist), 0U);
}

/// A program that shows the music folder, started again and again.
class TheLibraryOfTheNextStart : public testing::Test {
  protected:
    std::shared_ptr<MusicLibrary> start() {
        auto library = ::create<MusicLibrary>();
        library->keepIn(file());
        library->open(music_.path(), [this](const media::Inventory& /*inventory*/) { ++taken_; });
        return library;
    }

    void waitUntilTaken(int times) {
        ASSERT_TRUE(QTest::qWaitFor([&] { return taken_ >= times; }, 60'000));
    }

    static std::vector<std::string> namesIn(const MusicLibrary& library) {
        std::vector<std::string> names;
        const auto playlists = library.playlistsMatching({});
        for (const auto& playlist : elements<MPMediaPlaylist>(playlists)) {
            names.push_back(playlist->name().value_or("none"));
        }
        return names;
    }

    [[nodiscard]] std::filesystem::path file() const { return cache_ / "quorl/music-folder"; }

    SampleMusic music_;
    TemporaryDirectory cache_;
    MainQueueNotifier mainQueue_;
    int taken_ = 0;
};

TEST_F(TheLibraryOfTheNextStart, isThereAtOnceAndMendedOnceTheFolderHasBeenRead) {
    auto library = start();
    EXPECT_THAT(namesIn(*library), IsEmpty());
    waitUntilTaken(1);
    library.reset();
    music_.folder().remove("Long Run.m3u8");

    library = start();
    EXPECT_THAT(namesIn(*library), ElementsAre("Long Run", "Morning Mix", "Road Trip"));
    EXPECT_TRUE(library->hasMediaOfType(MPMediaTypeMusic));
    EXPECT_FALSE(library->isRead());
    EXPECT_EQ(taken_, 1);
    waitUntilTaken(2);
    EXPECT_TRUE(library->isRead());
    EXPECT_THAT(namesIn(*library), ElementsAre("Morning Mix", "Road Trip"));
}

TEST_F(TheLibraryOfTheNextStart, hasWhatChangedUntilTheEnd) {
    auto library = start();
    waitUntilTaken(1);
    music_.folder().remove("Long Run.m3u8");
    waitUntilTaken(2);
    library.reset();
    EXPECT_THAT(namesIn(*start()), ElementsAre("Morning Mix", "Road Trip"));
}

TEST_F(TheLibraryOfTheNextStart, hasPlaylistsThatStayTheObjectsTheyAreWhileNothingChanges) {
    auto library = start();
    waitUntilTaken(1);
    library.reset();
    library = start();
    const auto kept = library->playlistsMatching({});
    waitUntilTaken(2);
    EXPECT_EQ(*library->playlistsMatching({}), *kept);
}

TEST_F(TheLibraryOfTheNextStart, showsNothingOfAFolderThatIsOpenedInPlaceOfAnother) {
    auto library = start();
    waitUntilTaken(1);
    const TemporaryDirectory other;
    library->open(other.path(), [this](const media::Inventory& /*inventory*/) { ++taken_; });
    EXPECT_THAT(namesIn(*library), ElementsAre("Long Run", "Morning Mix", "Road Trip"));
    waitUntilTaken(2);
    EXPECT_THAT(namesIn(*library), IsEmpty());
}

} // namespace

} // namespace quorl::tests
