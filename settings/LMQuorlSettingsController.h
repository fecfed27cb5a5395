#pragma once

#include "platform/HostApp.h"
#include "platform/WearableSettings.h"

/// The Music pane: which playlist goes to the wearable, how much of it, and what the sync is doing.
/// The host makes one with `init`, asks for its `specifiers` and shows it. Main thread only.
class LMQuorlSettingsController : public QPSNotificationAppController {
  public:
    ~LMQuorlSettingsController() override;

    [[nodiscard]] bool init() override;
    [[nodiscard]] std::string localizedPaneTitle() override;
    [[nodiscard]] std::shared_ptr<NSBundle> bundle() override;
    [[nodiscard]] std::optional<std::string> applicationBundleIdentifier() override;

    /// Two groups of one row each, below the row of the music app's glance where there is one.
    /// Built once.
    [[nodiscard]] NSArray<PSSpecifier> specifiers() override;

    void viewWillAppear(bool animated) override;
    void viewWillDisappear(bool animated) override;

    /// The getters of the two rows: the playlist's name or what its sync is doing, and the limit.
    [[nodiscard]] std::optional<std::string>
    playlistName(const std::shared_ptr<PSSpecifier>& specifier);
    [[nodiscard]] std::optional<std::string> limit(const std::shared_ptr<PSSpecifier>& specifier);

  private:
    void _syncStatusDidChangeNotification();
    void _scheduleDeferredUpdateUI();
    void _performDeferredUpdateUI();
    void _updateUI();

    // LMQuorlSettingsController+LimitFooter.cpp
    void _updateLimitFooterText();
    void _updateLimitFooterTextWithAvailableDeviceBytes();
    [[nodiscard]] bool _isAvailableDeviceBytesOutOfDate() const;
    [[nodiscard]] std::optional<std::string>
    _limitFooterSentence(NSInteger stage, NSUInteger songCount, std::uint64_t bytes) const;
    void _usageDidArrive(const NSDictionary<NSNumber>& usage);

    std::shared_ptr<PSSpecifier> _limitSpecifier;
    std::shared_ptr<PSSpecifier> _limitGroupSpecifier;
    std::shared_ptr<PSSpecifier> _playlistSpecifier;
    std::shared_ptr<LSSManager> _lssManager;
    std::shared_ptr<NSDate> _deviceBytesRemainingRetrievedDate;
    std::shared_ptr<NSNumber> _deviceBytesRemaining;
    bool _deferredUIUpdateScheduled = false;
};
