#pragma once

#include "doubles/PreferencesDouble.h"
#include "doubles/ScreenDouble.h"
#include "doubles/WearableDouble.h"
#include "doubles/library/LibraryDouble.h"
#include "doubles/sessions/SessionServiceDouble.h"
#include "quorl-script/Trace.h"
#include "runtime/host/Host.h"

namespace quorl {

/// A wall clock that shows virtual time plus what a script adds to it.
class ScriptedClock {
  public:
    /// The time in nanoseconds; every reading moves the clock on by the tick, after the reading.
    [[nodiscard]] std::int64_t read();

    void moveBy(std::int64_t nanoseconds);

    void setTick(std::int64_t nanoseconds) { tick_ = nanoseconds; }

  private:
    std::int64_t offset_ = 0;
    std::int64_t tick_ = 0;
};

/// The services of a script. What the plug-in asks of them is traced. Main thread.
class ScriptedHost final : public Host {
  public:
    using Texts = std::map<std::string, std::string, std::less<>>;

    ScriptedHost();

    /// What a script settles.
    ScriptedPreferences preferences;
    std::optional<std::string> glance; ///< the title of the glance row, null for no such row
    Texts texts;                       ///< before those of the bundle's own table
    std::string language = "en";
    bool hasRawSizes = true;
    ScriptedClock clock;

    [[nodiscard]] const std::shared_ptr<Trace>& trace() const { return trace_; }

    [[nodiscard]] ScriptedLibrary& library() { return *library_; }

    [[nodiscard]] ScriptedSessions& sessionService() { return sessions_; }

    [[nodiscard]] ScriptedWearable& wearable() { return wearable_; }

    [[nodiscard]] LMSyncDefaults& syncDefaults() override { return *syncDefaults_; }

    [[nodiscard]] AnnouncingLibrary& mediaLibrary() override { return *library_; }

    [[nodiscard]] NSArray<DVSession> sessions(const std::string& type) override;
    [[nodiscard]] std::shared_ptr<WearableConnection>
    connectToWearable(dispatch_queue_t queue) override;

    [[nodiscard]] ScriptedScreen& screen() override { return screen_; }

    [[nodiscard]] std::shared_ptr<PSSpecifier>
    glanceSpecifier(const std::string& identifier) override;

    [[nodiscard]] NSNotificationCenter& notificationCenter() override { return *center_; }

    [[nodiscard]] double secondsSince1970() override;

    [[nodiscard]] std::vector<std::string> languages() override { return {language}; }

    [[nodiscard]] std::optional<std::string>
    textForKey(const StringTable& table, const std::string& key,
               const std::optional<std::string>& value) override;
    [[nodiscard]] std::string sizeText(float bytes) override;

  private:
    std::shared_ptr<Trace> trace_;
    std::shared_ptr<ScriptedLibrary> library_;
    std::shared_ptr<LMSyncDefaults> syncDefaults_;
    std::shared_ptr<NSNotificationCenter> center_;
    ScriptedSessions sessions_;
    ScriptedWearable wearable_;
    ScriptedScreen screen_;
};

} // namespace quorl
