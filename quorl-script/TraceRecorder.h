#pragma once

#include "doubles/CallRecorder.h"
#include "quorl-script/Trace.h"

namespace quorl {

/// Writes the calls that a script sees to its trace. Any thread.
class TraceRecorder final : public CallRecorder {
  public:
    explicit TraceRecorder(std::shared_ptr<Trace> trace) : trace_(std::move(trace)) {}

    void preferenceWillBeSet(SyncPreference preference,
                             std::optional<std::uint64_t> value) override;
    void libraryWillLookForMedia(NSUInteger mask) override;
    void libraryWillBeginNotifications() override;
    void libraryWillEndNotifications() override;
    void libraryDidFindPlaylists(const AnnouncingLibrary::Predicates& predicates,
                                 std::size_t count) override;
    void sessionsWillBeListed(const std::string& type) override;
    void sessionWillAddObserver(const std::string& id) override;
    void sessionWillRemoveObserver(const std::string& id) override;
    void wearableWillConnect(dispatch_queue_t queue) override;
    void wearableWillBeAskedForUsage() override;
    void hostWillGiveGlance(const std::string& identifier) override;
    void hostWillLookUpText(const std::string& key,
                            const std::optional<std::string>& value) override;
    void hostWillFormatSize(float bytes) override;
    void centerWillAddObserver(NSObject& observer, NSNotificationSelector selector,
                               NSNotificationName name, const NSObject* sender) override;
    void centerWillRemoveObserver(const NSObject& observer) override;
    void centerWillPost(NSNotificationName name, const NSObject* sender) override;
    void specifierWillSetProperty(const PSSpecifier& specifier,
                                  const std::optional<std::string>& value,
                                  std::string_view key) override;
    void listWillReloadSpecifier(const PSSpecifier* specifier) override;
    void listWillReload() override;
    void listWillShowController(const PSController* controller,
                                std::optional<bool> animate) override;
    void listWillHandleURL(const std::string& url) override;
    void tableWillReloadData() override;
    void tableWillReloadRows(const std::vector<NSIndexPath>& paths,
                             UITableViewRowAnimation animation) override;
    void tableWillDeselectRow(const NSIndexPath& path, bool animated) override;
    void dispatchWillBeCalled(std::string_view function,
                              std::initializer_list<std::uint64_t> figures) override;

  private:
    std::shared_ptr<Trace> trace_;
};

} // namespace quorl
