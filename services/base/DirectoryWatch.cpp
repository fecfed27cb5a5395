#include "services/base/DirectoryWatch.h"

#include "services/base/InotifyEvents.h"

namespace quorl::base {

namespace {

/// Without IN_MODIFY: a song that is being copied would have the folder built again and again until
/// it is complete, when IN_CLOSE_WRITE comes anyway. Deletion of the directory itself shows in its
/// parent.
constexpr std::uint32_t watched = IN_CREATE | IN_DELETE | IN_MOVED_FROM | IN_MOVED_TO |
                                  IN_CLOSE_WRITE | IN_ATTRIB | IN_ONLYDIR | IN_DONT_FOLLOW |
                                  IN_EXCL_UNLINK;

} // namespace

DirectoryWatch::DirectoryWatch() : inotify_(inotify_init1(IN_NONBLOCK | IN_CLOEXEC)) {}

std::optional<int> DirectoryWatch::add(const std::string& path) {
    const int watch = inotify_add_watch(inotify_.get(), path.c_str(), watched);
    return watch < 0 ? std::nullopt : std::optional(watch);
}

void DirectoryWatch::remove(int watch) {
    // Fails where the directory is gone and took its watch along, which is as well.
    inotify_rm_watch(inotify_.get(), watch);
}

DirectoryWatch::Changes DirectoryWatch::take() {
    Changes changes;
    forEachInotifyEvent(inotify_.get(), [&changes](const inotify_event& event, std::string_view) {
        if ((event.mask & IN_Q_OVERFLOW) != 0) {
            changes.lost = true;
        } else if (changes.changed.empty() || changes.changed.back() != event.wd) {
            changes.changed.push_back(event.wd);
        }
    });
    return changes;
}

} // namespace quorl::base
