#include "quorl-syncd/bus/SessionObject.h"

#include <algorithm>

#include <Session-adaptor.h>
#include <Task-adaptor.h>

#include "services/engine/Names.h"

namespace quorl::syncd {

namespace {

using Clock = std::chrono::steady_clock;

std::uint64_t microsecondsNow() {
    const auto now = std::chrono::system_clock::now().time_since_epoch();
    return static_cast<std::uint64_t>(
        std::chrono::duration_cast<std::chrono::microseconds>(now).count());
}

std::string pathOf(std::uint64_t session) {
    return std::string{engine::sessionsPath} + "/" + std::to_string(session);
}

/// Below 1 until everything is done, for there is something to do after the last byte.
double fractionOf(const CopyProgress& progress) {
    return static_cast<double>(progress.bytes) / (static_cast<double>(progress.totalBytes) + 1.0);
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
        : AdaptorInterfaces{bus, path}, cancel_{std::move(cancel)} {
        registerAdaptor();
        emitInterfacesAddedSignal({engine::sessionInterface});
    }

    ~Session() {
        leave([this] { emitInterfacesRemovedSignal({engine::sessionInterface}); });
        unregisterAdaptor();
    }

    void copied(const CopyProgress& progress) {
        if (!isKnown_) {
            isKnown_ = true;
            bytes_ = progress.totalBytes;
            begun_ = Clock::now();
            emitPropertiesChangedSignal(engine::sessionInterface, {"ProgressValid", "Bytes"});
        }
        const std::chrono::duration<double> elapsed = Clock::now() - begun_;
        rate_ = static_cast<std::uint64_t>(static_cast<double>(progress.bytes) /
                                           std::max(elapsed.count(), 0.001));
        progress_ = fractionOf(progress);
        emitPropertiesChangedSignal(engine::sessionInterface, {"Progress", "Rate"});
    }

    void finish(bool success, const std::string& message) {
        isFinished_ = true;
        if (success) {
            progress_ = 1.0;
        }
        emitPropertiesChangedSignal(engine::sessionInterface,
                                    {"Finished", "Progress", "Cancelable"});
        emitCompleted(success, message);
    }

  private:
    std::string TypeIdentifier() override { return engine::deviceSyncType; }

    bool Finished() override { return isFinished_; }

    std::string Operation() override { return "velora-sync"; }

    double Progress() override { return progress_; }

    bool ProgressValid() override { return isKnown_; }

    std::uint64_t Bytes() override { return bytes_; }

    std::uint64_t Rate() override { return rate_; }

    std::uint64_t StartTime() override { return startTime_; }

    bool Cancelable() override { return !isFinished_; }

    void Cancel(const std::map<std::string, sdbus::Variant>& /*options*/) override { cancel_(); }

    const std::function<void()> cancel_;
    const std::uint64_t startTime_ = microsecondsNow();
    Clock::time_point begun_;
    bool isKnown_ = false;
    bool isFinished_ = false;
    std::uint64_t bytes_ = 0;
    std::uint64_t rate_ = 0;
    double progress_ = 0.0;
};

class SessionObject::Task final
    : public sdbus::AdaptorInterfaces<org::quorl::Velora::Sync::Task_adaptor,
                                      sdbus::Properties_adaptor, sdbus::ManagedObject_adaptor> {
  public:
    Task(sdbus::IConnection& bus, const std::string& session, const std::string& name,
         std::string groupingKey)
        : AdaptorInterfaces{bus, session + "/Tasks/" + name},
          session_{session},
          groupingKey_{std::move(groupingKey)} {
        registerAdaptor();
        emitInterfacesAddedSignal({engine::taskInterface});
    }

    ~Task() {
        leave([this] { emitInterfacesRemovedSignal({engine::taskInterface}); });
        unregisterAdaptor();
    }

    [[nodiscard]] bool isRunning() const { return isRunning_; }

    void begin() {
        emitWillBegin();
        isRunning_ = true;
        emitPropertiesChangedSignal(engine::taskInterface,
                                    {"Running", "TotalItemCount", "CompletedItemCount"});
        emitDidBegin();
    }

    void copied(const CopyProgress& progress) {
        copied_ = progress;
        progress_ = fractionOf(progress);
        if (isRunning_) {
            emitPropertiesChangedSignal(engine::taskInterface,
                                        {"Progress", "TotalItemCount", "CompletedItemCount"});
        }
    }

    void finish(bool success, const std::string& message) {
        isRunning_ = false;
        if (success) {
            progress_ = 1.0;
        }
        emitPropertiesChangedSignal(engine::taskInterface, {"Running", "Progress"});
        emitCompleted(success, message);
    }

  private:
    sdbus::ObjectPath Session() override { return session_; }

    std::string GroupingKey() override { return groupingKey_; }

    bool Running() override { return isRunning_; }

    std::uint64_t TotalItemCount() override { return copied_.totalSongs; }

    std::uint64_t CompletedItemCount() override { return copied_.songs; }

    double Progress() override { return progress_; }

    const sdbus::ObjectPath session_;
    const std::string groupingKey_;
    bool isRunning_ = false;
    CopyProgress copied_;
    double progress_ = 0.0;
};

SessionObject::SessionObject(sdbus::IConnection& bus, std::uint64_t number,
                             std::function<void()> cancel)
    : session_{std::make_unique<Session>(bus, pathOf(number), std::move(cancel))},
      preparing_{std::make_unique<Task>(bus, pathOf(number), "1", engine::preparingGroupingKey)},
      copying_{std::make_unique<Task>(bus, pathOf(number), "2", engine::assetGroupingKey)} {
    preparing_->begin();
}

SessionObject::~SessionObject() = default;

void SessionObject::copied(const CopyProgress& progress) {
    session_->copied(progress);
    copying_->copied(progress);
    if (preparing_->isRunning()) {
        // In this order something is running at every moment.
        copying_->begin();
        preparing_->finish(true, "Prepared.");
    }
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
