#include <cstdint>
#include <string>

#include <gtest/gtest.h>

#include "services/media/MusicFolder.h"
#include "tests/base/TemporaryDirectory.h"
#include "tests/media/Inventories.h"

namespace quorl::media::test {

using tests::TemporaryDirectory;

namespace {

std::uint64_t idOf(const TemporaryDirectory& folder, std::string_view path) {
    return playlistAt(*scan(folder.path()), path).id;
}

std::uint64_t revisionOf(const TemporaryDirectory& folder, std::string_view path) {
    return playlistAt(*scan(folder.path()), path).revision;
}

} // namespace

TEST(IdentityTest, TheIdIsTheSameOnEveryMachine) {
    const TemporaryDirectory folder;
    folder.write("Road Trip.m3u8", "");
    folder.write("Workout/Intervals.m3u8", "");

    EXPECT_EQ(idOf(folder, "Road Trip.m3u8"), 0x6A9468A02A18442CU);
    EXPECT_EQ(idOf(folder, "Workout"), 0xFB3D515A9F7F296AU);
}

TEST(IdentityTest, TheIdDoesNotDependOnHowAccentsAreStored) {
    const TemporaryDirectory composed;
    composed.write("Caf\u00E9.m3u", "");
    const TemporaryDirectory decomposed;
    decomposed.write("Cafe\u0301.m3u", "");

    EXPECT_EQ(idOf(composed, "Caf\u00E9.m3u"), 0xA3FF65FA69ACFD06U);
    EXPECT_EQ(idOf(decomposed, "Cafe\u0301.m3u"), 0xA3FF65FA69ACFD06U);
}

TEST(IdentityTest, TheIdStaysWhateverThePlaylistSays) {
    const TemporaryDirectory folder;
    folder.writeSongs({"one.mp3"});
    folder.write("List.m3u", "");
    const std::uint64_t before = idOf(folder, "List.m3u");

    folder.replace("List.m3u", "#PLAYLIST:Another name\n#GENERATED\none.mp3\n");

    EXPECT_EQ(idOf(folder, "List.m3u"), before);
}

TEST(IdentityTest, DifferentPathsHaveDifferentIds) {
    const TemporaryDirectory folder;
    folder.write("a.m3u", "#PLAYLIST:Same\n");
    folder.write("a.pls", "[playlist]");
    folder.write("b/a.m3u", "#PLAYLIST:Same\n");

    EXPECT_NE(idOf(folder, "a.m3u"), idOf(folder, "a.pls"));
    EXPECT_NE(idOf(folder, "a.m3u"), idOf(folder, "b/a.m3u"));
    EXPECT_NE(idOf(folder, "b"), idOf(folder, "b/a.m3u"));
}

TEST(IdentityTest, APlaylistIsFoundByItsIdAndAnUnknownIdFindsNone) {
    const TemporaryDirectory folder;
    folder.write("a.m3u", "");
    folder.write("b.m3u", "");

    const auto inventory = scan(folder.path());

    ASSERT_NE(inventory->playlist(playlistAt(*inventory, "b.m3u").id), nullptr);
    EXPECT_EQ(inventory->playlist(playlistAt(*inventory, "b.m3u").id)->path, "b.m3u");
    EXPECT_EQ(inventory->playlist(1), nullptr);
}

class RevisionTest : public testing::Test {
  protected:
    RevisionTest() {
        folder_.writeSongs({"one.mp3", "two.mp3", "three.mp3"});
        folder_.setModified("one.mp3", 1'600'000'000'000'000'000);
        folder_.write("lists/List.m3u", "../one.mp3\n../two.mp3\n");
        before_ = revisionOf(folder_, "lists/List.m3u");
        folderBefore_ = revisionOf(folder_, "lists");
    }

    void expectChanged() const {
        EXPECT_NE(revisionOf(folder_, "lists/List.m3u"), before_);
        EXPECT_NE(revisionOf(folder_, "lists"), folderBefore_);
    }

    void expectUnchanged() const {
        EXPECT_EQ(revisionOf(folder_, "lists/List.m3u"), before_);
        EXPECT_EQ(revisionOf(folder_, "lists"), folderBefore_);
    }

    TemporaryDirectory folder_;
    std::uint64_t before_ = 0;
    std::uint64_t folderBefore_ = 0;
};

TEST_F(RevisionTest, StaysWhenTheFolderIsReadAgain) { expectUnchanged(); }

TEST_F(RevisionTest, StaysWhenOnlyACommentANameOrAnotherFileChanges) {
    folder_.write("lists/List.m3u", "#PLAYLIST:New name\n# hello\n../one.mp3\r\n..//two.mp3\n");
    folder_.writeSongs({"three.mp3", "four.mp3"}, 500);

    expectUnchanged();
}

TEST_F(RevisionTest, StaysWhenAnEntryIsAddedThatIsLeftOut) {
    folder_.write("lists/List.m3u", "../one.mp3\n../two.mp3\ngone.mp3\n");

    expectUnchanged();
}

TEST_F(RevisionTest, ChangesWhenAnEntryIsAdded) {
    folder_.write("lists/List.m3u", "../one.mp3\n../two.mp3\n../three.mp3\n");

    expectChanged();
}

TEST_F(RevisionTest, ChangesWhenAnEntryIsThereTwice) {
    folder_.write("lists/List.m3u", "../one.mp3\n../two.mp3\n../two.mp3\n");

    expectChanged();
}

TEST_F(RevisionTest, ChangesWhenTheOrderChanges) {
    folder_.write("lists/List.m3u", "../two.mp3\n../one.mp3\n");

    expectChanged();
}

TEST_F(RevisionTest, ChangesWhenASongIsReplacedByOneOfTheSameSizeAndTime) {
    folder_.setModified("three.mp3", 1'600'000'000'000'000'000);
    folder_.write("lists/List.m3u", "../three.mp3\n../two.mp3\n");

    expectChanged();
}

TEST_F(RevisionTest, ChangesWhenASongGrowsAndKeepsItsTime) {
    folder_.writeSongs({"one.mp3"}, 4);
    folder_.setModified("one.mp3", 1'600'000'000'000'000'000);

    expectChanged();
}

TEST_F(RevisionTest, ChangesWhenASongIsWrittenAgainWithTheSameSize) {
    folder_.setModified("one.mp3", 1'600'000'000'000'000'001);

    expectChanged();
}

TEST_F(RevisionTest, ChangesWhenASongIsGoneAndIsTheOldOneWhenItIsBack) {
    folder_.rename("two.mp3", "away.mp3");
    expectChanged();

    folder_.rename("away.mp3", "two.mp3");
    expectUnchanged();
}

} // namespace quorl::media::test
