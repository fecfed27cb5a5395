#include "services/base/RootWatch.h"

#include <utility>

#include "services/base/InotifyEvents.h"

namespace quorl::base {

namespace {

constexpr std::uint32_t watched =
    IN_CREATE | IN_DELETE | IN_MOVED_FROM | IN_MOVED_TO | IN_ATTRIB | IN_ONLYDIR;

} // namespace

RootWatch::RootWatch(std::filesystem::path root)
    : root_(std::move(root)), inotify_(inotify_init1(IN_NONBLOCK | IN_CLOEXEC)) {
    watchTheWay();
}

bool RootWatch::take() {
    bool concerned = false;
    forEachInotifyEvent(inotify_.get(), [&](const inotify_event& event, std::string_view name) {
        const auto next = nextNames_.find(event.wd);
        const bool nextChanged = next != nextNames_.end() && next->second == name;
        concerned |= nextChanged || (event.mask & (IN_Q_OVERFLOW | IN_UNMOUNT)) != 0;
    });
    if (concerned) {
        watchTheWay();
    }
    return concerned;
}

void RootWatch::watchTheWay() {
    for (const auto& [watch, name] : nextNames_) {
        inotify_rm_watch(inotify_.get(), watch);
    }
    nextNames_.clear();
    // From the top down, so that a directory that is made meanwhile is either found or noticed.
    std::filesystem::path directory = root_.root_path();
    for (const auto& name : root_.relative_path()) {
        const int watch = inotify_add_watch(inotify_.get(), directory.c_str(), watched);
        if (watch >= 0) {
            nextNames_[watch] = name.string();
        }
        directory /= name;
    }
}

} // namespace quorl::base
