#pragma once

#include <gmock/gmock.h>

#include "runtime/lists/NavigationController.h"
#include "settings/LMQuorlSettingsController.h"
#include "tests/support/TestHost.h"
#include "tests/support/VirtualRun.h"

namespace quorl::tests {

/// A test host for the plug-in alone: each text that is asked for comes with the English of the
/// plug-in's own table, or the test fails.
class PaneHost final : public TestHost {
  public:
    [[nodiscard]] static std::shared_ptr<PaneHost> installed();

    [[nodiscard]] std::optional<std::string>
    textForKey(const StringTable& table, const std::string& key,
               const std::optional<std::string>& value) override;
};

/// The Music pane on a test host, as its user meets it: with sync off, no session and one playlist
/// "Morning" (id 7, revision 1, no songs) in the library.
class PaneTest : public testing::Test {
  protected:
    PaneTest();

    /// Makes the root pane and shows it. No refresh is pending then, the wearable has been asked,
    /// and the journal is empty.
    void showPane();

    /// Taps the row of that title; the pane that it opens comes on top.
    void tap(const std::string& title);

    /// Draws what is on top and gives the value text that its row of that title shows.
    [[nodiscard]] std::optional<std::string> shownValue(const std::string& title);

    /// Draws what is on top and gives the footer that its group of that title shows.
    [[nodiscard]] std::optional<std::string> shownFooter(const std::string& title);

    void store(SyncPreference preference, std::optional<std::uint64_t> value) {
        (void)host_->preferences.setValue(preference, value);
    }

    /// Sync is on and "Morning" is chosen; it was never sent, so its sync is pending.
    void chooseMorning();

    /// "Morning" was sent as it is.
    void sendMorning();

    /// A session with a running asset task of these figures; announced.
    std::shared_ptr<TaskDouble> beginSync(NSUInteger total, double progress);

    /// A session with another running task; announced.
    void beginPreparation();

    /// The sessions have gone; announced.
    void endSync();

    void changeLibrary() { host_->mediaLibrary().contentsDidChange(); }

    /// The manager posts a status change, and its observers are told.
    void postStatus();

    static void post(NSNotificationName name) {
        NSNotificationCenter::defaultCenter().postNotificationName_object(name, nullptr);
    }

    std::shared_ptr<PaneHost> host_ = PaneHost::installed();
    std::shared_ptr<PlaylistDouble> morning_;
    std::shared_ptr<NavigationController> navigation_ = ::create<NavigationController>();
    std::shared_ptr<LMQuorlSettingsController> pane_;

  private:
    [[nodiscard]] std::shared_ptr<PSSpecifier> specifier(const std::string& title);
};

} // namespace quorl::tests
