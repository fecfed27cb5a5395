#include "services/base/Errand.h"

#include <atomic>
#include <condition_variable>
#include <cstdio>
#include <iostream>
#include <mutex>
#include <utility>

#include <unistd.h>

namespace quorl::base {

namespace {

std::atomic<int> looseThreads = 0;

} // namespace

/// Of the errand and its thread.
struct Errand::Shared {
    std::stop_source stop;
    std::mutex mutex;
    std::condition_variable ended;
    bool isAtEnd = false;

    void end() {
        const std::scoped_lock lock(mutex);
        isAtEnd = true;
        ended.notify_all();
    }

    [[nodiscard]] bool endsUntil(std::chrono::steady_clock::time_point deadline) {
        std::unique_lock lock(mutex);
        return ended.wait_until(lock, deadline, [this] { return isAtEnd; });
    }
};

Errand::Errand(Work work, std::chrono::milliseconds patience)
    : shared_(std::make_shared<Shared>()),
      patience_(patience),
      thread_([shared = shared_, work = std::move(work),
               loose = std::make_shared<LooseThread>()]() mutable {
          work(shared->stop.get_token());
          work = {};
          loose.reset();
          shared->end();
      }) {}

Errand::~Errand() {
    stop();
    if (shared_->endsUntil(deadline_)) {
        thread_.join();
    } else {
        thread_.detach();
    }
}

void Errand::stop() {
    if (!shared_->stop.stop_requested()) {
        deadline_ = std::chrono::steady_clock::now() + patience_;
        shared_->stop.request_stop();
    }
}

LooseThread::LooseThread() { ++looseThreads; }

LooseThread::~LooseThread() { --looseThreads; }

int endOfProgram(int code) {
    if (looseThreads > 0) {
        std::cout.flush();
        std::fflush(nullptr);
        _exit(code);
    }
    return code;
}

} // namespace quorl::base
