#include "services/media/kept/KeptInventory.h"

#include <fstream>
#include <sstream>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "services/media/MusicFolder.h"
#include "services/media/kept/InventoryKeeper.h"
#include "tests/base/TemporaryDirectory.h"
#include "tests/media/Inventories.h"

namespace quorl::media::test {

using tests::TemporaryDirectory;

namespace {

namespace fs = std::filesystem;

std::string contentsOf(const fs::path& file) {
    std::ostringstream contents;
    contents << std::ifstream(file, std::ios::binary).rdbuf();
    return contents.str();
}

/// Null is.
void expectConsistent(const Inventory* inventory) {
    if (inventory == nullptr) {
        return;
    }
    for (const auto& playlist : inventory->playlists) {
        for (const auto song : playlist.songs) {
            ASSERT_LT(song, inventory->songs.size());
            EXPECT_FALSE(inventory->songs[song].path().empty());
            EXPECT_LE(inventory->songs[song].kind, Kind::MusicVideo);
        }
        EXPECT_LE(playlist.generated, Generated::Playlist);
    }
}

/// A music folder that has something of everything, and a file beside it.
class KeptFolder : public testing::Test {
  protected:
    KeptFolder() {
        music_.write("Artist/one.mp3", "1");
        music_.write("Artist/two \xFF.ogg", "22");
        music_.write("film.mp4", "333");
        music_.write("All.m3u8", "#GENERATED:mix\nArtist/one.mp3\nfilm.mp4\nArtist/one.mp3\n");
        music_.write("Lists/Some.m3u8", "../Artist/one.mp3\nmissing.mp3\nhttp://far.example/a\n");
        music_.write("Lists/Empty.m3u8", "");
        music_.write("Broken.xspf", "<playlist");
    }

    [[nodiscard]] fs::path file() const { return fs::path(cache_.path()) / "quorl" / "folder"; }

    [[nodiscard]] std::shared_ptr<const Inventory> kept() const {
        return keptInventory(file(), music_.path());
    }

    void write(const std::string& contents) const {
        std::ofstream(file(), std::ios::binary) << contents;
    }

    TemporaryDirectory music_;
    TemporaryDirectory cache_;
};

TEST_F(KeptFolder, isWhatWasThere) {
    const auto read = scan(music_.path());
    ASSERT_FALSE(read->leftOut.empty());
    keepInventory(file(), *read);
    ASSERT_TRUE(kept());
    EXPECT_EQ(*kept(), *read);
}

TEST_F(KeptFolder, isWhatWasThereLast) {
    keepInventory(file(), *scan(music_.path()));
    music_.write("New.m3u8", "film.mp4\n");
    const auto read = scan(music_.path());
    keepInventory(file(), *read);
    EXPECT_EQ(*kept(), *read);
}

TEST_F(KeptFolder, isNothingWhereNothingWasKept) { EXPECT_FALSE(kept()); }

TEST_F(KeptFolder, isNothingOfAnotherFolder) {
    keepInventory(file(), *scan(music_.path()));
    EXPECT_FALSE(keptInventory(file(), fs::path(music_.path()) / "Lists"));
    EXPECT_TRUE(keptInventory(file(), fs::path(music_.path()) / "Lists" / ".." / ""));
}

TEST_F(KeptFolder, canBeAFolderThatIsNotThere) {
    const auto nowhere = fs::path(music_.path()) / "nowhere";
    keepInventory(file(), *scan(nowhere));
    const auto inventory = keptInventory(file(), nowhere);
    ASSERT_TRUE(inventory);
    EXPECT_FALSE(inventory->rootFound);
}

/// Whatever a failing disk has made of it.
TEST_F(KeptFolder, isNeverInconsistent) {
    keepInventory(file(), *scan(music_.path()));
    const auto whole = contentsOf(file());
    for (std::size_t at = 0; at < whole.size(); ++at) {
        write(whole.substr(0, at));
        expectConsistent(kept().get());
        for (const char flipped : {'\x01', '\x80', '\xFF'}) {
            auto damaged = whole;
            damaged[at] = static_cast<char>(damaged[at] ^ flipped);
            write(damaged);
            expectConsistent(kept().get());
        }
    }
}

TEST_F(KeptFolder, isNothingWhereTheFileIsEmptyOrOfAnotherKind) {
    keepInventory(file(), *scan(music_.path()));
    for (const auto* const contents : {"", "{}", "a file of this name"}) {
        write(contents);
        EXPECT_FALSE(kept()) << contents;
    }
}

TEST_F(KeptFolder, isNothingWhereTheFileIsNoFile) {
    fs::create_directories(file());
    EXPECT_FALSE(kept());
}

TEST_F(KeptFolder, keeperKeepsTheFirstAndTheLast) {
    InventoryKeeper keeper(file(), music_.path());
    EXPECT_FALSE(keeper.kept());
    const auto first = scan(music_.path());
    keeper.take(first);
    EXPECT_EQ(*kept(), *first);
    music_.write("New.m3u8", "film.mp4\n");
    const auto last = scan(music_.path());
    keeper.take(last);
    EXPECT_EQ(*kept(), *first);
    keeper.keepLast();
    EXPECT_EQ(*kept(), *last);
}

TEST_F(KeptFolder, keeperWritesNothingThatIsThere) {
    keepInventory(file(), *scan(music_.path()));
    fs::create_hard_link(file(), cache_ / "the same file");
    InventoryKeeper keeper(file(), music_.path());
    keeper.take(scan(music_.path()));
    keeper.keepLast();
    EXPECT_EQ(fs::hard_link_count(file()), 2U);
}

TEST_F(KeptFolder, keeperHoldsWhatWasKeptUntilTheFolderWasRead) {
    keepInventory(file(), *scan(music_.path()));
    InventoryKeeper keeper(file(), music_.path());
    const std::weak_ptr<const Inventory> kept = keeper.kept();
    EXPECT_FALSE(kept.expired());
    keeper.take(scan(music_.path()));
    EXPECT_TRUE(kept.expired());
}

TEST_F(KeptFolder, keeperGoesOnWhereItCannotWrite) {
    std::ofstream(fs::path(cache_.path()) / "quorl") << "a file of this name";
    InventoryKeeper keeper(file(), music_.path());
    keeper.take(scan(music_.path()));
    keeper.keepLast();
    EXPECT_FALSE(kept());
}

} // namespace

} // namespace quorl::media::test
