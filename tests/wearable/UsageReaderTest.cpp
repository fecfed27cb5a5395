// Questions to a wearable that may be slow, hang or go away.

#include "services/wearable/UsageReader.h"

#include <atomic>
#include <future>
#include <iostream>
#include <latch>
#include <semaphore>
#include <thread>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/resource.h>
#include <unistd.h>

#include "services/engine/Message.h"
#include "tests/base/TemporaryDirectory.h"

namespace {

using namespace quorl::wearable;
using namespace std::chrono_literals;
using quorl::tests::TemporaryDirectory;

/// What a person is told.
std::string sentenceOf(const UsageReader::Answer& answer) {
    return quorl::engine::sentence(std::get<Unseen>(answer).message);
}

constexpr auto forever = std::chrono::hours{1};

/// One question and its answer.
class Asked {
  public:
    explicit Asked(UsageReader& reader) {
        reader.ask([this](const UsageReader::Answer& answer) {
            ++times_;
            thread_ = std::this_thread::get_id();
            answer_.set_value(answer);
        });
    }

    UsageReader::Answer answer() { return future_.get(); }

    [[nodiscard]] int times() const { return times_; }

    [[nodiscard]] std::thread::id thread() const { return thread_; }

  private:
    std::atomic<int> times_ = 0;
    std::thread::id thread_;
    std::promise<UsageReader::Answer> answer_;
    std::future<UsageReader::Answer> future_ = answer_.get_future();
};

/// A device that does not answer until it is released. Owns itself, like a real one.
struct Hanging {
    std::counting_semaphore<> release{0};
    std::counting_semaphore<> entered{0};

    UsageReader::Look look(const std::shared_ptr<Hanging>& self) {
        return [self] {
            self->entered.release();
            self->release.acquire();
            return Usage{7, 6, 5, 1, {}};
        };
    }
};

TEST(UsageReader, AnswersOnAThreadThatIsNotTheCallers) {
    const TemporaryDirectory device;
    UsageReader reader{Wearable{device.path(), 100, false}};

    Asked asked{reader};

    EXPECT_EQ(std::get<Usage>(asked.answer()).available, 100);
    EXPECT_NE(asked.thread(), std::this_thread::get_id());
}

TEST(UsageReader, AnswersQuestionAfterQuestion) {
    UsageReader reader{[] { return Usage{7, 6, 5, 1, {}}; }, forever};
    for (int questions = 0; questions < 200; ++questions) {
        EXPECT_EQ(std::get<Usage>(Asked{reader}.answer()).songs, 5);
    }
}

/// In a process of its own, of an ordinary user, for whom alone threads run out.
[[noreturn]] void askWithoutThreads() {
    UsageReader reader{[] { return Usage{7, 6, 5, 1, {}}; }, forever};
    constexpr uid_t nobody = 65534;
    const rlimit none{1, 1};
    if ((geteuid() == 0 && setresuid(nobody, nobody, nobody) != 0) ||
        setrlimit(RLIMIT_NPROC, &none) != 0) {
        _exit(1);
    }
    std::cerr << sentenceOf(Asked{reader}.answer());
    _exit(0);
}

TEST(UsageReader, AnswersWithASentenceWhenNoThreadIsLeft) {
    EXPECT_EXIT(askWithoutThreads(), ::testing::ExitedWithCode(0),
                "no more threads can be started");
}

TEST(UsageReader, AnswersWithASentenceWhenTheDeviceIsGone) {
    const TemporaryDirectory device;
    UsageReader reader{Wearable{device.path() / "gone", {}, false}};

    EXPECT_THAT(sentenceOf(Asked{reader}.answer()), ::testing::HasSubstr("cannot be reached"));
}

TEST(UsageReader, AnswersWithASentenceWhenTheDeviceGoesInTheMiddleOfTheQuestion) {
    std::latch opened{1};
    std::latch removed{1};
    auto device = std::make_unique<TemporaryDirectory>();
    const Wearable wearable{device->path(), {}, false};
    UsageReader reader{[&, wearable] {
                           opened.count_down();
                           removed.wait();
                           return readUsage(wearable);
                       },
                       forever};
    Asked asked{reader};
    opened.wait();

    device.reset();
    removed.count_down();

    EXPECT_THAT(sentenceOf(asked.answer()), ::testing::HasSubstr("cannot be reached"));
}

TEST(UsageReader, NeverAnswersWithAnEarlierLookAfterALaterOne) {
    struct Device {
        std::atomic<int> looks = 0;
        std::latch isLookedAt{1};
        std::counting_semaphore<> release{0};
    };

    const auto device = std::make_shared<Device>();
    UsageReader reader{[device] {
                           if (device->looks++ > 0) {
                               return Usage{2, 2, 2, 1, {}};
                           }
                           device->isLookedAt.count_down();
                           device->release.acquire();
                           return Usage{1, 1, 1, 1, {}};
                       },
                       forever};
    Asked first{reader};
    device->isLookedAt.wait();

    Asked second{reader};

    EXPECT_EQ(std::get<Usage>(second.answer()).capacity, 2);
    EXPECT_EQ(std::get<Usage>(first.answer()).capacity, 2);
    device->release.release();
}

TEST(UsageReader, AnswersEveryQuestionInTimeThoughTheDeviceHangs) {
    const auto device = std::make_shared<Hanging>();
    UsageReader reader{device->look(device), 1ms};
    std::vector<std::unique_ptr<Asked>> many;
    for (int question = 0; question < 20; ++question) {
        many.push_back(std::make_unique<Asked>(reader));
    }

    for (const auto& asked : many) {
        EXPECT_THAT(sentenceOf(asked->answer()), ::testing::HasSubstr("does not answer"));
        EXPECT_EQ(asked->times(), 1);
    }
    device->release.release(20);
}

TEST(UsageReader, SendsAtMostFourThreadsToADeviceThatHangsAndAnswersOnceItIsBack) {
    const auto device = std::make_shared<Hanging>();
    UsageReader reader{device->look(device), forever};
    std::vector<std::unique_ptr<Asked>> many;
    for (int question = 0; question < 8; ++question) {
        many.push_back(std::make_unique<Asked>(reader));
    }
    for (int looker = 0; looker < 4; ++looker) {
        device->entered.acquire();
    }
    EXPECT_FALSE(device->entered.try_acquire());

    device->release.release(8);

    for (const auto& asked : many) {
        EXPECT_EQ(std::get<Usage>(asked->answer()).capacity, 7);
    }
}

TEST(UsageReader, ThatIsDestroyedWhileTheDeviceHangsAnswersExactlyOnceAndDoesNotWait) {
    const auto device = std::make_shared<Hanging>();
    auto reader = std::make_unique<UsageReader>(device->look(device), forever);
    Asked asked{*reader};
    device->entered.acquire();

    reader.reset();

    EXPECT_TRUE(std::holds_alternative<Unseen>(asked.answer()));
    device->release.release();
    EXPECT_EQ(asked.times(), 1);
}

} // namespace
