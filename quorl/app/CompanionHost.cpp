#include "quorl/app/CompanionHost.h"

#include <algorithm>

#include <glib.h>

#include "quorl/facts/EngineTrouble.h"
#include "quorl/facts/FolderTrouble.h"
#include "quorl/facts/OfferedPlaylists.h"
#include "services/engine/RunningSession.h"
#include "services/language/Languages.h"
#include "services/language/Translated.h"
#include "services/preferences/ChosenPlaces.h"

namespace quorl {

using language::translated;

namespace {

wearable::Wearable wearableAt(const std::filesystem::path& directory, base::Purpose purpose) {
    return directory.empty() ? wearable::Wearable::embedded(purpose)
                             : wearable::Wearable{directory, {}, false};
}

/// The music folder of a trial.
std::filesystem::path musicOf(const Places& places) {
    return places.music.empty() ? preferences::chosenMusicFolder() : places.music;
}

} // namespace

CompanionHost::CompanionHost(const Places& places, Screen& screen, Notices& notices)
    : purpose_(places.purpose()),
      screen_(screen),
      notices_(notices),
      store_(purpose_, [this](const std::string& problem) { noticeStore(problem); },
             {[this] { placesDidChange(); }, [this] { tellObserver(); }}),
      syncDefaults_(std::make_shared<SyncDefaults>(store_)),
      library_(std::make_shared<MusicLibrary>()),
      wearable_(wearableAt(places.wearable, purpose_)),
      wearableDirectory_(places.wearable),
      engine_(purpose_, [this](const engine::Event& event) { engineDidChange(event); }) {
    if (purpose_ == base::Purpose::Use) {
        library_->keepIn(std::filesystem::path(g_get_user_cache_dir()) / "quorl" / "music-folder");
    }
    takePlaces(places);
}

void CompanionHost::takePlaces(const Places& places) {
    if (purpose_ == base::Purpose::Trial) {
        store_.choosePlaces(musicOf(places), places.wearable);
    }
    placesDidChange();
}

void CompanionHost::noticeStore(const std::string& problem) {
    notices_.set(Notices::Topic::Preferences, problem);
    if (!problem.empty() && refused_) {
        refused_();
    }
}

void CompanionHost::startTrialEngine() {
    if (purpose_ == base::Purpose::Trial) {
        trialEngine_.emplace([this](const std::string& problem) {
            notices_.set(Notices::Topic::TrialEngine, problem);
        });
    }
}

/// Another music folder or wearable was chosen, mostly by another program.
void CompanionHost::placesDidChange() {
    followWearable();
    tellObserver();
    if (libraryTaken_) {
        readLibrary();
    }
}

void CompanionHost::engineDidChange(const engine::Event& event) {
    isEngineHeardOf_ = true;
    const bool isBusGone = event.kind == engine::Event::Kind::BusDidVanish;
    notices_.set(Notices::Topic::SessionBus, isBusGone ? event.message : "");
    if (isBusGone) {
        notices_.set(Notices::Topic::Engine, "");
    } else {
        noticeEngine();
    }
    followWearable();
    tellObserver();
}

void CompanionHost::tellObserver() const {
    if (engineChanged_) {
        engineChanged_();
    }
}

/// The engine knows where the chosen drive is mounted now; without it, where it was chosen.
void CompanionHost::followWearable() {
    const auto& now = engine_.state().wearable;
    const std::filesystem::path ofEngine = now.isEmbedded ? std::string() : now.directory;
    const auto directory = engine_.state().isThere ? ofEngine : store_.wearableDirectory();
    if (directory != wearableDirectory_) {
        wearableDirectory_ = directory;
        wearable_.setWearable(wearableAt(directory, purpose_));
    }
}

/// That of a trial is started with it, and says itself where it cannot start.
void CompanionHost::noticeEngine() {
    wasEngineThere_ = wasEngineThere_ || engine_.state().isThere;
    const bool isStarting = purpose_ == base::Purpose::Trial && !wasEngineThere_;
    const auto trouble = troubleIn(engine_.state());
    if (!trouble || isStarting) {
        notices_.set(Notices::Topic::Engine, "");
        return;
    }
    const auto remedy = trouble->remedy;
    notices_.set(Notices::Topic::Engine,
                 {trouble->sentence, nameOf(remedy), [this, remedy] { ask(requestOf(remedy)); }});
}

void CompanionHost::ask(EngineLink::Request request) {
    engine_.ask(request, [this](const std::string& problem) {
        notices_.set(Notices::Topic::Request, problem);
    });
}

std::optional<bool> CompanionHost::startsAtLogin() const {
    return purpose_ == base::Purpose::Use ? std::optional(loginStart_.isOn()) : std::nullopt;
}

void CompanionHost::setStartAtLogin(bool starts) {
    notices_.set(Notices::Topic::Request, loginStart_.set(starts));
}

void CompanionHost::setSeen(bool isSeen, std::function<void()> told) {
    engine_.setWatching(isSeen, [told = std::move(told)](const std::string& /*problem*/) {
        if (told) {
            told();
        }
    });
}

std::optional<bool> CompanionHost::hasDesktopNotices() const {
    return purpose_ == base::Purpose::Use ? std::optional(store_.hasNotices()) : std::nullopt;
}

void CompanionHost::setDesktopNotices(bool areOn) { store_.setNotices(areOn); }

void CompanionHost::setFolderChooser(AskForFolder ask) { askForFolder_ = std::move(ask); }

void CompanionHost::chooseMusicFolder() {
    askForFolder_(store_.musicFolder(), [this](const std::filesystem::path& folder) {
        store_.chooseMusicFolder(folder);
        placesDidChange(); // the store announces the changes of others only
    });
}

void CompanionHost::findWearables(Finding finding) {
    if (finding == Finding::Wanted && !found_) {
        found_.emplace([this] { tellObserver(); });
    } else if (finding == Finding::Over && found_ && !found_->isEjecting()) {
        found_.reset();
    }
}

WearableShelf CompanionHost::wearables() const {
    if (!found_ || !found_->found()) {
        return {};
    }
    const auto& now = *found_->found();
    const auto chosen = finding::chosenIn(store_.wearableDirectory(), store_.wearableIdentity());
    const auto* const offer = finding::chosenOf(now.offers, chosen, now.surroundings);
    WearableShelf shelf{true, now.offers, {}, {}, found_->safeToRemove()};
    if (offer != nullptr) {
        shelf.chosen = static_cast<std::size_t>(offer - now.offers.data());
    } else {
        shelf.missing = chosen.directory.filename().string();
    }
    return shelf;
}

void CompanionHost::chooseWearable(const std::filesystem::path& directory) {
    engine_.chooseWearable(directory, [this](const std::string& problem) {
        notices_.set(Notices::Topic::Request, problem);
    });
}

void CompanionHost::ejectWearable(const std::filesystem::path& directory) {
    if (engine::runningSession(engine_.state())) {
        notices_.set(Notices::Topic::Request,
                     translated("Music is being synced. Stop that or wait for its end, then eject "
                                "the drive."));
        return;
    }
    const auto offers = wearables().offers;
    const auto offer = std::ranges::find(offers, directory, &finding::Offer::directory);
    if (offer != offers.end()) {
        found_->eject(*offer, [this](const std::string& problem) {
            notices_.set(Notices::Topic::Request, problem);
        });
    }
}

void CompanionHost::chooseOtherWearable() {
    askForFolder_(wearableDirectory_,
                  [this](const std::filesystem::path& folder) { chooseWearable(folder); });
}

void CompanionHost::openLibrary(std::function<void()> taken) {
    libraryTaken_ = std::move(taken);
    readLibrary();
}

std::optional<PlaylistFacts> CompanionHost::factsOfRow(std::size_t row,
                                                       const std::string& name) const {
    const auto& inventory = library_->inventory();
    const auto offered = inventory ? offeredIn(*inventory) : std::vector<const media::Playlist*>();
    if (row >= offered.size() || offered[row]->name != name) {
        return std::nullopt;
    }
    const auto limit =
        preferences::limitOf(store_.value(SyncPreference::AssetSyncLimitType).value_or(0),
                             store_.value(SyncPreference::AssetSyncLimit).value_or(0));
    return factsOf(*inventory, *offered[row], limit);
}

void CompanionHost::readLibrary() {
    library_->open(store_.musicFolder(), [this](const media::Inventory& inventory) {
        noticeProblems(inventory);
        libraryTaken_();
    });
}

void CompanionHost::noticeProblems(const media::Inventory& inventory) {
    Notice folder{troubleIn(inventory)};
    if (askForFolder_) {
        folder.actionName = translated("Choose Folder…");
        folder.act = [this] { chooseMusicFolder(); };
    }
    notices_.set(Notices::Topic::MusicFolder, std::move(folder));
    notices_.set(Notices::Topic::Watching, inventory.unwatchedNotice());
}

LMSyncDefaults& CompanionHost::syncDefaults() { return *syncDefaults_; }

AnnouncingLibrary& CompanionHost::mediaLibrary() { return *library_; }

NSArray<DVSession> CompanionHost::sessions(const std::string& type) {
    return engine_.sessions(type);
}

std::shared_ptr<WearableConnection> CompanionHost::connectToWearable(dispatch_queue_t /*queue*/) {
    return wearable_.connect();
}

Screen& CompanionHost::screen() { return screen_; }

/// That of the app's own texts comes first, so that all on the screen is in one.
std::vector<std::string> CompanionHost::languages() { return language::followedLanguages(); }

} // namespace quorl
