// Questions to a wearable that may be slow, hang or go away.

#include "services/wearable/Reporter.h"

#include <atomic>
#include <future>
#include <latch>
#include <semaphore>
#include <thread>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "tests/wearable/TemporaryDirectory.h"

namespace {

using namespace quorl::wearable;
using namespace std::chrono_literals;
using quorl::wearable::testing::TemporaryDirectory;

constexpr auto forever = std::chrono::hours{1};

/// One question and its answer.
class Asked {
  public:
    explicit Asked(Reporter& reporter) {
        reporter.ask([this](const Reporter::Answer& answer) {
            ++times_;
            thread_ = std::this_thread::get_id();
            answer_.set_value(answer);
        });
    }

    Reporter::Answer answer() { return future_.get(); }

    [[nodiscard]] int times() const { return times_; }

    [[nodiscard]] std::thread::id thread() const { return thread_; }

  private:
    std::atomic<int> times_ = 0;
    std::thread::id thread_;
    std::promise<Reporter::Answer> answer_;
    std::future<Reporter::Answer> future_ = answer_.get_future();
};

/// A device that does not answer until it is released. Owns itself, like a real one.
struct Hanging {
    std::counting_semaphore<> release{0};
    std::counting_semaphore<> entered{0};

    Reporter::Look look(const std::shared_ptr<Hanging>& self) {
        return [self] {
            self->entered.release();
            self->release.acquire();
            return Report{7, 6, 5, {}};
        };
    }
};

TEST(Reporter, AnswersOnAThreadThatIsNotTheCallers) {
    const TemporaryDirectory device;
    Reporter reporter{Wearable{device.path(), 100, false}};

    Asked asked{reporter};

    EXPECT_EQ(std::get<Report>(asked.answer()).available, 100);
    EXPECT_NE(asked.thread(), std::this_thread::get_id());
}

TEST(Reporter, AnswersWithASentenceWhenTheDeviceIsGone) {
    const TemporaryDirectory device;
    Reporter reporter{Wearable{device.path() / "gone", {}, false}};

    EXPECT_THAT(std::get<std::string>(Asked{reporter}.answer()),
                ::testing::HasSubstr("cannot be reached"));
}

TEST(Reporter, AnswersWithASentenceWhenTheDeviceGoesInTheMiddleOfTheQuestion) {
    std::latch opened{1};
    std::latch removed{1};
    auto device = std::make_unique<TemporaryDirectory>();
    const Wearable wearable{device->path(), {}, false};
    Reporter reporter{[&, wearable] {
                          opened.count_down();
                          removed.wait();
                          return report(wearable);
                      },
                      forever};
    Asked asked{reporter};
    opened.wait();

    device.reset();
    removed.count_down();

    EXPECT_THAT(std::get<std::string>(asked.answer()), ::testing::HasSubstr("cannot be reached"));
}

TEST(Reporter, NeverAnswersWithAnEarlierLookAfterALaterOne) {
    struct Device {
        std::atomic<int> looks = 0;
        std::latch isLookedAt{1};
        std::counting_semaphore<> release{0};
    };

    const auto device = std::make_shared<Device>();
    Reporter reporter{[device] {
                          if (device->looks++ > 0) {
                              return Report{2, 2, 2, {}};
                          }
                          device->isLookedAt.count_down();
                          device->release.acquire();
                          return Report{1, 1, 1, {}};
                      },
                      forever};
    Asked first{reporter};
    device->isLookedAt.wait();

    Asked second{reporter};

    EXPECT_EQ(std::get<Report>(second.answer()).capacity, 2);
    EXPECT_EQ(std::get<Report>(first.answer()).capacity, 2);
    device->release.release();
}

TEST(Reporter, AnswersEveryQuestionInTimeThoughTheDeviceHangs) {
    const auto device = std::make_shared<Hanging>();
    Reporter reporter{device->look(device), 1ms};
    std::vector<std::unique_ptr<Asked>> many;
    for (int question = 0; question < 20; ++question) {
        many.push_back(std::make_unique<Asked>(reporter));
    }

    for (const auto& asked : many) {
        EXPECT_THAT(std::get<std::string>(asked->answer()),
                    ::testing::HasSubstr("does not answer"));
        EXPECT_EQ(asked->times(), 1);
    }
    device->release.release(20);
}

TEST(Reporter, SendsAtMostFourThreadsToADeviceThatHangsAndAnswersOnceItIsBack) {
    const auto device = std::make_shared<Hanging>();
    Reporter reporter{device->look(device), forever};
    std::vector<std::unique_ptr<Asked>> many;
    for (int question = 0; question < 8; ++question) {
        many.push_back(std::make_unique<Asked>(reporter));
    }
    for (int looker = 0; looker < 4; ++looker) {
        device->entered.acquire();
    }
    EXPECT_FALSE(device->entered.try_acquire());

    device->release.release(8);

    for (const auto& asked : many) {
        EXPECT_EQ(std::get<Report>(asked->answer()).capacity, 7);
    }
}

TEST(Reporter, ThatIsDestroyedWhileTheDeviceHangsAnswersExactlyOnceAndDoesNotWait) {
    const auto device = std::make_shared<Hanging>();
    auto reporter = std::make_unique<Reporter>(device->look(device), forever);
    Asked asked{*reporter};
    device->entered.acquire();

    reporter.reset();

    EXPECT_TRUE(std::holds_alternative<std::string>(asked.answer()));
    device->release.release();
    EXPECT_EQ(asked.times(), 1);
}

} // namespace
