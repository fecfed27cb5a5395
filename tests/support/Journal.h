#pragma once

#include "doubles/CallRecorder.h"

namespace quorl::tests {

/// What the code under test asked of its surroundings and told them, in order, one line for each
/// call. The first word says what kind of line it is:
///
///     read NAME, write NAME VALUE         a preference
///     library hasMediaOfType MASK         likewise "library begin" and "library end"
///     query NAME=VALUE ...                with the predicates in their order
///     property ID NAME                    of a song or playlist
///     sessions TYPE, session ID add       likewise "remove"
///     tasks ID KEY                        of a session, those of one grouping key
///     wearable connect, wearable usage
///     glance IDENTIFIER, text KEY, size BYTES
///     observe NAME SELECTOR any           or "one", for one sender only; "leave"; "post NAME"
///     footer TEXT, row TITLE, list        the reload of a row, and of a list
///     show, url TEXT                      likewise "show animated" and "show at once"
///     appear animated, disappear at once  and the other way round
///     table, rows SECTION.ROW ...         the reload of a table, and of rows
///     deselect SECTION.ROW
///     timer NANOSECONDS                   in virtual time, from now; "timer never"
///
/// Main thread only.
class Journal final : public CallRecorder {
  public:
    void clear() { lines_.clear(); }

    /// The lines whose first word is one of `kinds`.
    [[nodiscard]] std::vector<std::string>
    lines(std::initializer_list<std::string_view> kinds) const;

    /// How often `line` was noted.
    [[nodiscard]] std::size_t count(std::string_view line) const;

    void preferenceWillBeRead(SyncPreference preference) override;
    void preferenceWillBeSet(SyncPreference preference,
                             std::optional<std::uint64_t> value) override;
    void libraryWillLookForMedia(NSUInteger mask) override;
    void libraryWillBeginNotifications() override;
    void libraryWillEndNotifications() override;
    void libraryDidFindPlaylists(const AnnouncingLibrary::Predicates& predicates,
                                 std::size_t count) override;
    void entityWillGiveProperty(const MPMediaEntity& entity, MPMediaProperty property) override;
    void sessionsWillBeListed(const std::string& type) override;
    void sessionWillAddObserver(const std::string& id) override;
    void sessionWillRemoveObserver(const std::string& id) override;
    void sessionWillListTasks(const std::string& id, const std::string& key) override;
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
    void controllerWillAppear(bool animated) override;
    void controllerWillDisappear(bool animated) override;
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
    /// Notes a line of these words.
    template <class... Words>
    void note(const Words&... words);

    std::vector<std::string> lines_;
};

} // namespace quorl::tests
