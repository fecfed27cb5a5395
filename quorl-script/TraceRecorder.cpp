#include "quorl-script/TraceRecorder.h"

#include "quorl-script/Naming.h"

namespace quorl {

namespace {

constexpr const char* center = "NSNotificationCenter";
constexpr const char* library = "MPMediaLibrary";
constexpr const char* list = "PSListController";
constexpr const char* session = "DVSession";
constexpr const char* table = "UITableView";
constexpr const char* wearable = "LSSManager";

/// What holds the resolved playlist beside the preferences. It shows itself to a host only here.
constexpr std::string_view sideObjectClass = "_LMSyncDefaultsAssociatedObject";

/// The setter and what it is given. Ids are texts in JSON.
std::pair<const char*, Json> setterOf(SyncPreference preference,
                                      std::optional<std::uint64_t> value) {
    switch (preference) {
    case SyncPreference::AssetSyncEnabled:
        return {"setAssetSyncEnabled:", value != 0};
    case SyncPreference::AssetSyncPlaylistPersistentID:
        return {"setAssetSyncPlaylistPersistentID:",
                value ? Json(std::to_string(*value)) : Json(nullptr)};
    case SyncPreference::AssetSyncLimitType:
        return {"setAssetSyncLimitType:", value.value_or(0)};
    case SyncPreference::AssetSyncLimit:
        return {"setAssetSyncLimit:", value ? Json(*value) : Json(nullptr)};
    default:
        throw std::logic_error("a preference without a setter was set");
    }
}

/// Every property but the id that can be asked for is a truth value.
Json valueOf(const MPMediaPropertyPredicate& predicate) {
    const auto& value = predicate.value();
    if (!value) {
        return nullptr;
    }
    if (predicate.property() == MPMediaPlaylistPropertyPersistentID) {
        return std::to_string(value->unsignedLongLongValue());
    }
    return value->boolValue();
}

JsonList listOf(const AnnouncingLibrary::Predicates& predicates) {
    JsonList entries;
    for (const auto& predicate : predicates) {
        entries.add(JsonList()
                        .add(predicate->property())
                        .add(valueOf(*predicate))
                        .add(static_cast<NSInteger>(predicate->comparisonType())));
    }
    return entries;
}

JsonList pathOf(const NSIndexPath& path) { return JsonList().add(path.section).add(path.row); }

JsonList listOf(const std::vector<NSIndexPath>& paths) {
    JsonList entries;
    for (const NSIndexPath& path : paths) {
        entries.add(pathOf(path));
    }
    return entries;
}

} // namespace

void TraceRecorder::preferenceWillBeSet(SyncPreference preference,
                                        std::optional<std::uint64_t> value) {
    const auto [selector, argument] = setterOf(preference, value);
    trace_->record("LMSyncDefaults", selector, argument);
}

void TraceRecorder::libraryWillLookForMedia(NSUInteger mask) {
    trace_->record(library, "hasMediaOfType:", mask);
}

void TraceRecorder::libraryWillBeginNotifications() {
    trace_->record(library, "beginGeneratingLibraryChangeNotifications");
}

void TraceRecorder::libraryWillEndNotifications() {
    trace_->record(library, "endGeneratingLibraryChangeNotifications");
}

void TraceRecorder::libraryDidFindPlaylists(const AnnouncingLibrary::Predicates& predicates,
                                            std::size_t count) {
    trace_->record("MPMediaQuery", "collections", listOf(predicates), count);
}

void TraceRecorder::sessionsWillBeListed(const std::string& type) {
    trace_->record(session, "sessionsWithSessionTypeIdentifier:", type);
}

void TraceRecorder::sessionWillAddObserver(const std::string& id) {
    trace_->record(session, "addObserver:", id);
}

void TraceRecorder::sessionWillRemoveObserver(const std::string& id) {
    trace_->record(session, "removeObserver:", id);
}

void TraceRecorder::wearableWillConnect(dispatch_queue_t queue) {
    const bool isMain = queue == dispatch_get_main_queue();
    trace_->record(wearable, "initWithQueue:", isMain ? "main" : "other");
}

void TraceRecorder::wearableWillBeAskedForUsage() { trace_->record(wearable, "getUsage:"); }

void TraceRecorder::hostWillGiveGlance(const std::string& identifier) {
    trace_->record("QPSNotificationAppController", "glanceSpecifierForIdentifier:", identifier);
}

void TraceRecorder::hostWillLookUpText(const std::string& key,
                                       const std::optional<std::string>& value) {
    trace_->record("NSBundle", "localizedStringForKey:value:table:", key, value, nullptr);
}

void TraceRecorder::hostWillFormatSize(float bytes) {
    trace_->record("CPFSSizeStrings", numberOf(static_cast<double>(bytes)));
}

void TraceRecorder::centerWillAddObserver(NSObject& observer, NSNotificationSelector selector,
                                          NSNotificationName name, const NSObject* sender) {
    const std::string& observerClass = className(observer);
    trace_->record(center, "addObserver:selector:name:object:", observerClass, selector.name(),
                   name, classNameOrNull(sender));
    if (observerClass == sideObjectClass) {
        watchLife(observer, observerClass, trace_);
    }
}

void TraceRecorder::centerWillRemoveObserver(const NSObject& observer) {
    trace_->record(center, "removeObserver:", className(observer));
}

void TraceRecorder::centerWillPost(NSNotificationName name, const NSObject* sender) {
    trace_->record(center, "postNotificationName:object:", name, classNameOrNull(sender));
}

void TraceRecorder::specifierWillSetProperty(const PSSpecifier& specifier,
                                             const std::optional<std::string>& value,
                                             std::string_view key) {
    trace_->record("PSSpecifier", "setProperty:forKey:", specifier.name(), value, key);
}

void TraceRecorder::listWillReloadSpecifier(const PSSpecifier* specifier) {
    trace_->record(list, "reloadSpecifier:", specifier ? specifier->name() : std::nullopt);
}

void TraceRecorder::listWillReload() { trace_->record(list, "reload"); }

void TraceRecorder::listWillShowController(const PSController* controller,
                                           std::optional<bool> animate) {
    const Json shown = classNameOrNull(dynamic_cast<const NSObject*>(controller));
    if (animate) {
        trace_->record(list, "showController:animate:", shown, *animate);
    } else {
        trace_->record(list, "showController:", shown);
    }
}

void TraceRecorder::listWillHandleURL(const std::string& url) {
    trace_->record(list, "handleURL:", url);
}

void TraceRecorder::tableWillReloadData() { trace_->record(table, "reloadData"); }

void TraceRecorder::tableWillReloadRows(const std::vector<NSIndexPath>& paths,
                                        UITableViewRowAnimation animation) {
    trace_->record(table, "reloadRowsAtIndexPaths:withRowAnimation:", listOf(paths),
                   static_cast<NSInteger>(animation));
}

void TraceRecorder::tableWillDeselectRow(const NSIndexPath& path, bool animated) {
    trace_->record(table, "deselectRowAtIndexPath:animated:", pathOf(path), animated);
}

void TraceRecorder::dispatchWillBeCalled(std::string_view function,
                                         std::initializer_list<std::uint64_t> figures) {
    JsonList entry;
    entry.add("dispatch").add(function);
    for (const std::uint64_t figure : figures) {
        entry.add(figure == DISPATCH_TIME_FOREVER ? Json("forever") : Json(figure));
    }
    trace_->add("dispatch", std::move(entry));
}

} // namespace quorl
