#include "tests/engine/client/WatchedEngine.h"

#include "services/engine/Names.h"

namespace quorl::syncd::testing {

WatchedEngine::WatchedEngine()
    : connection_(sdbus::createSessionBusConnection()),
      object_(sdbus::createObject(*connection_, engine::enginePath)) {
    for (const auto* method : {"Watch", "Unwatch"}) {
        object_->registerMethod(method)
            .onInterface(engine::engineInterface)
            .implementedAs([this, method] { note(method); });
    }
    object_->finishRegistration();
    connection_->addObjectManager(engine::managerPath, sdbus::floating_slot);
    connection_->requestName(engine::busName);
    connection_->enterEventLoopAsync();
}

WatchedEngine::~WatchedEngine() { connection_->leaveEventLoop(); }

void WatchedEngine::note(const char* method) {
    const std::scoped_lock lock(mutex_);
    calls_.emplace_back(method);
    caller_ = object_->getCurrentlyProcessedMessage()->getSender();
    more_.notify_all();
}

std::string WatchedEngine::nextCall() {
    std::unique_lock lock(mutex_);
    more_.wait(lock, [this] { return read_ < calls_.size(); });
    return calls_[read_++];
}

pid_t WatchedEngine::caller() {
    const std::scoped_lock lock(mutex_);
    std::uint32_t process = 0;
    const auto other = sdbus::createSessionBusConnection();
    sdbus::createProxy(*other, "org.freedesktop.DBus", "/org/freedesktop/DBus")
        ->callMethod("GetConnectionUnixProcessID")
        .onInterface("org.freedesktop.DBus")
        .withArguments(caller_)
        .storeResultsTo(process);
    return static_cast<pid_t>(process);
}

} // namespace quorl::syncd::testing
