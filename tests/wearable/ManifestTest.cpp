// The list of our files on a wearable, which others may have had in their hands.

#include "services/wearable/Manifest.h"

#include <limits>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "services/base/AtomicFile.h"
#include "services/wearable/Attachment.h"
#include "services/wearable/Wearable.h"
#include "tests/base/TemporaryDirectory.h"

namespace {

using namespace quorl::wearable;
using quorl::tests::TemporaryDirectory;
using ::testing::HasSubstr;

Manifest everything() {
    constexpr auto most = std::numeric_limits<std::uint64_t>::max();
    return {{{"Añjo.mp3", "Dir/100%\xFF\x01 Añjo.mp3", most, -1, hashOf("abc")}},
            Entry{"List.m3u8", "List.m3u", 7, 0, hashOf("def")},
            {{"old.ogg", "old.ogg", 0, 1, {}}},
            Selection{most, most - 1, 2, 3}};
}

TEST(Manifest, GivesBackWhatWasWritten) {
    EXPECT_EQ(parseManifest(toText(everything())), everything());
}

/// What stands on wearables: later versions have to read it, and write nothing else for it.
TEST(Manifest, IsWrittenAsItAlwaysWas) {
    const Manifest manifest{
        {{"Tune.mp3", "a/%\x1F ~\x7F\xFF.mp3", 18446744073709551615U, -1,
          Digest{0x000910baa2190ef6, 0x1d942b5518a50626}}},
        Entry{"List.m3u8", "List.m3u", 7, 0, Digest{0x23718075c68c2330, 0x25cc0693d208555d}},
        {{"old.ogg", "old.ogg", 0, 1, {}}},
        Selection{4, 3, 2, 1}};
    const std::string text = R"({
 "format": 1,
 "playlist": {
  "hash": "23718075c68c233025cc0693d208555d",
  "modified": 0,
  "name": "List.m3u8",
  "size": 7,
  "source": "List.m3u"
 },
 "sent": {
  "limit": 1,
  "limitType": 2,
  "playlist": 4,
  "revision": 3
 },
 "songs": [
  {
   "hash": "000910baa2190ef61d942b5518a50626",
   "modified": -1,
   "name": "Tune.mp3",
   "size": 18446744073709551615,
   "source": "a/%25%1F ~%7F%FF.mp3"
  }
 ],
 "strays": [
  {
   "hash": "",
   "modified": 1,
   "name": "old.ogg",
   "size": 0,
   "source": "old.ogg"
  }
 ]
}
)";
    EXPECT_EQ(toText(manifest), text);
    EXPECT_EQ(parseManifest(text), manifest);
}

class HostileManifest : public ::testing::TestWithParam<std::string> {};

TEST_P(HostileManifest, IsRejectedBecauseAFileElsewhereCouldBeRemovedByItsName) {
    auto manifest = everything();
    manifest.strays.front().rename(GetParam());

    EXPECT_THROW(static_cast<void>(parseManifest(toText(manifest))), BadManifest);
}

INSTANTIATE_TEST_SUITE_P(Name, HostileManifest,
                         ::testing::Values("", ".", "..", "../state.json", "/etc/passwd", "a/b",
                                           std::string("a\0b", 3)));

/// Why a manifest with this text is rejected.
std::string rejectionOf(const std::string& text) {
    try {
        static_cast<void>(parseManifest(text));
    } catch (const BadManifest& error) {
        return error.what();
    }
    return "not at all";
}

TEST(Manifest, ThatIsBrokenSaysWhatToDo) {
    const std::string path = R"({"format":1,"songs":[],"strays":[{"name":"a","source":")";
    const std::string rest = R"(","size":1,"modified":1,"hash":""}]})";
    EXPECT_EQ(rejectionOf(path + "%20a" + rest), "not at all");
    for (const auto& [text, why] : std::vector<std::pair<std::string, std::string>>{
             {"{", "it is not well-formed"},
             {"[]", "it is not well-formed"},
             {"{}", "it is not well-formed"},
             {R"({"format":0})", "a later version has written it"},
             {R"({"format":2})", "a later version has written it"},
             {R"({"format":1,"songs":3})", "it is not well-formed"},
             {path + "%" + rest, "a path is not well-formed"},
             {path + "%2" + rest, "a path is not well-formed"},
             {path + "%2g" + rest, "a path is not well-formed"},
             {path + "%g2" + rest, "a path is not well-formed"},
             {path + "% 2" + rest, "a path is not well-formed"},
             {R"({"format":1,"songs":[],"strays":[{"name":".."}]})",
              "a name leads out of the music directory"}}) {
        EXPECT_EQ(rejectionOf(text),
                  "The list of the music on the Velora cannot be used (" + why +
                      "). Remove the files .quorl/manifest.* from it to begin anew; the music "
                      "that is on it then stays.")
            << text;
    }
}

/// As they come from hands that write JSON by other rules than ours.
TEST(Manifest, IsReadWhateverElseStandsInItAndInWhateverOrder) {
    const Manifest one{{{"a", "a", 1, 2, hashOf("h")}}, {}, {}, {}};
    const std::string song = R"({"size":1,"x":{"name":"z"},"hash":")" + toText(hashOf("h")) +
                             R"(","name":"z","source":"a",)"
                             R"("modified":2,"name":"a","y":[{"size":9}]})";
    for (const auto& text :
         {R"({"strays":[],"x":{"songs":[1],"format":2,"y":[[]]},"format":1,"songs":[)" + song +
              R"(],"z":null})",
          R"({"format":2,"format":1,"songs":3,"songs":[)" + song + R"(],"strays":[]})"}) {
        EXPECT_EQ(parseManifest(text), one) << text;
    }
}

TEST(Manifest, SaysOfSeveralThingsThatAreWrongWhichCountsFirst) {
    const std::string number = "a number in it is not a whole one, or out of range";
    const std::string bad = R"({"name":"a","source":"%","size":1,"modified":1,"hash":""})";
    const std::string worse = R"({"name":"a","source":"a","size":-1,"modified":1,"hash":""})";
    for (const auto& [text, why] : std::vector<std::pair<std::string, std::string>>{
             {R"({"songs":[)" + bad + R"(],"strays":[],"format":2})",
              "a later version has written it"},
             {R"({"format":1,"strays":[)" + bad + R"(],"songs":[)" + worse + "]}", number},
             {R"({"format":1,"songs":[)" + worse + "," + bad + R"(],"strays":[]})", number},
             {R"({"format":1,"songs":[)" + worse + R"(],"strays":[]}})", "it is not well-formed"},
             {R"({"format":1,"songs":[)" + worse + R"(],"strays":[)", "it is not well-formed"},
             {R"({"format":1,"songs":[{"name":"a"}],"strays":[]})", "it is not well-formed"},
             {R"({"format":1,"songs":[{"name":1}],"strays":[]})", "it is not well-formed"},
             {R"({"format":1,"songs":[1],"strays":[]})", "it is not well-formed"},
             {R"({"format":1,"songs":[[]],"strays":[]})", "it is not well-formed"},
             {R"({"format":1,"songs":[]})", "it is not well-formed"},
             {R"({"format":1,"songs":[],"strays":[],"sent":null})", "it is not well-formed"},
             {R"({"format":1,"songs":[],"strays":[],"sent":{"limit":"1"}})",
              "it is not well-formed"},
             {R"({"format":1,"songs":[],"strays":[],"playlist":[]})", "it is not well-formed"},
             {R"({"format":"1","songs":[],"strays":[]})", "a later version has written it"},
             {R"({"format":null})", "a later version has written it"}}) {
        EXPECT_THAT(rejectionOf(text), HasSubstr("(" + why + ")")) << text;
    }
}

TEST(Manifest, WithAHashThatIsNoneIsRejected) {
    const auto hash = toText(hashOf("def"));
    EXPECT_EQ(hash.size(), 32);
    for (const auto& other : {std::string("def"), hash.substr(1), hash + "0", "-" + hash.substr(1),
                              hash.substr(1) + "g", std::string(32, ' ')}) {
        auto text = toText(everything());
        text.replace(text.find(hash), hash.size(), other);
        EXPECT_THAT(rejectionOf(text), HasSubstr("(it is not well-formed)")) << other;
    }
}

TEST(Manifest, WithNumbersThatWeHaveNeverWrittenIsRejected) {
    const std::string text = toText(everything());
    for (const std::string number :
         {"-1", "0.5", "18446744073709551616", "1e300", "\"7\"", "null"}) {
        auto changed = text;
        const std::string field = "\"size\": 7";
        changed.replace(changed.find(field), field.size(), "\"size\": " + number);
        EXPECT_THAT(rejectionOf(changed),
                    HasSubstr("(a number in it is not a whole one, or out of range)"))
            << number;
    }
    auto late = text;
    const std::string field = "\"modified\": -1";
    late.replace(late.find(field), field.size(), "\"modified\": 9223372036854775808");
    EXPECT_THROW(static_cast<void>(parseManifest(late)), BadManifest);
}

TEST(Manifest, ThatIsNestedAsDeeplyAsItIsLongIsReadNoFurtherThanItsFirstLevels) {
    const std::string text = R"({"format":1,"strays":[],"songs":)";
    EXPECT_THAT(rejectionOf(text + std::string(1'000'000, '[')),
                HasSubstr("(it is nested too deeply)"));
    EXPECT_THAT(rejectionOf(text + std::string(9, '[')), HasSubstr("(it is nested too deeply)"));
    EXPECT_THAT(rejectionOf(text + std::string(8, '[')), HasSubstr("(it is not well-formed)"));
}

TEST(Manifest, KeepsTheEarliestAndTheLatestTime) {
    auto manifest = everything();
    manifest.strays.front().modified = std::numeric_limits<std::int64_t>::min();
    manifest.songs.front().modified = std::numeric_limits<std::int64_t>::max();

    EXPECT_EQ(parseManifest(toText(manifest)), manifest);
}

TEST(Attachment, IsConnectedAndOnTheChargerUntilTheUserSaysOtherwise) {
    const TemporaryDirectory device;
    const auto root = quorl::base::openRoot(device.path().c_str());
    EXPECT_EQ(loadAttachment(root.get()), (Attachment{true, true}));

    saveAttachment(root.get(), {true, false});

    EXPECT_EQ(loadAttachment(root.get()), (Attachment{true, false}));
}

TEST(Attachment, ThatWouldFillTheMemoryIsNotRead) {
    const TemporaryDirectory device;
    const auto root = quorl::base::openRoot(device.path().c_str());
    saveAttachment(root.get(), {false, false});
    const auto file = std::filesystem::path(ownDirectory) / "state.json";

    device.write(file.native(),
                 std::string(5000, ' ') + R"({"connected":false,"onCharger":false})");
    EXPECT_EQ(loadAttachment(root.get()), (Attachment{true, true}));

    std::filesystem::resize_file(device.path() / file, std::uintmax_t{1} << 40);

    EXPECT_EQ(loadAttachment(root.get()), (Attachment{true, true}));
}

} // namespace
