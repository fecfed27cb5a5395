#include "tests/support/Journal.h"

#include <algorithm>
#include <sstream>

namespace quorl::tests {

namespace {

const char* nameOf(SyncPreference preference) {
    switch (preference) {
    case SyncPreference::AssetSyncEnabled:
        return "assetSyncEnabled";
    case SyncPreference::AssetSyncPlaylistPersistentID:
        return "assetSyncPlaylistPersistentID";
    case SyncPreference::AssetSyncLimitType:
        return "assetSyncLimitType";
    case SyncPreference::AssetSyncLimit:
        return "assetSyncLimit";
    case SyncPreference::LastFullySentAssetSyncPlaylistPersistentID:
        return "lastFullySentAssetSyncPlaylistPersistentID";
    case SyncPreference::LastFullySentAssetSyncPlaylistVersion:
        return "lastFullySentAssetSyncPlaylistVersion";
    }
    return "unknown";
}

std::string textOf(const NSIndexPath& path) {
    return std::to_string(path.section) + "." + std::to_string(path.row);
}

} // namespace

std::vector<std::string> Journal::lines(std::initializer_list<std::string_view> kinds) const {
    std::vector<std::string> wanted;
    std::copy_if(lines_.begin(), lines_.end(), std::back_inserter(wanted),
                 [kinds](const std::string& line) {
                     const auto kind = std::string_view(line).substr(0, line.find(' '));
                     return std::find(kinds.begin(), kinds.end(), kind) != kinds.end();
                 });
    return wanted;
}

std::size_t Journal::count(std::string_view line) const {
    return static_cast<std::size_t>(std::count(lines_.begin(), lines_.end(), line));
}

template <class... Words>
void Journal::note(const Words&... words) {
    std::ostringstream line;
    const char* separator = "";
    ((line << std::exchange(separator, " ") << words), ...);
    lines_.push_back(line.str());
}

void Journal::preferenceWillBeRead(SyncPreference preference) { note("read", nameOf(preference)); }

void Journal::preferenceWillBeSet(SyncPreference preference, std::optional<std::uint64_t> value) {
    note("write", nameOf(preference), value ? std::to_string(*value) : "null");
}

void Journal::libraryWillLookForMedia(NSUInteger mask) { note("library hasMediaOfType", mask); }

void Journal::libraryWillBeginNotifications() { note("library begin"); }

void Journal::libraryWillEndNotifications() { note("library end"); }

void Journal::libraryDidFindPlaylists(const AnnouncingLibrary::Predicates& predicates,
                                      std::size_t /*count*/) {
    std::string line = "query";
    for (const auto& predicate : predicates) {
        line += " " + std::string(predicate->property()) + "=" +
                std::to_string(predicate->value()->unsignedLongLongValue());
    }
    note(line);
}

void Journal::entityWillGiveProperty(const MPMediaEntity& entity, MPMediaProperty property) {
    note("property", entity.persistentID(), property);
}

void Journal::sessionsWillBeListed(const std::string& type) { note("sessions", type); }

void Journal::sessionWillAddObserver(const std::string& id) { note("session", id, "add"); }

void Journal::sessionWillRemoveObserver(const std::string& id) { note("session", id, "remove"); }

void Journal::sessionWillListTasks(const std::string& id, const std::string& key) {
    note("tasks", id, key);
}

void Journal::wearableWillConnect(dispatch_queue_t /*queue*/) { note("wearable connect"); }

void Journal::wearableWillBeAskedForUsage() { note("wearable usage"); }

void Journal::hostWillGiveGlance(const std::string& identifier) { note("glance", identifier); }

void Journal::hostWillLookUpText(const std::string& key,
                                 const std::optional<std::string>& /*value*/) {
    note("text", key);
}

void Journal::hostWillFormatSize(float bytes) { note("size", static_cast<std::uint64_t>(bytes)); }

void Journal::centerWillAddObserver(NSObject& /*observer*/, NSNotificationSelector selector,
                                    NSNotificationName name, const NSObject* sender) {
    note("observe", name, selector.name(), sender ? "one" : "any");
}

void Journal::centerWillRemoveObserver(const NSObject& /*observer*/) { note("leave"); }

void Journal::centerWillPost(NSNotificationName name, const NSObject* /*sender*/) {
    note("post", name);
}

void Journal::controllerWillAppear(bool animated) {
    note("appear", animated ? "animated" : "at once");
}

void Journal::controllerWillDisappear(bool animated) {
    note("disappear", animated ? "animated" : "at once");
}

void Journal::specifierWillSetProperty(const PSSpecifier& /*specifier*/,
                                       const std::optional<std::string>& value,
                                       std::string_view key) {
    if (key == PSFooterTextGroupKey) {
        note("footer", value.value_or("null"));
    }
}

void Journal::listWillReloadSpecifier(const PSSpecifier* specifier) {
    note("row", specifier ? specifier->name().value_or("untitled") : "null");
}

void Journal::listWillReload() { note("list"); }

void Journal::listWillShowController(const PSController* /*controller*/,
                                     std::optional<bool> animate) {
    note(!animate ? "show" : *animate ? "show animated" : "show at once");
}

void Journal::listWillHandleURL(const std::string& url) { note("url", url); }

void Journal::tableWillReloadData() { note("table"); }

void Journal::tableWillReloadRows(const std::vector<NSIndexPath>& paths,
                                  UITableViewRowAnimation animation) {
    std::string line = "rows";
    for (const NSIndexPath& path : paths) {
        line += " " + textOf(path);
    }
    note(line + (animation == UITableViewRowAnimation::Fade ? " fading" : ""));
}

void Journal::tableWillDeselectRow(const NSIndexPath& path, bool animated) {
    note("deselect", textOf(path) + (animated ? " fading" : ""));
}

void Journal::dispatchWillBeCalled(std::string_view function,
                                   std::initializer_list<std::uint64_t> figures) {
    if (function == "dispatch_source_set_timer") {
        const std::uint64_t delay = *figures.begin();
        note("timer", delay == DISPATCH_TIME_FOREVER ? "never" : std::to_string(delay));
    }
}

} // namespace quorl::tests
