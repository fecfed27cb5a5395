#include "quorl/app/CompanionHost.h"

#include "services/base/Utf8.h"

namespace quorl {

namespace {

wearable::Wearable wearableOf(const Options& options) {
    return options.wearable.empty() ? wearable::Wearable::embedded()
                                    : wearable::Wearable::mounted(options.wearable);
}

} // namespace

CompanionHost::CompanionHost(const Options& options, Screen& screen, Notices& notices)
    : screen_(screen),
      notices_(notices),
      store_(notices),
      syncDefaults_(std::make_shared<SyncDefaults>(store_)),
      library_(std::make_shared<Library>()),
      wearable_(wearableOf(options)),
      engine_({options.music, options.wearable},
              [this](const std::string& problem) { engineDidChange(problem); }) {}

void CompanionHost::engineDidChange(const std::string& problem) {
    isEngineHeardOf_ = true;
    notices_.set(Notices::Topic::SessionBus, problem);
    if (engineChanged_) {
        engineChanged_();
    }
}

void CompanionHost::openLibrary(const std::filesystem::path& music, std::function<void()> taken) {
    library_->open(music, [this, taken = std::move(taken)](const media::Snapshot& snapshot) {
        noticeProblems(snapshot);
        taken();
    });
}

void CompanionHost::noticeProblems(const media::Snapshot& snapshot) {
    notices_.set(Notices::Topic::MusicFolder,
                 snapshot.rootFound
                     ? std::string()
                     : "There is no music folder at " + base::printable(snapshot.root.string()) +
                           ". Create it, or start quorl with --music and another folder.");
    notices_.set(Notices::Topic::Watching, snapshot.unwatchedNotice());
}

LMSyncDefaults& CompanionHost::syncDefaults() { return *syncDefaults_; }

MediaLibrary& CompanionHost::mediaLibrary() { return *library_; }

NSArray<DVSession> CompanionHost::sessions(const std::string& type) {
    return engine_.sessions(type);
}

std::unique_ptr<LSSClient> CompanionHost::connectToWearable(dispatch_queue_t /*queue*/) {
    return wearable_.connect();
}

Screen& CompanionHost::screen() { return screen_; }

} // namespace quorl
