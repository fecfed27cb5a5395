#include "quorl/app/CompanionHost.h"

#include "services/base/Utf8.h"

namespace quorl {

namespace {

wearable::Wearable wearableOf(const Places& places) {
    return places.wearable.empty() ? wearable::Wearable::embedded()
                                   : wearable::Wearable{places.wearable, {}, false};
}

} // namespace

CompanionHost::CompanionHost(const Places& places, Screen& screen, Notices& notices)
    : screen_(screen),
      notices_(notices),
      store_(
          [&notices](const std::string& text) { notices.set(Notices::Topic::Preferences, text); }),
      syncDefaults_(std::make_shared<SyncDefaults>(store_)),
      library_(std::make_shared<MusicLibrary>()),
      wearable_(wearableOf(places)),
      engine_({places.music, places.wearable},
              [this](const std::string& problem) { engineDidChange(problem); }) {}

void CompanionHost::engineDidChange(const std::string& problem) {
    isEngineHeardOf_ = true;
    notices_.set(Notices::Topic::SessionBus, problem);
    if (engineChanged_) {
        engineChanged_();
    }
}

void CompanionHost::openLibrary(const std::filesystem::path& music, std::function<void()> taken) {
    library_->open(music, [this, taken = std::move(taken)](const media::Inventory& inventory) {
        noticeProblems(inventory);
        taken();
    });
}

void CompanionHost::noticeProblems(const media::Inventory& inventory) {
    notices_.set(Notices::Topic::MusicFolder,
                 inventory.rootFound
                     ? std::string()
                     : "There is no music folder at " + base::printable(inventory.root.string()) +
                           ". Create it, or start quorl with --music and another folder.");
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

} // namespace quorl
