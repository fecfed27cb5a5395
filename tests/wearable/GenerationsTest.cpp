// The manifest in its two files, of which others or a loss of power may have left anything.

#include "services/wearable/Generations.h"

#include <algorithm>
#include <cerrno>
#include <fstream>
#include <map>
#include <numeric>
#include <system_error>

#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/stat.h>

#include "services/base/AtomicFile.h"
#include "tests/base/ManualPage.h"
#include "tests/base/TemporaryDirectory.h"

namespace {

using namespace quorl::wearable;
using quorl::tests::TemporaryDirectory;
using ::testing::HasSubstr;

constexpr auto first = "manifest.1";
constexpr auto second = "manifest.2";

Manifest manifestOf(const std::string& song) {
    return {{{song, song, 10, 1, hashOf("h")}}, {}, {}, Selection{1, 2, 3, 4}};
}

class Generations : public ::testing::Test {
  protected:
    [[nodiscard]] StoredManifest newest() const {
        return newestManifest([this](const char* name) {
            const auto file = files_.find(name);
            return file == files_.end() ? std::nullopt : std::optional(file->second);
        });
    }

    std::map<std::string, std::string> files_;
};

TEST_F(Generations, AreNoneOnANewWearable) {
    EXPECT_EQ(newest().manifest, Manifest());
    EXPECT_EQ(newest().number, 0);
    EXPECT_EQ(newest().next, 0);
}

TEST_F(Generations, AreWrittenAsTheManualShows) {
    const auto example = quorl::tests::exampleIn("quorl-manifest.5");
    files_ = {{first, example}};
    const auto [manifest, number, next] = newest();

    ASSERT_EQ(manifest.songs.size(), 2);
    EXPECT_EQ(manifest.songs[1].source(), "Café/Evening.mp3");
    EXPECT_TRUE(manifest.playlist && manifest.sent);
    EXPECT_EQ(generationText(number, manifest), example);
}

TEST_F(Generations, CountByTheirNumbersWhicheverFileTheyAreIn) {
    files_ = {{first, generationText(9, manifestOf("old"))},
              {second, generationText(10, manifestOf("new"))}};
    EXPECT_EQ(newest().manifest, manifestOf("new"));
    EXPECT_EQ(newest().number, 10);
    EXPECT_EQ(newest().next, 0);

    files_[first] = generationText(11, manifestOf("newest"));
    EXPECT_EQ(newest().manifest, manifestOf("newest"));
    EXPECT_EQ(newest().next, 1);
}

/// What stands on wearables: later versions have to read it, and write nothing else for it.
TEST_F(Generations, AreWrittenAsTheyAlwaysWere) {
    const std::string text = R"(207614251ec5156a 255
{
 "format": 1,
 "songs": [],
 "strays": []
}
)";
    EXPECT_EQ(generationText(255, {}), text);
    files_ = {{second, text}};
    EXPECT_EQ(newest().number, 255);
}

TEST_F(Generations, BeginWithTheFirst) {
    files_ = {{first, generationText(0, manifestOf("none"))}};
    EXPECT_EQ(newest().manifest, Manifest());

    files_ = {{first, generationText(1, manifestOf("song"))}};
    EXPECT_EQ(newest().manifest, manifestOf("song"));
}

TEST_F(Generations, OfOneNumberAreThatOfTheFirstFile) {
    files_ = {{first, generationText(3, manifestOf("first"))},
              {second, generationText(3, manifestOf("second"))}};
    EXPECT_EQ(newest().manifest, manifestOf("first"));
    EXPECT_EQ(newest().next, 1);
}

TEST_F(Generations, FillTheFileThatTheyAreWrittenOver) {
    for (std::size_t size = 0; size < 600; ++size) {
        files_[first] = generationText(3, manifestOf("new"), size);

        ASSERT_GE(files_[first].size(), size);
        ASSERT_LE(files_[first].size(),
                  std::max(size, generationText(3, manifestOf("new")).size()) + 8);
        ASSERT_EQ(newest().manifest, manifestOf("new")) << size;
    }
}

TEST_F(Generations, AreNotBelievedWhereAnyByteIsAnother) {
    const auto whole = generationText(2, manifestOf("new"));
    for (std::size_t at = 0; at < whole.size(); ++at) {
        auto damaged = whole;
        damaged[at] = static_cast<char>(damaged[at] ^ 1);
        files_ = {{first, generationText(1, manifestOf("old"))}, {second, damaged}};

        EXPECT_EQ(newest().manifest, manifestOf("old")) << at;
        EXPECT_EQ(newest().next, 1) << at;
    }
}

TEST_F(Generations, AreNotBelievedWhereverTheyAreCutOff) {
    const auto whole = generationText(2, manifestOf("new"));
    for (std::size_t size = 0; size < whole.size(); ++size) {
        files_ = {{first, whole.substr(0, size)}, {second, generationText(1, manifestOf("old"))}};

        EXPECT_EQ(newest().manifest, manifestOf("old")) << size;
        EXPECT_EQ(newest().next, 0) << size;
    }
}

/// Of more than one piece.
Manifest longManifest() {
    Manifest manifest;
    for (int song = 0; song < 2'000; ++song) {
        const auto name = "song " + std::to_string(song);
        manifest.songs.emplace_back(name, "folder/" + name, 10, 1, hashOf(name));
    }
    return manifest;
}

TEST_F(Generations, AreWrittenInPiecesWhereTheyAreLong) {
    const auto manifest = longManifest();
    const auto text = generationText(7, manifest);
    ASSERT_TRUE(text.ends_with(toText(manifest)));
    for (const auto size : {std::size_t{0}, text.size() + 200'000}) {
        std::vector<std::string> pieces;
        writeGeneration(7, manifest, size,
                        [&](std::string_view piece) { pieces.emplace_back(piece); });

        const auto& last = pieces.back();
        EXPECT_EQ(pieces.size(), std::max(size, text.size()) / 65'536 + 1);
        EXPECT_TRUE(std::all_of(pieces.begin(), pieces.end() - 1,
                                [](const auto& piece) { return piece.size() == 65'536; }));
        EXPECT_TRUE(!last.empty() && last.size() < 65'536);
        files_[first] = std::accumulate(pieces.begin(), pieces.end(), std::string());
        EXPECT_TRUE(newest().manifest == manifest);
    }
    EXPECT_EQ(files_[first].size(), text.size() + 200'000);
}

TEST_F(Generations, ThatAreLongAreNotBelievedEitherWhereTheyAreDamaged) {
    const auto whole = generationText(2, longManifest());
    for (const auto at : {std::size_t{0}, std::size_t{65'536}, whole.size() - 1}) {
        auto damaged = whole;
        damaged[at] = static_cast<char>(damaged[at] ^ 1);
        for (const auto& other : {damaged, whole.substr(0, at)}) {
            files_ = {{first, generationText(1, manifestOf("old"))}, {second, other}};

            EXPECT_EQ(newest().manifest, manifestOf("old")) << at;
            EXPECT_EQ(newest().next, 1) << at;
        }
    }
}

/// Gives on few bytes at a time, and fails in the end where it is to.
class SlowReader final : public quorl::base::Reader {
  public:
    SlowReader(std::string text, bool fails) : text_(std::move(text)), fails_(fails) {}

    [[nodiscard]] std::size_t read(std::span<std::byte> buffer) override {
        const auto size =
            text_.copy(reinterpret_cast<char*>(buffer.data()), std::min(buffer.size(), most_), at_);
        at_ += size;
        if (size == 0 && fails_) {
            throw std::system_error(EIO, std::generic_category());
        }
        return size;
    }

  private:
    const std::string text_;
    const bool fails_;
    static constexpr std::size_t most_ = 1'000;
    std::size_t at_ = 0;
};

TEST_F(Generations, AreReadHoweverLittleTheDeviceGivesAtATime) {
    const auto manifest = longManifest();
    for (const bool fails : {false, true}) {
        const auto open = [&](std::string_view name) {
            return name == second ? std::make_unique<SlowReader>(generationText(2, manifest), fails)
                                  : nullptr;
        };
        if (fails) {
            EXPECT_THROW(static_cast<void>(newestManifest(open)), std::system_error);
        } else {
            EXPECT_TRUE(newestManifest(open).manifest == manifest);
        }
    }
}

TEST_F(Generations, SayWhatIsWrongWithTheNewestWhereItIsWhole) {
    const auto elsewhere = manifestOf("..");
    files_ = {{first, generationText(1, manifestOf("old"))},
              {second, generationText(2, elsewhere)}};
    EXPECT_THROW(static_cast<void>(newest()), BadManifest);

    files_[second].back() = ' ';
    EXPECT_EQ(newest().manifest, manifestOf("old"));
}

TEST_F(Generations, AreNoneWhereTheVeryFirstWasCutOffAndThatFileIsWrittenAgain) {
    files_ = {{first, ""}};
    EXPECT_EQ(newest().manifest, Manifest());
    EXPECT_EQ(newest().next, 0);

    files_ = {{second, "12"}};
    EXPECT_EQ(newest().manifest, Manifest());
    EXPECT_EQ(newest().next, 1);
}

TEST_F(Generations, SayWhatToDoWhereBothAreDamaged) {
    files_ = {{first, ""}, {second, "damaged"}, {formerManifestFile, toText(manifestOf("old"))}};

    try {
        static_cast<void>(newest());
        FAIL();
    } catch (const BadManifest& error) {
        EXPECT_THAT(error.what(), HasSubstr("(both copies of it are damaged)"));
        EXPECT_THAT(error.what(), HasSubstr("Remove the files .quorl/manifest.*"));
    }
}

TEST_F(Generations, FollowTheManifestOfTheTimeBefore) {
    files_ = {{formerManifestFile, toText(manifestOf("former"))}};
    EXPECT_EQ(newest().manifest, manifestOf("former"));
    EXPECT_EQ(newest().number, 0);

    files_[first] = generationText(1, manifestOf("new")).substr(0, 20);
    EXPECT_EQ(newest().manifest, manifestOf("former")) << "the first saving was cut short";

    files_[first] = generationText(1, manifestOf("new"));
    EXPECT_EQ(newest().manifest, manifestOf("new"));
}

/// Why the manifest of `device` is rejected.
std::string rejectionOf(const TemporaryDirectory& device) {
    try {
        static_cast<void>(loadManifest(quorl::base::openRoot(device.path().c_str()).get()));
    } catch (const BadManifest& error) {
        return error.what();
    }
    return {};
}

TEST(ManifestFile, IsReadFromTheWearable) {
    const TemporaryDirectory device;
    device.write(".quorl/manifest.2", generationText(4, manifestOf("song")));

    EXPECT_EQ(loadManifest(quorl::base::openRoot(device.path().c_str()).get()), manifestOf("song"));
}

class OddManifestFile : public ::testing::TestWithParam<const char*> {};

TEST_P(OddManifestFile, IsRejectedAndNotWaitedFor) {
    const TemporaryDirectory device;
    const auto manifest = device.path() / ".quorl" / GetParam();
    std::filesystem::create_directory(device.path() / ".quorl");
    ASSERT_EQ(mkfifo(manifest.c_str(), 0644), 0);
    EXPECT_THAT(rejectionOf(device), HasSubstr("(it is not a regular file)"));

    std::filesystem::remove(manifest);
    std::filesystem::create_directory(manifest);
    EXPECT_THAT(rejectionOf(device), HasSubstr("(it is not a regular file)"));

    std::filesystem::remove(manifest);
    std::filesystem::create_symlink("/dev/zero", manifest);
    EXPECT_THAT(rejectionOf(device), HasSubstr("(it is not a regular file)"));

    std::filesystem::remove(manifest);
    std::ofstream{manifest}.close();
    std::filesystem::resize_file(manifest, std::uintmax_t{1} << 30);
    EXPECT_THAT(rejectionOf(device), HasSubstr("(it is larger than 64 MiB)"));
}

TEST(ManifestFile, IsReadUpTo64MebibytesAndNoFurther) {
    constexpr std::uint64_t most = 67'108'864;
    EXPECT_NO_THROW(requireReadable(true, most));
    EXPECT_THROW(requireReadable(true, most + 1), BadManifest);
}

INSTANTIATE_TEST_SUITE_P(Name, OddManifestFile,
                         ::testing::Values(first, second, formerManifestFile));

} // namespace
