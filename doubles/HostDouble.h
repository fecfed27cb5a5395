#pragma once

#include "doubles/ClockDouble.h"
#include "doubles/NotificationCenterDouble.h"
#include "doubles/PreferencesDouble.h"
#include "doubles/ScreenDouble.h"
#include "doubles/SyncDefaultsDouble.h"
#include "doubles/WearableDouble.h"
#include "doubles/library/LibraryDouble.h"
#include "doubles/sessions/SessionServiceDouble.h"
#include "runtime/host/Host.h"

namespace quorl {

/// A host without a device and without a window: what its services say can be set, and a
/// recorder is told what the plug-in asks of them. Main thread.
class HostDouble : public Host {
  public:
    using Texts = std::map<std::string, std::string, std::less<>>;

    enum class SizeTexts {
        Raw,     ///< the bytes as an integer, then " B"
        Platform ///< what a person reads
    };

    /// Virtual time tells `recorder`, too, until another host double is made.
    explicit HostDouble(std::shared_ptr<CallRecorder> recorder = std::make_shared<CallRecorder>());

    PreferencesDouble preferences;
    SessionServiceDouble sessionService;
    WearableDouble wearable;
    ClockDouble clock;
    std::shared_ptr<PSSpecifier> glance; ///< null for no such row
    Texts texts;                         ///< before those of the bundle's own table
    SizeTexts sizeTexts = SizeTexts::Raw;

    /// At first "en".
    void setLanguages(std::vector<std::string> languages) { languages_ = std::move(languages); }

    [[nodiscard]] LMSyncDefaults& syncDefaults() override { return *syncDefaults_; }

    [[nodiscard]] LibraryDouble& mediaLibrary() override { return *library_; }

    [[nodiscard]] NSArray<DVSession> sessions(const std::string& type) override;
    [[nodiscard]] std::shared_ptr<WearableConnection>
    connectToWearable(dispatch_queue_t queue) override;

    [[nodiscard]] ScreenDouble& screen() override { return screen_; }

    [[nodiscard]] std::shared_ptr<PSSpecifier>
    glanceSpecifier(const std::string& identifier) override;

    [[nodiscard]] NSNotificationCenter& notificationCenter() override { return *center_; }

    [[nodiscard]] double secondsSince1970() override;

    [[nodiscard]] std::vector<std::string> languages() override { return languages_; }

    [[nodiscard]] std::optional<std::string>
    textForKey(const StringTable& table, const std::string& key,
               const std::optional<std::string>& value) override;
    [[nodiscard]] std::string sizeText(float bytes) override;

  private:
    std::shared_ptr<CallRecorder> recorder_;
    std::shared_ptr<LibraryDouble> library_;
    std::shared_ptr<SyncDefaultsDouble> syncDefaults_;
    std::shared_ptr<NotificationCenterDouble> center_;
    ScreenDouble screen_;
    std::vector<std::string> languages_{"en"};
};

} // namespace quorl
