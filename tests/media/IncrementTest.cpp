#include <algorithm>
#include <array>
#include <filesystem>
#include <random>
#include <stop_token>
#include <string>
#include <string_view>
#include <vector>

#include <gtest/gtest.h>

#include "services/base/DirectoryWatch.h"
#include "services/media/FolderTree.h"
#include "services/media/InventoryBuilder.h"
#include "services/media/MusicFolder.h"
#include "tests/base/TemporaryDirectory.h"

namespace quorl::media::test {

using tests::TemporaryDirectory;

namespace {

namespace fs = std::filesystem;

constexpr std::array<std::string_view, 9> directories{
    "a", "a/b", "a/b/c", "lists", "d", "d/\u00E9", ".away", "d/e\u0301", "lists/in"};
constexpr std::array<std::string_view, 9> names{"one.mp3",     "two.mp3",     "three 3.mp3",
                                                "\u00E9.mp3",  "e\u0301.mp3", "video.mp4",
                                                ".hidden.mp3", "text.txt",    "a%62.mp3"};
constexpr std::array<std::string_view, 4> lists{"One.m3u8", "Two.m3u", "Three.pls", "Four.xspf"};

/// A music folder that somebody changes without a plan, the same for the same seed.
class Changes {
  public:
    Changes(const TemporaryDirectory& folder, unsigned seed) : folder_(folder), random_(seed) {}

    /// Gives back what was done, for whoever reads of a failure.
    std::string make() {
        try {
            switch (below(12)) {
            case 0:
            case 1:
            case 2:
                return writePlaylist();
            case 3:
            case 4:
                return writeSong();
            case 5:
                return replaceSong();
            case 6:
                return remove(songPath());
            case 7:
                return move(songPath(), songPath());
            case 8:
                return move(directory(), directory());
            case 9:
                return remove(below(4) == 0 ? directory() : playlistPath());
            case 10:
                return link(songPath(), folder_ / songPath());
            default:
                return link(directory(), folder_ / directory());
            }
        } catch (const std::exception& error) {
            return std::string("nothing, for ") + error.what();
        }
    }

  private:
    std::size_t below(std::size_t end) { return random_() % end; }

    template <class Texts>
    std::string anyOf(const Texts& texts) {
        return std::string(texts[below(texts.size())]);
    }

    std::string directory() { return anyOf(directories); }

    std::string in(const std::string& name) {
        return below(4) == 0 ? name : directory() + '/' + name;
    }

    std::string songPath() { return in(anyOf(names)); }

    std::string playlistPath() { return in(anyOf(lists)); }

    /// One of the ways in which programs write where a song is.
    std::string entry() {
        const std::string path = songPath();
        switch (below(9)) {
        case 0:
            return folder_.path().string() + '/' + path;
        case 1:
            return "file://" + folder_.path().string() + '/' + path;
        case 2: {
            std::string turned = path;
            std::ranges::replace(turned, '/', '\\');
            return turned;
        }
        case 3:
            return "../" + directory() + "/../" + path;
        case 4:
            return anyOf(names);
        case 5:
            return "three%203.mp3";
        case 6:
            return "../../" + path;
        default:
            return "../" + path;
        }
    }

    std::string entriesIn(std::string_view path) {
        std::string text = path.ends_with(".pls") ? "[playlist]\n" : "";
        for (std::size_t number = below(8); number > 0; --number) {
            if (path.ends_with(".xspf")) {
                text += "<track><location>" + entry() + "</location></track>";
            } else if (path.ends_with(".pls")) {
                text += "File" + std::to_string(number) + '=' + entry() + '\n';
            } else {
                text += entry() + (below(2) == 0 ? "\n" : "\r\n");
            }
        }
        return path.ends_with(".xspf") ? "<playlist><trackList>" + text + "</trackList></playlist>"
                                       : text;
    }

    std::string writePlaylist() {
        const std::string path = playlistPath();
        const std::string text = entriesIn(path);
        if (below(2) == 0) {
            folder_.write(path, text);
        } else {
            folder_.replace(path, text);
        }
        return "wrote " + path + " with " + text;
    }

    std::string writeSong() {
        const std::string path = songPath();
        folder_.write(path, std::string(below(100), '.'));
        return "wrote " + path;
    }

    std::string replaceSong() {
        const std::string path = songPath();
        folder_.replace(path, std::string(below(100), '.'));
        folder_.setModified(path, static_cast<std::int64_t>(below(1000)));
        return "replaced " + path;
    }

    std::string remove(const std::string& path) {
        fs::remove_all(folder_ / path);
        return "removed " + path;
    }

    std::string move(const std::string& from, const std::string& to) {
        folder_.rename(from, to);
        return "moved " + from + " to " + to;
    }

    std::string link(const std::string& path, const fs::path& target) {
        folder_.link(path, target);
        return "linked " + path + " to " + target.string();
    }

    const TemporaryDirectory& folder_;
    std::mt19937 random_;
};

/// What is kept from one inventory to the next, without the thread that would wait for quiet.
class Kept {
  public:
    explicit Kept(const fs::path& root) : tree_(root, &watch_), builder_(tree_) {}

    std::shared_ptr<const Inventory> next() {
        tree_.mark(watch_.take());
        return tree_.refresh(never_) ? builder_.build(never_) : nullptr;
    }

    FolderTree& tree() { return tree_; }

  private:
    const std::stop_token never_;
    base::DirectoryWatch watch_;
    FolderTree tree_;
    InventoryBuilder builder_;
};

class IncrementTest : public testing::TestWithParam<unsigned> {};

} // namespace

TEST_P(IncrementTest, WhatIsKeptSaysAfterEachChangeWhatAFreshScanSays) {
    const TemporaryDirectory folder;
    Changes changes(folder, GetParam());
    Kept kept(folder.path());
    std::string story;
    for (int step = 0; step < 120; ++step) {
        story = changes.make();
        while (step % 3 == 0 && story.size() < 300 && story.find("; ") == std::string::npos) {
            story += "; " + changes.make();
        }
        const auto inventory = kept.next();
        ASSERT_NE(inventory, nullptr);
        ASSERT_EQ(*inventory, *scan(folder.path())) << "step " << step << ": " << story;
    }
}

INSTANTIATE_TEST_SUITE_P(Seeds, IncrementTest, testing::Range(1U, 7U));

TEST(KeptTest, AFolderForAllWorkersIsReadAsAFolderForOneIs) {
    const TemporaryDirectory folder;
    Kept kept(folder.path());
    static_cast<void>(kept.next());
    std::string all;
    for (int album = 0; album < 200; ++album) {
        const std::string name = "Album " + std::to_string(album);
        folder.write(name + "/one.mp3", std::string(static_cast<std::size_t>(album), '.'));
        folder.write(name + "/two.mp3", "..");
        folder.write("lists/" + name + ".m3u8", "../" + name + "/two.mp3\n../gone.mp3\n" + all);
        all += "../" + name + "/one.mp3\n";
    }

    const auto inventory = kept.next();
    kept.tree().reset();

    EXPECT_EQ(inventory->songs.size(), 399);
    EXPECT_EQ(inventory->playlists.size(), 201);
    EXPECT_EQ(inventory->leftOut.size(), 200);
    EXPECT_EQ(*inventory, *scan(folder.path()));
    EXPECT_EQ(*inventory, *kept.next());
}

/// What an entry means may hang on directories in which its song is not.
class ElsewhereTest : public testing::Test {
  protected:
    /// Takes in the folder with the song, and a playlist that finds it by `entry`.
    void begin(const std::string& song, const std::string& entry) {
        folder_.writeSongs({song});
        folder_.write("lists/List.m3u8", "../" + entry + "\n");
        ASSERT_EQ(kept_.next()->songs.size(), 1);
    }

    void expectAsAfresh() { EXPECT_EQ(*kept_.next(), *scan(folder_.path())); }

    TemporaryDirectory folder_;
    Kept kept_{folder_.path()};
};

TEST_F(ElsewhereTest, ASongOfTheVeryNameIsMeantFromWhenItIsThere) {
    begin("a/one.mp3", "a%2Fone.mp3");
    folder_.writeSongs({"a%2Fone.mp3"});
    expectAsAfresh();
}

TEST_F(ElsewhereTest, ADirectoryOfTheVerySpellingIsMeantFromWhenItIsThere) {
    begin("e\u0301/one.mp3", "\u00E9/one.mp3");
    folder_.write("\u00E9/one.mp3", "of another size");
    expectAsAfresh();
}

TEST_F(ElsewhereTest, AWayThroughADirectoryThatIsGoneLeadsNowhere) {
    folder_.makeDirectory("by");
    begin("a/one.mp3", "by/../a/one.mp3");
    fs::remove(folder_ / "by");
    expectAsAfresh();
}

TEST(KeptTest, WhatWasStoppedGoesOn) {
    const TemporaryDirectory folder;
    folder.writeSongs({"a/one.mp3", "b/two.mp3"});
    folder.write("a/List.m3u", "one.mp3\n../b/two.mp3\n");
    base::DirectoryWatch watch;
    FolderTree tree(folder.path(), &watch);
    InventoryBuilder builder(tree);
    std::stop_source stop;
    stop.request_stop();

    EXPECT_FALSE(tree.refresh(stop.get_token()));
    EXPECT_TRUE(tree.refresh({}));
    EXPECT_EQ(builder.build(stop.get_token()), nullptr);

    EXPECT_EQ(*builder.build({}), *scan(folder.path()));
}

} // namespace quorl::media::test
