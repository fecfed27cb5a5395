#pragma once

#include "runtime/host/Host.h"
#include "runtime/objects/NotificationCenter.h"
#include "tests/support/Journal.h"
#include "tests/support/TestLibrary.h"
#include "tests/support/TestPreferences.h"
#include "tests/support/TestScreen.h"
#include "tests/support/TestSessions.h"
#include "tests/support/TestWearable.h"

namespace quorl::tests {

/// The runtime's centre, with the lines "observe NAME SELECTOR any" (or "one", for one sender
/// only), "leave" and "post NAME".
class RecordingCenter final : public NotificationCenter {
  public:
    explicit RecordingCenter(Journal& journal) : journal_(journal) {}

    void addObserver_selector_name_object(NSObject* observer, NSNotificationSelector selector,
                                          NSNotificationName name, const NSObject* object) override;
    void removeObserver(const NSObject* observer) override;
    void postNotificationName_object(NSNotificationName name, NSObject* object) override;

  private:
    Journal& journal_;
};

/// A wall clock that stands still until it is moved.
class TestClock {
  public:
    [[nodiscard]] double read();

    void advance(double seconds) { now_ += seconds; }

    /// After so many more readings the clock moves on by `seconds`.
    void advanceAfterReadings(int readings, double seconds);

  private:
    double now_ = 1'700'000'000;
    std::optional<int> readingsLeft_;
    double step_ = 0;
};

/// A host of which everything is told and seen. The process-wide objects of the plug-in keep to the
/// host that was there when they were made, so each test runs in a process of its own, as ctest
/// does it. Besides its parts' lines it notes "sessions TYPE", "glance IDENTIFIER", "text KEY" and
/// "size BYTES".
class TestHost final : public Host {
  public:
    TestHost();

    /// Makes one and installs it.
    static std::shared_ptr<TestHost> installed();

    /// A new session among those that there are; nobody is told.
    std::shared_ptr<TestSession> addSession(const std::string& name);

    /// Takes all sessions away; nobody is told.
    void removeSessions() { sessions_.clear(); }

    void setLanguages(std::vector<std::string> languages) { languages_ = std::move(languages); }

    void setGlance(std::shared_ptr<PSSpecifier> glance) { glance_ = std::move(glance); }

    /// What a key's text is from now on, whatever the string tables say.
    void setText(const std::string& key, const std::string& text) { texts_[key] = text; }

    [[nodiscard]] LMSyncDefaults& syncDefaults() override { return *defaults_; }

    [[nodiscard]] TestLibrary& mediaLibrary() override { return *library_; }

    [[nodiscard]] NSArray<DVSession> sessions(const std::string& type) override;
    [[nodiscard]] std::shared_ptr<WearableConnection>
    connectToWearable(dispatch_queue_t queue) override;

    [[nodiscard]] TestScreen& screen() override { return screen_; }

    [[nodiscard]] std::shared_ptr<PSSpecifier>
    glanceSpecifier(const std::string& identifier) override;

    [[nodiscard]] NSNotificationCenter& notificationCenter() override { return *center_; }

    [[nodiscard]] double secondsSince1970() override { return clock.read(); }

    [[nodiscard]] std::vector<std::string> languages() override { return languages_; }

    [[nodiscard]] std::optional<std::string>
    textForKey(const StringTable& table, const std::string& key,
               const std::optional<std::string>& value) override;
    [[nodiscard]] std::string sizeText(float bytes) override;

    Journal journal;
    TestPreferencesStore preferences;
    TestWearable wearable{journal};
    TestClock clock;

  private:
    TestScreen screen_{journal};
    std::shared_ptr<RecordingDefaults> defaults_;
    std::shared_ptr<TestLibrary> library_;
    std::shared_ptr<RecordingCenter> center_;
    std::vector<std::shared_ptr<DVSession>> sessions_;
    std::vector<std::string> languages_{"en"};
    std::shared_ptr<PSSpecifier> glance_;
    std::map<std::string, std::string> texts_;
};

} // namespace quorl::tests
