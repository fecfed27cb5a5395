#pragma once

#include "platform/PreferencesList.h"
#include "platform/WearableSettings.h"
#include "runtime/services/AnnouncingLibrary.h"
#include "runtime/services/SyncDefaults.h"

namespace quorl {

/// Is told what the plug-in asks of the host's doubles, one call for each of its. `will` comes
/// before the thing happens. This one takes no notes; what derives from it notes what it cares for.
/// On the thread of the plug-in's call.
class CallRecorder {
  public:
    CallRecorder() = default;
    CallRecorder(const CallRecorder&) = delete;
    CallRecorder& operator=(const CallRecorder&) = delete;
    virtual ~CallRecorder() = default;

    virtual void preferenceWillBeRead(SyncPreference /*preference*/) {}

    /// A truth value is 0 or 1, null clears.
    virtual void preferenceWillBeSet(SyncPreference /*preference*/,
                                     std::optional<std::uint64_t> /*value*/) {}

    virtual void libraryWillLookForMedia(NSUInteger /*mask*/) {}

    virtual void libraryWillBeginNotifications() {}

    virtual void libraryWillEndNotifications() {}

    virtual void libraryDidFindPlaylists(const AnnouncingLibrary::Predicates& /*predicates*/,
                                         std::size_t /*count*/) {}

    virtual void entityWillGiveProperty(const MPMediaEntity& /*entity*/,
                                        MPMediaProperty /*property*/) {}

    virtual void sessionsWillBeListed(const std::string& /*type*/) {}

    virtual void sessionWillAddObserver(const std::string& /*id*/) {}

    virtual void sessionWillRemoveObserver(const std::string& /*id*/) {}

    /// `key` is the grouping key of the tasks.
    virtual void sessionWillListTasks(const std::string& /*id*/, const std::string& /*key*/) {}

    virtual void wearableWillConnect(dispatch_queue_t /*queue*/) {}

    virtual void wearableWillBeAskedForUsage() {}

    virtual void hostWillGiveGlance(const std::string& /*identifier*/) {}

    virtual void hostWillLookUpText(const std::string& /*key*/,
                                    const std::optional<std::string>& /*value*/) {}

    virtual void hostWillFormatSize(float /*bytes*/) {}

    /// `sender` is null for any.
    virtual void centerWillAddObserver(NSObject& /*observer*/, NSNotificationSelector /*selector*/,
                                       NSNotificationName /*name*/, const NSObject* /*sender*/) {}

    /// Also while `observer` is being destroyed.
    virtual void centerWillRemoveObserver(const NSObject& /*observer*/) {}

    virtual void centerWillPost(NSNotificationName /*name*/, const NSObject* /*sender*/) {}

    virtual void controllerWillAppear(bool /*animated*/) {}

    virtual void controllerWillDisappear(bool /*animated*/) {}

    virtual void specifierWillSetProperty(const PSSpecifier& /*specifier*/,
                                          const std::optional<std::string>& /*value*/,
                                          std::string_view /*key*/) {}

    /// `specifier` may be null.
    virtual void listWillReloadSpecifier(const PSSpecifier* /*specifier*/) {}

    virtual void listWillReload() {}

    /// `controller` may be null; `animate` is null where it was not said.
    virtual void listWillShowController(const PSController* /*controller*/,
                                        std::optional<bool> /*animate*/) {}

    virtual void listWillHandleURL(const std::string& /*url*/) {}

    virtual void tableWillReloadData() {}

    virtual void tableWillReloadRows(const std::vector<NSIndexPath>& /*paths*/,
                                     UITableViewRowAnimation /*animation*/) {}

    virtual void tableWillDeselectRow(const NSIndexPath& /*path*/, bool /*animated*/) {}

    /// A call for virtual time, as its observer hears of it.
    virtual void dispatchWillBeCalled(std::string_view /*function*/,
                                      std::initializer_list<std::uint64_t> /*figures*/) {}
};

} // namespace quorl
