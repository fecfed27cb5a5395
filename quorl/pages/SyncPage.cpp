#include "quorl/pages/SyncPage.h"

#include <algorithm>
#include <filesystem>

#include "quorl/facts/SizeWords.h"
#include "quorl/pages/LeftOutPage.h"
#include "quorl/pages/RemovePage.h"
#include "quorl/pages/TimeLeft.h"
#include "services/base/Utf8.h"
#include "services/engine/RunningSession.h"
#include "services/language/Numbers.h"
#include "services/language/Translated.h"

namespace quorl {

using language::filled;
using language::numberText;
using language::percentText;
using language::translated;

namespace {

/// The task that carries the songs; null: it has not begun.
const engine::TaskState* songsOf(const engine::SessionState& session) {
    const auto found = std::ranges::find_if(session.tasks, [](const engine::TaskState& task) {
        return task.groupingKey == engine::assetGroupingKey && task.totalItemCount > 0;
    });
    return found == session.tasks.end() ? nullptr : &*found;
}

/// "Song 3 of 50" while the third is under way.
std::string placeOf(const engine::TaskState& songs) {
    const auto place = std::min(songs.completedItemCount + 1, songs.totalItemCount);
    return filled(translated("Song {place} of {count}"),
                  {{"place", numberText(place)}, {"count", numberText(songs.totalItemCount)}});
}

std::string percentOf(const engine::SessionState& session) {
    return percentText(double(session.progress));
}

std::string nameOf(const std::string& path) {
    return base::printable(std::filesystem::path(path).stem().string());
}

} // namespace

std::string SyncPage::summaryOf(const engine::EngineState& state) {
    const auto* const session = engine::runningSession(state);
    const auto& word = state.engine.syncState;
    return session                       ? percentOf(*session)
           : word == engine::syncSynced  ? translated("Up to date")
           : word == engine::syncPending ? translated("Waiting")
           : word == engine::syncOff     ? translated("Off")
                                         : "";
}

bool SyncPage::init() {
    setTitle(translated("Sync"));
    return AppPage::init();
}

void SyncPage::viewWillAppear(bool animated) {
    startsAtLogin_ = services().startsAtLogin();
    AppPage::viewWillAppear(animated);
}

AppPage::Rows SyncPage::rows() {
    const auto& engine = state().engine;
    const auto title =
        engine.playlistName.empty() ? std::nullopt : std::optional(engine.playlistName);
    Rows rows{group(title, engine.status)};
    addSession(rows);
    addWearable(rows);
    if (startsAtLogin_) {
        rows.push_back(
            group(std::nullopt, translated("Without it, syncing begins when this app is opened.")));
        rows.push_back(toggle(translated("Start at Login"), *startsAtLogin_,
                              PSSetter::of<&SyncPage::setLoginStart>("setLoginStart::")));
    }
    if (const auto notices = services().hasDesktopNotices()) {
        rows.push_back(group(std::nullopt,
                             translated("When a long sync is done, or you can mend what is in its "
                                        "way. Not while you look at this app.")));
        rows.push_back(toggle(translated("Notifications"), *notices,
                              PSSetter::of<&SyncPage::setNotices>("setNotices::")));
    }
    return rows;
}

void SyncPage::addSession(Rows& rows) {
    const auto* const session = engine::runningSession(state());
    if (!session) {
        if (state().isThere && state().engine.syncState != engine::syncOff) {
            rows.push_back(
                button(translated("Sync Now"), PSSetter::of<&SyncPage::syncNow>("syncNow::")));
        }
        return;
    }
    const auto* const songs = songsOf(*session);
    rows.push_back(
        progress(translated("Progress"),
                 songs ? filled(translated("{place}, {percent}"),
                                {{"place", placeOf(*songs)}, {"percent", percentOf(*session)}})
                       : translated("Preparing"),
                 session->progress));
    if (const auto left = timeLeft(*session); !left.empty()) {
        rows.push_back(value(translated("Time Left"), left));
    }
    if (!session->currentItem.empty()) {
        rows.push_back(value(translated("Now"), nameOf(session->currentItem)));
    }
    rows.push_back(button(translated("Stop"), PSSetter::of<&SyncPage::stop>("stop::")));
}

void SyncPage::addWearable(Rows& rows) {
    const auto& engine = state().engine;
    const auto& wearable = state().wearable;
    rows.push_back(group(translated("On the Velora"), {}));
    rows.push_back(value(translated("Music"), songsWords(wearable.songCount, wearable.songs)));
    if (engine.leftOutCount > 0) {
        rows.push_back(link(translated("Could Not Be Sent"), songsWords(engine.leftOutCount),
                            Class::of<LeftOutPage>()));
    }
    if (engine.beyondLimit > 0) {
        rows.push_back(value(translated("Beyond the Limit"), songsWords(engine.beyondLimit)));
    }
    if (wearable.songCount > 0) {
        rows.push_back(link(translated("Remove Music"), {}, Class::of<RemovePage>()));
    }
}

void SyncPage::syncNow(const std::shared_ptr<NSObject>& /*nothing*/, const Row& /*row*/) {
    services().ask(&engine::Client::startNow);
}

void SyncPage::setLoginStart(const std::shared_ptr<NSObject>& isOn, const Row& /*row*/) {
    const auto* number = NSNumber::of(isOn.get());
    services().setStartAtLogin(number && number->boolValue());
    startsAtLogin_ = services().startsAtLogin();
    refresh();
}

void SyncPage::setNotices(const std::shared_ptr<NSObject>& areOn, const Row& /*row*/) {
    const auto* number = NSNumber::of(areOn.get());
    services().setDesktopNotices(number && number->boolValue());
    refresh();
}

void SyncPage::stop(const std::shared_ptr<NSObject>& /*nothing*/, const Row& /*row*/) {
    services().ask(&engine::Client::cancel);
}

} // namespace quorl
