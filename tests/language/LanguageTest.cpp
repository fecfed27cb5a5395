// What a program says, in the language of whoever reads it.

#include <clocale>
#include <thread>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "services/engine/Codes.h"
#include "services/engine/Message.h"
#include "services/language/Languages.h"
#include "services/language/Numbers.h"
#include "services/language/Translated.h"
#include "services/wearable/Manifest.h"

namespace quorl::language {

namespace {

using testing::ElementsAre;

/// As ICU writes them, without the marks of direction and with plain spaces.
std::string plain(std::string text) {
    for (const std::string mark : {"\u061C", "\u200E", "\u200F"}) {
        for (auto at = text.find(mark); at != std::string::npos; at = text.find(mark)) {
            text.erase(at, mark.size());
        }
    }
    for (const std::string space : {"\u00A0", "\u202F"}) {
        for (auto at = text.find(space); at != std::string::npos; at = text.find(space)) {
            text.replace(at, space.size(), " ");
        }
    }
    return text;
}

std::string songs(std::uint64_t count) {
    return translatedCount("{count} song", "{count} songs", count);
}

class Language : public testing::Test {
  protected:
    ~Language() override { followLanguages({}); }
};

TEST_F(Language, isEnglishBeforeAnythingIsFollowed) {
    EXPECT_THAT(followedLanguages(), ElementsAre("en"));
    EXPECT_EQ(translated("Stop"), "Stop");
    EXPECT_EQ(songs(1), "1 song");
    EXPECT_EQ(songs(1'000), "1,000 songs");
}

TEST_F(Language, isTheFirstThatThereAreTextsIn) {
    followLanguages({"xx", "de_AT", "fr"});
    EXPECT_THAT(followedLanguages(), ElementsAre("de_AT", "fr"));
    EXPECT_EQ(translated("Stop"), "Anhalten");

    followLanguages({"en_GB", "de"});
    EXPECT_EQ(translated("Stop"), "Stop");

    followLanguages({"xx"});
    EXPECT_THAT(followedLanguages(), ElementsAre("en"));
    EXPECT_EQ(translated("Stop"), "Stop");
}

TEST_F(Language, needsNoLocaleThatIsInstalled) {
    std::setlocale(LC_ALL, "C");
    followLanguages({"fr"});
    EXPECT_EQ(translated("Stop"), "Arrêter");
    EXPECT_STREQ(std::setlocale(LC_MESSAGES, nullptr), "C") << "it is left as it is";
}

TEST_F(Language, canBeAnotherOneLater) {
    for (const auto& [language, text] : {std::pair("de", "Anhalten"), std::pair("fr", "Arrêter"),
                                         std::pair("en", "Stop"), std::pair("de", "Anhalten")}) {
        followLanguages({language});
        EXPECT_EQ(translated("Stop"), text);
    }
}

TEST_F(Language, isThatOfTheEnvironment) {
    setenv("LANGUAGE", "de_AT.UTF-8:fr", 1);
    EXPECT_THAT(usersLanguages(), ElementsAre("de_AT", "de", "fr"));
    unsetenv("LANGUAGE");
    setenv("LC_ALL", "C", 1);
    EXPECT_THAT(usersLanguages(), testing::IsEmpty());
    setenv("LC_ALL", "fr_FR.UTF-8", 1);
    EXPECT_THAT(usersLanguages(), ElementsAre("fr_FR", "fr"));
}

TEST_F(Language, leavesAloneWhatItDoesNotKnow) {
    followLanguages({"de"});
    EXPECT_EQ(translated("Nobody says so."), "Nobody says so.");
    EXPECT_EQ(translated(""), "");
}

TEST_F(Language, hasAFormForEachCount) {
    followLanguages({"fr"});
    EXPECT_EQ(songs(0), "0 morceau");
    EXPECT_EQ(songs(2), "2 morceaux");
    EXPECT_THAT(songs(0x1'0000'0001), testing::EndsWith(" morceaux")) << "which in 32 bits is 1";

    followLanguages({"ar"});
    EXPECT_EQ(songs(1), "أغنية واحدة");
    EXPECT_EQ(songs(2), "أغنيتان");
    EXPECT_EQ(songs(3), numberText(3) + " أغانٍ");
    EXPECT_EQ(songs(11), numberText(11) + " أغنية");
}

TEST_F(Language, writesNumbersAsTheTextsAreWritten) {
    followLanguages({"de"});
    EXPECT_EQ(numberText(1'234'567), "1.234.567");
    EXPECT_EQ(plain(percentText(0.256)), "25 %");
    EXPECT_EQ(plain(megabyteText(1'500)), "1.500 MB");

    followLanguages({"ar_EG"});
    EXPECT_EQ(plain(numberText(1'234)), "١٬٢٣٤");
    EXPECT_EQ(plain(percentText(0.256)), "٢٥٪");

    followLanguages({"xx_EG", "de"});
    EXPECT_EQ(numberText(1'234), "1.234");
}

TEST_F(Language, roundsNoPercentUp) {
    EXPECT_EQ(percentText(0), "0%");
    EXPECT_EQ(percentText(0.999), "99%");
    EXPECT_EQ(percentText(1), "100%");
}

TEST_F(Language, isTheSameOnEveryThread) {
    followLanguages({"de"});
    std::vector<std::string> texts(8);
    {
        std::vector<std::jthread> threads;
        for (auto& text : texts) {
            threads.emplace_back([&text] { text = translated("Stop") + songs(1'000); });
        }
    }
    EXPECT_THAT(texts, testing::Each("Anhalten1.000 Titel"));
}

TEST_F(Language, wordsWhatTheEngineTells) {
    followLanguages({"de"});
    EXPECT_EQ(engine::sentence({engine::code::synced, {"2"}}),
              "2 Titel mit Velora synchronisiert.");
    EXPECT_EQ(engine::sentence({"missing"}),
              "Diese Datei gibt es nicht. Lege sie zurück, oder nimm sie aus der Playlist.");
    EXPECT_EQ(engine::sentence(engine::other("Nobody says so.")), "Nobody says so.");
    EXPECT_EQ(engine::sentence({engine::code::songUnreadable, {"a/b.mp3", ""}}),
              "„a/b.mp3“ kann nicht gelesen werden.");
}

TEST_F(Language, partsSentencesAndDetailsAsItsWritersDo) {
    const engine::Message unreadable{engine::code::songUnreadable, {"a.mp3", "No"}};
    const engine::Message several{engine::code::songsLeftOut, {"2", "song-gone", "a.mp3"}};
    EXPECT_EQ(engine::sentence(unreadable), "“a.mp3” cannot be read: No.");
    EXPECT_EQ(engine::sentence(several), "“a.mp3” is no longer in the music folder. 1 more song "
                                         "could not be sent.");

    followLanguages({"fr"});
    EXPECT_THAT(engine::sentence(unreadable), testing::EndsWith("\u00A0: No."));

    followLanguages({"ja"});
    EXPECT_THAT(engine::sentence(several), testing::HasSubstr("。ほかに1曲"));
}

TEST_F(Language, reachesIntoBrackets) {
    followLanguages({"de"});
    try {
        static_cast<void>(wearable::parseManifest("{"));
        FAIL() << "it is none";
    } catch (const wearable::BadManifest& error) {
        EXPECT_THAT(engine::sentence(error.message()),
                    testing::HasSubstr(" nicht brauchbar (es ist nicht wohlgeformt). "));
    }
}

TEST_F(Language, isSaidAsItIsWhereACatalogueHasBlanksThatThereAreNot) {
    followLanguages({"wrong"}, WRONG_CATALOGUE);
    EXPECT_EQ(engine::sentence({engine::code::synced, {"2"}}),
              "{titles 0} {} { } 2 songs 2 songs 2 songs Velora");
}

TEST(Filled, hasWhatStandsForEachBlank) {
    EXPECT_EQ(filled("{b} of {a}", {{"a", "1"}, {"b", "2"}}), "2 of 1");
    EXPECT_EQ(filled("{a}{a}", {{"a", "{a}"}}), "{a}{a}") << "what is filled in is no pattern";
    EXPECT_EQ(filled("", {{"a", "1"}}), "");
}

TEST(Filled, leavesAloneWhatIsNoBlank) { EXPECT_EQ(filled("{c} } {a", {{"a", "1"}}), "{c} } {a"); }

} // namespace

} // namespace quorl::language
