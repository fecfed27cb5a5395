#include <thread>

#include <gmock/gmock.h>

#include "platform/WearableSettings.h"
#include "tests/support/MainQueueRun.h"
#include "tests/support/TestHost.h"

namespace {

using quorl::tests::runMainQueueUntil;
using quorl::tests::runQueuedWork;
using quorl::tests::TestHost;
using testing::ElementsAre;
using testing::IsEmpty;

class WearableSettings : public testing::Test {
  protected:
    /// Asks; the reply goes into `replies_` as free bytes, or as the error's text.
    void ask() {
        manager_->getUsage(
            [this](const NSDictionary<NSNumber>& usage, const std::shared_ptr<NSError>& error) {
                repliedOn_ = std::this_thread::get_id();
                replies_.push_back(
                    usage ? std::to_string(usage->at(std::string(kLSSUsageAvailableStorageKey))
                                               ->unsignedLongLongValue())
                          : error->localizedDescription());
            });
    }

    std::shared_ptr<TestHost> host_ = TestHost::installed();
    std::shared_ptr<LSSManager> manager_ =
        create<LSSManager>(&LSSManager::initWithQueue, dispatch_get_main_queue());
    std::vector<std::string> replies_;
    std::thread::id repliedOn_;
};

TEST_F(WearableSettings, NameTheFiguresOfAReply) {
    EXPECT_EQ(kLSSUsageAvailableStorageKey, "kLSSUsageAvailableStorageKey");
    EXPECT_EQ(kLSSUsageSongsKey, "kLSSUsageSongsKey");
}

TEST_F(WearableSettings, AreNotThereWithoutAHost) {
    quorl::Host::install(nullptr);

    EXPECT_EQ(create<LSSManager>(&LSSManager::initWithQueue, dispatch_get_main_queue()), nullptr);
}

TEST_F(WearableSettings, AnswerAQuestionOnceAndLater) {
    ask();
    EXPECT_EQ(host_->wearable.openQuestions(), 1U);
    host_->wearable.reply({1000, 0});
    EXPECT_THAT(replies_, IsEmpty()) << "the reply comes on the queue";

    runQueuedWork();
    EXPECT_THAT(replies_, ElementsAre("1000"));
    runQueuedWork();
    EXPECT_THAT(replies_, ElementsAre("1000"));
}

TEST_F(WearableSettings, AnswerEachQuestionByItself) {
    ask();
    ask();
    host_->wearable.reply({1, 0});
    host_->wearable.reply({2, 0});
    runQueuedWork();

    EXPECT_THAT(replies_, ElementsAre("1", "2"));
}

TEST_F(WearableSettings, AnswerWithTheErrorWhereThereAreNoFigures) {
    ask();
    host_->wearable.fail("The wearable is out of reach.");
    runQueuedWork();

    EXPECT_THAT(replies_, ElementsAre("The wearable is out of reach."));
}

TEST_F(WearableSettings, AnswerOnTheQueueWhateverThreadTheReplyCameOn) {
    ask();

    std::jthread([reply = host_->wearable.takeQuestion()] {
        reply(nullptr, std::make_shared<NSError>("gone"));
    }).join();
    runMainQueueUntil([this] { return !replies_.empty(); });

    EXPECT_EQ(repliedOn_, std::this_thread::get_id());
}

TEST_F(WearableSettings, AnswerAlsoAfterTheClientWasDestroyed) {
    ask();

    manager_.reset();
    host_->wearable.reply({5, 0});
    runQueuedWork();

    EXPECT_THAT(replies_, ElementsAre("5"));
}

TEST_F(WearableSettings, LetGoOfWhatTheQuestionHeldOnlyAfterTheAnswer) {
    auto held = std::make_shared<int>(0);
    const std::weak_ptr<int> watched = held;
    bool wasHeld = false;
    manager_->getUsage([held = std::move(held), &wasHeld](const auto&, const auto&) {
        wasHeld = held != nullptr;
    });
    EXPECT_FALSE(watched.expired());

    host_->wearable.reply({1, 0});
    EXPECT_FALSE(watched.expired());
    runQueuedWork();

    EXPECT_TRUE(wasHeld);
    EXPECT_TRUE(watched.expired());
}

} // namespace
