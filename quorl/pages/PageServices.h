#pragma once

#include <filesystem>
#include <optional>
#include <string>
#include <vector>

#include "quorl/adapters/EngineLink.h"
#include "services/finding/Offer.h"

namespace quorl {

/// The wearables that there are to choose from.
struct WearableShelf {
    /// False as long as they are looked for the first time.
    bool isComplete = false;
    std::vector<finding::Offer> offers = {};
    /// Which of the offers is chosen.
    std::optional<std::size_t> chosen = {};
    /// What the chosen one is called where it is none of them.
    std::string missing = {};
    /// Drives that were ejected, by name.
    std::vector<std::string> safeToRemove = {};
};

/// What the app's own pages need of the app. Main thread.
class PageServices {
  public:
    PageServices() = default;
    PageServices(const PageServices&) = delete;
    PageServices& operator=(const PageServices&) = delete;

    [[nodiscard]] virtual const engine::EngineState& engineState() const = 0;

    /// Asks the engine for something. Why it was not done becomes a notice.
    virtual void ask(EngineLink::Request request) = 0;

    /// Whether the embedded wearable is to be taken for one on its charger.
    virtual void setOnCharger(bool isOnCharger) = 0;

    /// Whether the engine is started when the person logs in; nothing in a trial, whose engine is
    /// not.
    [[nodiscard]] virtual std::optional<bool> startsAtLogin() const = 0;

    /// Why it was not done becomes a notice.
    virtual void setStartAtLogin(bool starts) = 0;

    /// Whether the engine tells of syncs on the desktop; nothing in a trial, where it never does.
    [[nodiscard]] virtual std::optional<bool> hasDesktopNotices() const = 0;

    /// Why it was not done becomes a notice.
    virtual void setDesktopNotices(bool areOn) = 0;

    enum class Finding { Over, Wanted };

    /// Whether wearables are to be looked for, which goes on until it is over.
    virtual void findWearables(Finding finding) = 0;

    [[nodiscard]] virtual WearableShelf wearables() const = 0;

    /// Chooses the wearable in this directory for good; empty for the embedded one. Why that was
    /// not done becomes a notice, as with the next two.
    virtual void chooseWearable(const std::filesystem::path& directory) = 0;

    /// Ejects the drive of what is offered in this directory, unless a sync is under way.
    virtual void ejectWearable(const std::filesystem::path& directory) = 0;

    /// Whether a person can be asked for a folder.
    [[nodiscard]] virtual bool canAskForFolder() const = 0;

    /// Asks for the directory of a wearable, and chooses it for good.
    virtual void chooseOtherWearable() = 0;

  protected:
    ~PageServices() = default;
};

} // namespace quorl
