// What a sync is going to do, worked out from values alone.

#include "quorl-syncd/transfer/Plan.h"

#include <limits>
#include <set>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "quorl-syncd/transfer/FileHash.h"
#include "quorl-syncd/transfer/Stopped.h"
#include "quorl-syncd/transfer/songs/SongProblem.h"

namespace {

using namespace quorl::syncd;
using quorl::wearable::Digest;
using quorl::wearable::Entry;
using quorl::wearable::Manifest;
using ::testing::ElementsAre;
using ::testing::IsEmpty;
namespace media = quorl::media;

constexpr std::int64_t second = 1'000'000'000;
constexpr quorl::wearable::Selection selection{1, 5, 99, 0};

class Planning : public ::testing::Test {
  protected:
    /// Adds a song to the playlist; it has these contents.
    void wish(const std::string& source, std::uint64_t size, std::int64_t modified,
              const std::string& contents) {
        const auto directory = library_->songs.addDirectory("");
        playlist_.songs.push_back(
            library_->songs.add(directory, {"", source, size, modified, media::Kind::Audio}));
        songHashes_[source] = hashOf(contents);
    }

    [[nodiscard]] Order order() const {
        auto library = std::make_shared<media::Inventory>(*library_);
        library->playlists.push_back(playlist_);
        return {std::move(library), selection, {}};
    }

    [[nodiscard]] Hashes hashes() {
        return {[this](const Entry& song) {
                    const std::string source(song.source());
                    asked_.push_back("song " + source);
                    if (gone_.contains(source)) {
                        throw SongProblem(SongTrouble::Gone, source);
                    }
                    return songHashes_.at(source);
                },
                [this](const std::string& name) {
                    asked_.push_back("copy " + name);
                    return copyHashes_.at(name);
                }};
    }

    [[nodiscard]] Plan plan() { return planOf(order(), there_, names_, hashes()); }

    /// The names of the songs of the plan; those that are to be copied in brackets.
    [[nodiscard]] static std::vector<std::string> namesOf(const Plan& plan) {
        std::vector<std::string> names;
        for (const auto& song : plan.songs) {
            const std::string name(song.name());
            names.push_back(song.hash ? name : "(" + name + ")");
        }
        return names;
    }

    [[nodiscard]] static std::vector<std::string> namesOf(const std::vector<Entry>& entries) {
        std::vector<std::string> names;
        for (const auto& entry : entries) {
            names.emplace_back(entry.name());
        }
        return names;
    }

    std::shared_ptr<media::Inventory> library_ = std::make_shared<media::Inventory>();
    media::Playlist playlist_{1, 5, "List", "List.m3u8", false, {}, {}};
    std::map<std::string, Digest> songHashes_;
    std::map<std::string, Digest> copyHashes_;
    std::set<std::string> gone_;
    std::vector<std::string> asked_;
    Manifest there_;
    std::vector<std::string> names_;
};

TEST_F(Planning, CopiesEverythingToAnEmptyDevice) {
    wish("one.mp3", 10, second, "1");
    wish("two.mp3", 20, second, "2");

    const auto plan = this->plan();

    EXPECT_THAT(namesOf(plan), ElementsAre("(one.mp3)", "(two.mp3)"));
    EXPECT_EQ(plan.progress, (CopyProgress{0, 2, 0, 30}));
    EXPECT_EQ(plan.bytesToCopy, 30);
    EXPECT_EQ(plan.playlist->name(), "List.m3u8");
    EXPECT_EQ(plan.playlist->hash, hashOf("#EXTM3U\n#PLAYLIST:List\none.mp3\ntwo.mp3\n"));
    EXPECT_THAT(asked_, IsEmpty());
}

TEST_F(Planning, KeepsWhatIsThereWithoutReadingIt) {
    wish("one.mp3", 10, second, "1");
    there_.songs = {{"one.mp3", "one.mp3", 10, second, hashOf("1")}};
    there_.playlist = Entry{"List.m3u8", "List", 30, 0, hashOf("p")};
    names_ = {"one.mp3", "List.m3u8"};

    const auto plan = this->plan();

    EXPECT_EQ(plan.songs, there_.songs);
    EXPECT_EQ(plan.progress, (CopyProgress{1, 1, 10, 10}));
    EXPECT_EQ(plan.bytesToCopy, 0);
    EXPECT_THAT(plan.unwanted, IsEmpty());
    EXPECT_EQ(plan.playlist->name(), "List.m3u8");
    EXPECT_THAT(asked_, IsEmpty());
}

TEST_F(Planning, KeepsASongOfWhichOnlyTheTimeHasChanged) {
    wish("one.mp3", 10, 2 * second, "1");
    there_.songs = {{"one.mp3", "one.mp3", 10, second, hashOf("1")}};
    names_ = {"one.mp3"};

    const auto plan = this->plan();

    EXPECT_EQ(plan.songs,
              (std::vector<Entry>{{"one.mp3", "one.mp3", 10, 2 * second, hashOf("1")}}));
    EXPECT_THAT(asked_, ElementsAre("song one.mp3"));
}

TEST_F(Planning, CopiesASongWithNewContentsBesideTheOldOne) {
    wish("size.mp3", 11, second, "new");
    wish("contents.mp3", 10, 2 * second, "new");
    there_.songs = {{"size.mp3", "size.mp3", 10, second, hashOf("old")},
                    {"contents.mp3", "contents.mp3", 10, second, hashOf("old")}};
    names_ = {"size.mp3", "contents.mp3"};

    EXPECT_THAT(namesOf(plan()), ElementsAre("(size (2).mp3)", "(contents (2).mp3)"));
}

TEST_F(Planning, AdoptsACompleteCopyThatWasLeftBehindAndRemovesOthers) {
    wish("whole.mp3", 10, second, "1");
    wish("ruined.mp3", 10, second, "2");
    wish("older.mp3", 10, 2 * second, "3");
    there_.strays = {{"whole.mp3", "whole.mp3", 10, second, {}},
                     {"ruined.mp3", "ruined.mp3", 10, second, {}},
                     {"older.mp3", "older.mp3", 10, second, {}},
                     {"nobody's.mp3", "nobody's.mp3", 10, second, {}}};
    copyHashes_ = {{"whole.mp3", hashOf("1")}, {"ruined.mp3", hashOf("x")}};
    names_ = {"whole.mp3", "ruined.mp3", "older.mp3", "nobody's.mp3"};

    const auto plan = this->plan();

    EXPECT_THAT(namesOf(plan), ElementsAre("whole.mp3", "(ruined.mp3)", "(older.mp3)"))
        << "names of what is removed are free";
    EXPECT_EQ(plan.adopted,
              (std::vector<Entry>{{"whole.mp3", "whole.mp3", 10, second, hashOf("1")}}));
    EXPECT_THAT(namesOf(plan.useless), ElementsAre("ruined.mp3", "older.mp3", "nobody's.mp3"));
    EXPECT_EQ(plan.progress, (CopyProgress{1, 3, 10, 30}));
    EXPECT_EQ(plan.bytesToCopy, 20);
}

TEST_F(Planning, FreesTheNameOfARemovedFileHoweverTheDeviceSpellsIt) {
    wish("Bj\u00F6rk.mp3", 10, second, "1");
    there_.strays = {{"Bj\u00F6rk.mp3", "gone.mp3", 10, second, {}}};
    names_ = {"Bjo\u0308rk.mp3"};

    EXPECT_THAT(namesOf(plan()), ElementsAre("(Bj\u00F6rk.mp3)"));
}

TEST_F(Planning, LeavesFilesOfOthersTheirNames) {
    wish("one.mp3", 10, second, "1");
    names_ = {"ONE.MP3", "list.m3u8"};

    const auto plan = this->plan();

    EXPECT_THAT(namesOf(plan), ElementsAre("(one (2).mp3)"));
    EXPECT_EQ(plan.playlist->name(), "List (2).m3u8");
}

TEST_F(Planning, ListsASongOnceThatIsListedTwice) {
    wish("one.mp3", 10, second, "1");
    playlist_.songs.push_back(playlist_.songs.front());

    const auto plan = this->plan();

    EXPECT_THAT(namesOf(plan), ElementsAre("(one.mp3)"));
    EXPECT_EQ(plan.progress, (CopyProgress{0, 1, 0, 10}));
    EXPECT_EQ(playlistText(order(), plan.songs), "#EXTM3U\n#PLAYLIST:List\none.mp3\none.mp3\n");
}

TEST_F(Planning, KeepsThePlaylistsNameOnOneLine) {
    playlist_.name = "A\nlong\x01 \u00F6 name";
    EXPECT_EQ(playlistText(order(), {}), "#EXTM3U\n#PLAYLIST:A long  \u00F6 name\n");
}

TEST_F(Planning, LeavesOutASongThatCannotBeRead) {
    wish("gone.mp3", 10, 2 * second, "1");
    wish("two.mp3", 20, second, "2");
    there_.songs = {{"gone.mp3", "gone.mp3", 10, second, hashOf("1")}};
    gone_ = {"gone.mp3"};
    names_ = {"gone.mp3"};

    const auto plan = this->plan();

    EXPECT_THAT(namesOf(plan), ElementsAre("(two.mp3)"));
    EXPECT_THAT(plan.problems, ElementsAre(quorl::engine::Message{"song-gone", {"gone.mp3"}}));
    EXPECT_EQ(plan.progress, (CopyProgress{0, 1, 0, 20}));
    EXPECT_THAT(plan.unwanted, IsEmpty()) << "the old copy is better than none";
}

TEST_F(Planning, FindsRoomWithoutSongsThatAreNoLongerWanted) {
    wish("new.mp3", 30, second, "1");
    there_.songs = {{"old.mp3", "old.mp3", 20, second, hashOf("2")}};
    names_ = {"old.mp3"};

    auto plan = this->plan();

    EXPECT_THAT(namesOf(plan.unwanted), ElementsAre("old.mp3"));
    const auto beside = plan.playlist->size + 16384;
    EXPECT_EQ(roomFor(plan, 30 + beside), Room::Enough);
    EXPECT_EQ(roomFor(plan, 29 + beside), Room::EnoughWithoutUnwanted);
    EXPECT_EQ(roomFor(plan, 10), Room::EnoughWithoutUnwanted);
    EXPECT_EQ(roomFor(plan, 9), Room::NotEnough);
    plan.unwanted.clear();
    EXPECT_EQ(roomFor(plan, 30), Room::Enough);
    EXPECT_EQ(roomFor(plan, 29), Room::NotEnough);
}

TEST_F(Planning, KeepsAnUnfinishedFileThatMayBeASecondNameOfAFinishedOne) {
    const Files unfinished{{"QUORL001.TMP", {10, second}},
                           {"QUORL002.TMP", {10, 2 * second}},
                           {"QUORL003.TMP", {11, second}}};

    const auto files = removable(unfinished, {{"one.mp3", {10, second}}});

    EXPECT_FALSE(files.contains("QUORL001.TMP"));
    EXPECT_EQ(files.size(), 2);
}

TEST_F(Planning, IsMadeAsAWholeOrNotAtAll) {
    wish("one.mp3", 10, 2 * second, "1");
    there_.songs = {{"one.mp3", "one.mp3", 10, second, hashOf("1")}};

    EXPECT_THROW(
        (void)planOf(order(), there_, {}, {[](const Entry&) -> Digest { throw Stopped(); }, {}}),
        Stopped);
}

TEST_F(Planning, ReplacesAPlaylistOfAnotherTitle) {
    there_.playlist = Entry{"Old.m3u8", "Old", 30, 0, hashOf("p")};
    names_ = {"Old.m3u8"};

    const auto plan = this->plan();

    EXPECT_EQ(plan.playlist->name(), "List.m3u8");
    EXPECT_EQ(plan.playlist->source(), "List");
}

TEST_F(Planning, NeverTakesTooMuchForALittle) {
    constexpr auto largest = std::numeric_limits<std::uint64_t>::max();
    wish("one.mp3", largest, second, "1");
    wish("two.mp3", 2, second, "2");

    EXPECT_EQ(plan().progress.totalBytes, largest);
    EXPECT_EQ(plan().bytesToCopy, largest);
}

class Stocktaking : public Planning {
  protected:
    [[nodiscard]] Manifest taken(const Files& files) {
        auto manifest = there_;
        const auto find = [&](const std::string& name) {
            const auto found = files.find(name);
            return found == files.end() ? std::nullopt : std::optional(found->second);
        };
        const bool isAnyForgotten = forgetWhatIsNotThere(manifest, find, hashes());
        EXPECT_EQ(isAnyForgotten, manifest != there_);
        return manifest;
    }
};

TEST_F(Stocktaking, BelievesAListOfWhichAllIsThere) {
    there_ = {{{"one.mp3", "one.mp3", 10, second, hashOf("1")}},
              Entry{"List.m3u8", "List", 30, 0, hashOf("p")},
              {},
              selection};
    copyHashes_ = {{"List.m3u8", hashOf("p")}};

    EXPECT_EQ(taken({{"one.mp3", {10, 0}}, {"List.m3u8", {30, 0}}}), there_);
}

TEST_F(Stocktaking, ForgetsSongsThatAreGoneOrCutOff) {
    there_.songs = {{"there.mp3", "there.mp3", 10, second, hashOf("1")},
                    {"gone.mp3", "gone.mp3", 10, second, hashOf("2")},
                    {"cut.mp3", "cut.mp3", 10, second, hashOf("3")}};
    there_.sent = selection;

    const auto manifest = taken({{"there.mp3", {10, second}}, {"cut.mp3", {4, second}}});

    EXPECT_THAT(namesOf(manifest.songs), ElementsAre("there.mp3"));
    EXPECT_FALSE(manifest.sent);
}

TEST_F(Stocktaking, LeavesAFileToSomebodyElseThatIsNotWhatWasPutThere) {
    there_.songs = {{"later.mp3", "later.mp3", 10, second, hashOf("1")},
                    {"other.mp3", "other.mp3", 10, second, hashOf("2")}};
    there_.sent = selection;
    copyHashes_ = {{"later.mp3", hashOf("1")}, {"other.mp3", hashOf("x")}};

    const auto manifest = taken({{"later.mp3", {10, 9 * second}}, {"other.mp3", {10, 9 * second}}});

    EXPECT_THAT(namesOf(manifest.songs), ElementsAre("later.mp3"));
    EXPECT_FALSE(manifest.sent);
}

TEST_F(Stocktaking, LeavesAPlaylistToSomebodyElseThatIsNotAsItWas) {
    there_.playlist = Entry{"List.m3u8", "List", 30, 0, hashOf("p")};
    there_.sent = selection;

    copyHashes_ = {{"List.m3u8", hashOf("x")}};

    for (const auto& files : {Files{{"List.m3u8", {31, 0}}}, Files{{"List.m3u8", {30, 0}}}, {}}) {
        const auto manifest = taken(files);

        EXPECT_FALSE(manifest.playlist);
        EXPECT_FALSE(manifest.sent);
    }
}

TEST_F(Stocktaking, TakesOnlyFilesForOursThatCanBeOurs) {
    there_.strays = {{"same.mp3", "", 10, second, {}},
                     {"rounded.mp3", "", 10, second, {}},
                     {"late.mp3", "", 10, second, {}},
                     {"late but same.mp3", "", 10, second, hashOf("h")},
                     {"late and other.mp3", "", 10, second, hashOf("h")},
                     {"larger.mp3", "", 10, second, {}},
                     {"empty.mp3", "", 10, second, {}},
                     {"gone.mp3", "", 10, second, {}}};
    copyHashes_ = {{"late but same.mp3", hashOf("h")}, {"late and other.mp3", hashOf("x")}};

    const auto manifest = taken({{"same.mp3", {10, second}},
                                 {"rounded.mp3", {10, 3 * second}},
                                 {"late.mp3", {10, 3 * second + 1}},
                                 {"late but same.mp3", {10, 9 * second}},
                                 {"late and other.mp3", {10, 9 * second}},
                                 {"empty.mp3", {0, 9 * second}},
                                 {"larger.mp3", {11, second}}});

    EXPECT_THAT(namesOf(manifest.strays),
                ElementsAre("same.mp3", "rounded.mp3", "late but same.mp3", "empty.mp3"));
    EXPECT_THAT(asked_, ElementsAre("copy late but same.mp3", "copy late and other.mp3"));
}

TEST_F(Stocktaking, KnowsAPlaylistThatWasAboutToComeByItsContentsAlone) {
    there_.strays = {{"ours.m3u8", "Ours", 30, 0, hashOf("p")},
                     {"theirs.m3u8", "Theirs", 30, 0, hashOf("p")}};
    copyHashes_ = {{"ours.m3u8", hashOf("p")}, {"theirs.m3u8", hashOf("x")}};

    const auto manifest = taken({{"ours.m3u8", {30, 9 * second}}, {"theirs.m3u8", {30, 0}}});

    EXPECT_THAT(namesOf(manifest.strays), ElementsAre("ours.m3u8"));
}

TEST_F(Stocktaking, KnowsASongOf1970ThatWasAboutToComeByItsTime) {
    there_.strays = {{"a.mp3", "a.mp3", 10, 0, {}}};

    EXPECT_THAT(namesOf(taken({{"a.mp3", {10, 0}}}).strays), ElementsAre("a.mp3"));
}

TEST_F(Stocktaking, ComparesTimesThatAreFurtherApartThanANumberHolds) {
    there_.strays = {{"a.mp3", "", 10, std::numeric_limits<std::int64_t>::min(), {}}};

    EXPECT_THAT(taken({{"a.mp3", {10, std::numeric_limits<std::int64_t>::max()}}}).strays,
                IsEmpty());
}

} // namespace
