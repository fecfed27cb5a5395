#include "tests/support/TestHost.h"

#include "runtime/objects/MainQueue.h"

namespace quorl::tests {

void RecordingCenter::addObserver_selector_name_object(NSObject* observer,
                                                       NSNotificationSelector selector,
                                                       NSNotificationName name,
                                                       const NSObject* object) {
    journal_.note("observe " + std::string(name) + " " + std::string(selector.name()) +
                  (object ? " one" : " any"));
    NotificationCenter::addObserver_selector_name_object(observer, selector, name, object);
}

void RecordingCenter::removeObserver(const NSObject* observer) {
    journal_.note("leave");
    NotificationCenter::removeObserver(observer);
}

void RecordingCenter::postNotificationName_object(NSNotificationName name, NSObject* object) {
    journal_.note("post " + std::string(name));
    NotificationCenter::postNotificationName_object(name, object);
}

double TestClock::read() {
    if (readingsLeft_ && (*readingsLeft_)-- == 0) {
        readingsLeft_.reset();
        now_ += step_;
    }
    return now_;
}

void TestClock::advanceAfterReadings(int readings, double seconds) {
    readingsLeft_ = readings;
    step_ = seconds;
}

TestHost::TestHost()
    : defaults_(std::make_shared<RecordingDefaults>(preferences, journal)),
      library_(std::make_shared<TestLibrary>(journal)),
      center_(std::make_shared<RecordingCenter>(journal)) {
    (void)mainQueueDescriptor(); // before any thread is started
}

std::shared_ptr<TestHost> TestHost::installed() {
    auto host = std::make_shared<TestHost>();
    install(host);
    return host;
}

std::shared_ptr<TestSession> TestHost::addSession(const std::string& name) {
    const auto session = std::make_shared<TestSession>(name, journal);
    sessions_.push_back(session);
    return session;
}

NSArray<DVSession> TestHost::sessions(const std::string& type) {
    journal.note("sessions " + type);
    return std::make_shared<const std::vector<std::shared_ptr<DVSession>>>(sessions_);
}

std::shared_ptr<WearableConnection> TestHost::connectToWearable(dispatch_queue_t /*queue*/) {
    return wearable.connect();
}

std::shared_ptr<PSSpecifier> TestHost::glanceSpecifier(const std::string& identifier) {
    journal.note("glance " + identifier);
    return glance_;
}

std::optional<std::string> TestHost::textForKey(const StringTable& table, const std::string& key,
                                                const std::optional<std::string>& value) {
    journal.note("text " + key);
    const auto planned = texts_.find(key);
    return planned == texts_.end() ? Host::textForKey(table, key, value) : planned->second;
}

std::string TestHost::sizeText(float bytes) {
    journal.note("size " + std::to_string(static_cast<std::uint64_t>(bytes)));
    return Host::sizeText(bytes);
}

} // namespace quorl::tests
