#include "services/wearable/UsageReader.h"

#include <condition_variable>
#include <cstdint>
#include <deque>
#include <mutex>
#include <system_error>
#include <thread>
#include <utility>

#include "services/base/Errand.h"
#include "services/wearable/Lookout.h"

namespace quorl::wearable {

namespace {

using Clock = std::chrono::steady_clock;

struct Question {
    std::uint64_t number;
    UsageReader::Reply reply;
    Clock::time_point deadline;
    bool isLookedAt = false;
};

struct Answered {
    UsageReader::Reply reply;
    UsageReader::Answer answer;
};

UsageReader::Answer answerOf(const UsageReader::Look& look) {
    try {
        return look();
    } catch (const CannotBeSeen& error) {
        return Unseen{error.message()};
    } catch (const std::exception& error) {
        return Unseen{{"other", {error.what()}}};
    }
}

Unseen silence() { return {{unseen::silent}, true}; }

Unseen noThreadLeft() { return {{unseen::noThreads}}; }

} // namespace

/// Shared by the reader and the threads that look, the last of which may outlive it. Only the
/// clerk, a thread that never touches the device, calls replies.
class UsageReader::Questions : public std::enable_shared_from_this<Questions> {
  public:
    Questions(Look look, std::chrono::milliseconds patience)
        : look_(std::move(look)), patience_(patience) {}

    void open() {
        clerk_ = std::thread{[this] { work(); }};
    }

    void close() {
        {
            const std::scoped_lock lock(mutex_);
            closed_ = true;
        }
        changed_.notify_one();
        clerk_.join();
    }

    void ask(Reply reply) {
        {
            const std::scoped_lock lock(mutex_);
            questions_.push_back({++lastNumber_, std::move(reply), Clock::now() + patience_});
        }
        changed_.notify_one();
    }

  private:
    static constexpr int mostLookers = 4;

    void work() {
        std::unique_lock lock(mutex_);
        while (!closed_ || !questions_.empty() || !answered_.empty()) {
            giveUpOnLateOnes();
            sendLookers();
            if (answered_.empty()) {
                await(lock);
                continue;
            }
            const auto [reply, answer] = std::move(answered_.front());
            answered_.pop_front();
            lock.unlock();
            reply(answer);
            lock.lock();
        }
    }

    void await(std::unique_lock<std::mutex>& lock) {
        if (closed_ && questions_.empty()) {
            return;
        }
        if (questions_.empty()) {
            changed_.wait(lock);
        } else {
            // A copy: the question may be answered, and gone, before the wait is over.
            const auto deadline = questions_.front().deadline;
            changed_.wait_until(lock, deadline);
        }
    }

    /// They are in the order of their deadlines.
    void giveUpOnLateOnes() {
        const auto now = Clock::now();
        while (!questions_.empty() && (closed_ || questions_.front().deadline <= now)) {
            answered_.push_back(
                {std::move(questions_.front().reply),
                 closed_ ? Unseen{{"other", {"The question was given up."}}} : silence()});
            questions_.pop_front();
        }
    }

    void sendLookers() {
        for (auto& question : questions_) {
            if (lookers_ == mostLookers) {
                return;
            }
            if (!std::exchange(question.isLookedAt, true) && !sendLooker(question.number)) {
                answerUpTo(question.number, noThreadLeft());
                return;
            }
        }
    }

    /// The thread keeps the questions, and with it `look_`, for as long as the device hangs.
    [[nodiscard]] bool sendLooker(std::uint64_t number) {
        try {
            std::thread([questions = shared_from_this(), number,
                         loose = std::make_shared<base::LooseThread>()] {
                questions->lookFor(number);
            }).detach();
            ++lookers_;
            return true;
        } catch (const std::system_error&) {
            return false;
        }
    }

    void lookFor(std::uint64_t number) {
        const auto answer = answerOf(look_);
        {
            const std::scoped_lock lock(mutex_);
            --lookers_;
            answerUpTo(number, answer);
        }
        changed_.notify_one();
    }

    /// Whoever asked before gets this answer too: an earlier look that ends later would tell what
    /// is no longer true.
    void answerUpTo(std::uint64_t number, const Answer& answer) {
        while (!questions_.empty() && questions_.front().number <= number) {
            answered_.push_back({std::move(questions_.front().reply), answer});
            questions_.pop_front();
        }
    }

    const Look look_;
    const std::chrono::milliseconds patience_;
    std::thread clerk_;

    std::mutex mutex_;
    std::condition_variable changed_;
    std::deque<Question> questions_;
    std::deque<Answered> answered_;
    std::uint64_t lastNumber_ = 0;
    int lookers_ = 0;
    bool closed_ = false;
};

UsageReader::UsageReader(const Wearable& wearable)
    : UsageReader{[lookout = std::make_shared<Lookout>(wearable)] { return lookout->look(); }} {}

UsageReader::UsageReader(Look look, std::chrono::milliseconds patience)
    : questions_(std::make_shared<Questions>(std::move(look), patience)) {
    questions_->open();
}

UsageReader::~UsageReader() { questions_->close(); }

void UsageReader::ask(Reply reply) { questions_->ask(std::move(reply)); }

} // namespace quorl::wearable
