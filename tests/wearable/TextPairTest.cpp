#include "services/wearable/TextPair.h"

#include <optional>
#include <string>
#include <utility>

#include <gtest/gtest.h>

namespace quorl::wearable::test {

namespace {

TEST(TextPair, holdsBothTextsWhateverTheyHaveInCommon) {
    const std::string zeros(3, '\0');
    for (const auto& [first, second] : std::initializer_list<std::pair<std::string, std::string>>{
             {"song.mp3", "Artist/song.mp3"},
             {"song (2).mp3", "Artist/song.mp3"},
             {"song.mp3", "song.mp3"},
             {"", "Artist/song.mp3"},
             {"song.mp3", ""},
             {"Artist/song.mp3", "song.mp3"},
             {zeros, zeros + "\xFF"},
             {"", ""}}) {
        const TextPair pair(first, second);
        EXPECT_EQ(pair.first(), first);
        EXPECT_EQ(pair.second(), second);
    }
    EXPECT_EQ(TextPair(), TextPair("", ""));
}

TEST(TextPair, isEqualByItsTexts) {
    const TextPair pair("song.mp3", "Artist/song.mp3");
    EXPECT_EQ(pair, TextPair("song.mp3", "Artist/song.mp3"));
    EXPECT_NE(pair, TextPair("song.mp3", "Other/song.mp3"));
    EXPECT_NE(pair, TextPair("song (2).mp3", "Artist/song.mp3"));
    EXPECT_NE(pair, TextPair());
}

TEST(TextPair, textsAreValidAsLongAsAnyCopyIsThere) {
    std::optional<TextPair> pair(std::in_place, "song.mp3", "Artist/song.mp3");
    const auto text = pair->second();
    TextPair copy = *pair;
    pair.reset();
    EXPECT_EQ(text, "Artist/song.mp3");
    const TextPair moved = std::move(copy);
    EXPECT_EQ(moved.second().data(), text.data());
}

TEST(TextPair, canBeAssignedToItselfAndToOthers) {
    TextPair pair("song.mp3", "Artist/song.mp3");
    const auto& same = pair;
    pair = same;
    EXPECT_EQ(pair.first(), "song.mp3");
    TextPair other;
    other = pair;
    EXPECT_EQ(other, pair);
    pair = TextPair(pair.second(), pair.first());
    EXPECT_EQ(pair.first(), "Artist/song.mp3");
    EXPECT_EQ(other.first(), "song.mp3");
}

} // namespace

} // namespace quorl::wearable::test
