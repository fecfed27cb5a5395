// What the engine remembers of its syncs, and when it tries again.

#include "quorl-syncd/engine/LastResults.h"

#include <gtest/gtest.h>

#include "quorl-syncd/engine/RetryDelay.h"
#include "tests/base/TemporaryDirectory.h"

namespace {

using namespace quorl::syncd;
using namespace std::chrono_literals;
using quorl::tests::TemporaryDirectory;

const LastResult sent{true, {"synced", {"3"}}, 1'700'000'000'000'000, 1'700'000'000'000'000};
const LastResult full{false, {"wearable-full"}, 1'700'000'001'000'000, 5};

class Results : public ::testing::Test {
  protected:
    TemporaryDirectory folder_;
    std::filesystem::path place_ = folder_.path() / "state/quorl";
};

TEST_F(Results, AreThereForEachWearableWhenTheFileIsReadAgain) {
    {
        LastResults results{place_};
        EXPECT_EQ(results.of("/one"), LastResult{});
        results.remember("/one", full);
        results.remember("/two", full);
        results.remember("/one", sent);
        EXPECT_EQ(results.of("/one"), sent);
    }
    const LastResults results{place_};
    EXPECT_EQ(results.of("/one"), sent);
    EXPECT_EQ(results.of("/two"), full);
    EXPECT_EQ(results.of("/three"), LastResult{});
}

TEST_F(Results, OfEarlierAndOfLaterEnginesAreTheirSentences) {
    folder_.write("state/quorl/last-sync.json",
                  R"({"/one": {"success": false, "message": "It is full.", "time": 5},
                      "/two": {"success": false, "message": "It rains.", "code": "weather",
                               "arguments": ["rain"], "time": 6},
                      "/three": {"success": true, "message": "All is there.", "time": 7}})");
    const LastResults results{place_};
    EXPECT_EQ(results.of("/one"), (LastResult{false, quorl::engine::other("It is full."), 5, 0}));
    EXPECT_EQ(results.of("/two"), (LastResult{false, quorl::engine::other("It rains."), 6, 0}));
    EXPECT_EQ(results.of("/three").lastComplete, 7);
}

TEST_F(Results, AFileThatCannotBeReadIsReplacedByTheNextResult) {
    folder_.write("state/quorl/last-sync.json", "{\"/one\": {\"success\": tr");
    LastResults results{place_};
    EXPECT_EQ(results.of("/one"), LastResult{});

    results.remember("/one", sent);

    EXPECT_EQ(LastResults{place_}.of("/one"), sent);
}

TEST_F(Results, AResultOfTheWrongShapeCountsAsNone) {
    folder_.write("state/quorl/last-sync.json", R"({"/one": {"success": "yes"}})");
    EXPECT_EQ(LastResults{place_}.of("/one"), LastResult{});
}

TEST_F(Results, AreRememberedForThisRunWhereTheyCannotBeWritten) {
    folder_.write("state", "a file in the place of the directory");
    LastResults results{place_};

    EXPECT_THROW(results.remember("/one", sent), std::system_error);

    EXPECT_EQ(results.of("/one"), sent);
}

TEST(Delay, DoublesAfterEachFailureUpToAnHourAndBeginsAnewAfterASuccess) {
    RetryDelay delay{60s};
    for (const auto expected : {60s, 120s, 240s, 480s, 960s, 1920s, 3600s, 3600s}) {
        EXPECT_EQ(delay.next(), expected);
    }
    delay.reset();
    EXPECT_EQ(delay.next(), 60s);
}

} // namespace
