#pragma once

#include "quorl/adapters/EngineLink.h"
#include "quorl/adapters/FoundWearables.h"
#include "quorl/adapters/LoginStart.h"
#include "quorl/adapters/MusicLibrary.h"
#include "quorl/adapters/PreferencesStore.h"
#include "quorl/adapters/TrialEngine.h"
#include "quorl/adapters/WearableUsage.h"
#include "quorl/app/Notices.h"
#include "quorl/app/Places.h"
#include "quorl/facts/PlaylistFacts.h"
#include "quorl/pages/PageServices.h"
#include "runtime/host/Host.h"
#include "runtime/host/Screen.h"

namespace quorl {

/// The services that this app gives to panes, and to its own pages. Main thread.
class CompanionHost final : public Host, public PageServices {
  public:
    /// `screen` and `notices` outlive the host.
    CompanionHost(const Places& places, Screen& screen, Notices& notices);

    /// `changed` is called after the engine, its sessions or the wearable have changed; empty for
    /// nobody.
    void setEngineObserver(std::function<void()> changed) { engineChanged_ = std::move(changed); }

    /// `refused` is called after a choice could not be stored, within the call that made it; empty
    /// for nobody.
    void setRefusalObserver(std::function<void()> refused) { refused_ = std::move(refused); }

    /// Starts the engine of a trial, where this is one. Where a trial has none, nothing is synced.
    void startTrialEngine();

    /// Whether a person sees the panes, and with them how the engine does, which then tells nothing
    /// on the desktop. `told` is called once it knows, or where it cannot; empty for nobody.
    void setSeen(bool isSeen, std::function<void()> told);

    /// Has the panes read the preferences as they are stored in this moment.
    void takePreferences() { store_.takeValues(); }

    /// Asks a person for a folder, beginning at `start`; calls `chosen` where one was chosen.
    using AskForFolder =
        std::function<void(const std::filesystem::path& start,
                           std::function<void(const std::filesystem::path& folder)> chosen)>;

    /// Who can ask a person for a folder; without it nobody is asked.
    void setFolderChooser(AskForFolder ask);

    /// Makes these the places of a trial, and follows what is chosen now.
    void takePlaces(const Places& places);

    /// Begins to read the music folder, and does so again when another one is chosen. `taken` is
    /// called after each reading.
    void openLibrary(std::function<void()> taken);

    /// Of the playlist in this row of the playlist chooser; nothing where that row shows another
    /// name, or is no playlist.
    [[nodiscard]] std::optional<PlaylistFacts> factsOfRow(std::size_t row,
                                                          const std::string& name) const;

    /// Whether the music folder has been read for the first time, the wearable has answered all
    /// that it was asked, and the sync engine has been heard of.
    [[nodiscard]] bool hasAllAnswers() const {
        return library_->isRead() && wearable_.isIdle() && isEngineHeardOf_;
    }

    [[nodiscard]] LMSyncDefaults& syncDefaults() override;
    [[nodiscard]] AnnouncingLibrary& mediaLibrary() override;
    [[nodiscard]] NSArray<DVSession> sessions(const std::string& type) override;
    [[nodiscard]] std::shared_ptr<WearableConnection>
    connectToWearable(dispatch_queue_t queue) override;
    [[nodiscard]] Screen& screen() override;
    [[nodiscard]] std::vector<std::string> languages() override;

    [[nodiscard]] const engine::EngineState& engineState() const override {
        return engine_.state();
    }

    void ask(EngineLink::Request request) override;

    void setOnCharger(bool isOnCharger) override { engine_.setOnCharger(isOnCharger); }

    [[nodiscard]] std::optional<bool> startsAtLogin() const override;
    void setStartAtLogin(bool starts) override;

    [[nodiscard]] std::optional<bool> hasDesktopNotices() const override;
    void setDesktopNotices(bool areOn) override;

    void findWearables(Finding finding) override;
    [[nodiscard]] WearableShelf wearables() const override;
    void chooseWearable(const std::filesystem::path& directory) override;
    void ejectWearable(const std::filesystem::path& directory) override;

    [[nodiscard]] bool canAskForFolder() const override { return askForFolder_ != nullptr; }

    void chooseOtherWearable() override;

  private:
    void noticeStore(const std::string& problem);
    void noticeProblems(const media::Inventory& inventory);
    void noticeEngine();
    void chooseMusicFolder();
    void engineDidChange(const engine::Event& event);
    void tellObserver() const;
    void followWearable();
    void placesDidChange();
    void readLibrary();

    const base::Purpose purpose_;
    const LoginStart loginStart_;
    Screen& screen_;
    Notices& notices_;
    std::function<void()> refused_;
    PreferencesStore store_;
    std::shared_ptr<SyncDefaults> syncDefaults_;
    std::shared_ptr<MusicLibrary> library_;
    std::function<void()> libraryTaken_;
    WearableUsage wearable_;
    /// The directory of that; empty for the embedded one.
    std::filesystem::path wearableDirectory_;
    std::optional<FoundWearables> found_; ///< nothing while nobody wants to know
    std::function<void()> engineChanged_;
    AskForFolder askForFolder_;
    bool isEngineHeardOf_ = false; ///< or of there being none
    bool wasEngineThere_ = false;
    std::optional<TrialEngine> trialEngine_; ///< nothing where this is no trial
    EngineLink engine_;
};

} // namespace quorl
