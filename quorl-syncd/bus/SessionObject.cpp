#include "quorl-syncd/bus/SessionObject.h"

#include <algorithm>

#include <Session-adaptor.h>
#include <Task-adaptor.h>

#include "quorl-syncd/bus/Published.h"
#include "services/base/Utf8.h"

namespace quorl::syncd {

namespace {

using Clock = std::chrono::steady_clock;

std::uint64_t microsecondsNow() {
    const auto now = std::chrono::system_clock::now().time_since_epoch();
    return static_cast<std::uint64_t>(
        std::chrono::duration_cast<std::chrono::microseconds>(now).count());
}

std::string pathOf(std::uint64_t session) {
    return std::string(engine::sessionsPath) + "/" + std::to_string(session);
}

/// Below 1 until everything is done, for there is something to do after the last byte.
engine::Fraction fractionOf(const CopyProgress& progress) {
    return engine::Fraction(static_cast<double>(progress.bytes) /
                            (static_cast<double>(progress.totalBytes) + 1.0));
}

/// Tells that an object leaves the bus, which may be gone itself.
template <class Tell>
void leave(Tell tell) {
    try {
        tell();
    } catch (const sdbus::Error&) {
        // The loop notices too, and ends the engine.
    }
}

} // namespace

class SessionObject::Session final
    : public sdbus::AdaptorInterfaces<org::quorl::Velora::Sync::Session_adaptor,
                                      sdbus::Properties_adaptor, sdbus::ManagedObject_adaptor> {
  public:
    Session(sdbus::IConnection& bus, const std::string& path, std::function<void()> cancel)
        : AdaptorInterfaces(bus, path),
          cancel_(std::move(cancel)),
          published_({.typeIdentifier = engine::deviceSyncType,
                      .operation = "velora-sync",
                      .startTime = microsecondsNow(),
                      .isCancelable = true}) {
        registerAdaptor();
        emitInterfacesAddedSignal({engine::sessionInterface});
    }

    ~Session() {
        leave([this] { emitInterfacesRemovedSignal({engine::sessionInterface}); });
        unregisterAdaptor();
    }

    void copied(const CopyProgress& progress) {
        if (!published_->isProgressValid) {
            begun_ = Clock::now();
            bytesAtBegin_ = progress.bytes;
        }
        const std::chrono::duration<double> elapsed = Clock::now() - begun_;
        auto now = *published_;
        now.isProgressValid = true;
        now.bytes = progress.totalBytes;
        now.rate = static_cast<std::uint64_t>(static_cast<double>(progress.bytes - bytesAtBegin_) /
                                              std::max(elapsed.count(), 0.001));
        now.progress = fractionOf(progress);
        now.currentItem = progress.song;
        published_.change(*this, now);
    }

    void finish(bool success, const std::string& message) {
        auto now = *published_;
        now.isFinished = true;
        now.isCancelable = false;
        now.currentItem.clear();
        now.progress = success ? engine::Fraction(1) : now.progress;
        published_.change(*this, now);
        emitCompleted(success, base::validUtf8(message));
    }

  private:
    std::string TypeIdentifier() override { return engine::valueOf<"TypeIdentifier">(*published_); }

    bool Finished() override { return engine::valueOf<"Finished">(*published_); }

    std::string Operation() override { return engine::valueOf<"Operation">(*published_); }

    std::string CurrentItem() override { return engine::valueOf<"CurrentItem">(*published_); }

    double Progress() override { return engine::valueOf<"Progress">(*published_); }

    bool ProgressValid() override { return engine::valueOf<"ProgressValid">(*published_); }

    std::uint64_t Bytes() override { return engine::valueOf<"Bytes">(*published_); }

    std::uint64_t Rate() override { return engine::valueOf<"Rate">(*published_); }

    std::uint64_t StartTime() override { return engine::valueOf<"StartTime">(*published_); }

    bool Cancelable() override { return engine::valueOf<"Cancelable">(*published_); }

    void Cancel(const std::map<std::string, sdbus::Variant>& /*options*/) override { cancel_(); }

    const std::function<void()> cancel_;
    Clock::time_point begun_;
    std::uint64_t bytesAtBegin_ = 0;
    Published<engine::SessionState> published_;
};

class SessionObject::Task final
    : public sdbus::AdaptorInterfaces<org::quorl::Velora::Sync::Task_adaptor,
                                      sdbus::Properties_adaptor, sdbus::ManagedObject_adaptor> {
  public:
    Task(sdbus::IConnection& bus, const std::string& session, const std::string& name,
         const std::string& groupingKey)
        : AdaptorInterfaces(bus, session + "/Tasks/" + name),
          published_({.session = sdbus::ObjectPath(session), .groupingKey = groupingKey}) {
        registerAdaptor();
        emitInterfacesAddedSignal({engine::taskInterface});
    }

    ~Task() {
        leave([this] { emitInterfacesRemovedSignal({engine::taskInterface}); });
        unregisterAdaptor();
    }

    [[nodiscard]] bool isRunning() const { return published_->isRunning; }

    /// `progress` is what is told of it as soon as it runs.
    void begin(const CopyProgress& progress) {
        emitWillBegin();
        auto now = with(progress);
        now.isRunning = true;
        published_.change(*this, now);
        emitDidBegin();
    }

    void copied(const CopyProgress& progress) { published_.change(*this, with(progress)); }

    void finish(bool success, const std::string& message) {
        auto now = *published_;
        now.isRunning = false;
        now.progress = success ? engine::Fraction(1) : now.progress;
        published_.change(*this, now);
        emitCompleted(success, base::validUtf8(message));
    }

  private:
    [[nodiscard]] engine::TaskState with(const CopyProgress& progress) const {
        auto state = *published_;
        state.totalItemCount = progress.totalSongs;
        state.completedItemCount = progress.songs;
        state.progress = fractionOf(progress);
        return state;
    }

    sdbus::ObjectPath Session() override { return engine::valueOf<"Session">(*published_); }

    std::string GroupingKey() override { return engine::valueOf<"GroupingKey">(*published_); }

    bool Running() override { return engine::valueOf<"Running">(*published_); }

    std::uint64_t TotalItemCount() override {
        return engine::valueOf<"TotalItemCount">(*published_);
    }

    std::uint64_t CompletedItemCount() override {
        return engine::valueOf<"CompletedItemCount">(*published_);
    }

    double Progress() override { return engine::valueOf<"Progress">(*published_); }

    Published<engine::TaskState> published_;
};

SessionObject::SessionObject(sdbus::IConnection& bus, std::uint64_t number,
                             std::function<void()> cancel)
    : session_(std::make_unique<Session>(bus, pathOf(number), std::move(cancel))),
      preparing_(std::make_unique<Task>(bus, pathOf(number), "1", engine::preparingGroupingKey)),
      copying_(std::make_unique<Task>(bus, pathOf(number), "2", engine::assetGroupingKey)) {
    preparing_->begin({});
}

SessionObject::~SessionObject() = default;

void SessionObject::copied(const CopyProgress& progress) {
    session_->copied(progress);
    if (!preparing_->isRunning()) {
        copying_->copied(progress);
        return;
    }
    // In this order something is running at every moment.
    copying_->begin(progress);
    preparing_->finish(true, "Prepared.");
}

void SessionObject::finish(bool success, const std::string& message) {
    for (const auto* task : {&preparing_, &copying_}) {
        if ((*task)->isRunning()) {
            (*task)->finish(success, message);
        }
    }
    session_->finish(success, message);
}

} // namespace quorl::syncd
