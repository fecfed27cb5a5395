#pragma once

#include <string_view>

#include "platform/NSObject.h"
#include "platform/Selector.h"

/// The name of a notification. Names are constants that live as long as the process.
using NSNotificationName = std::string_view;

/// A notification on its way. `object`, the sender, may be null and lives until the post returns.
struct NSNotification {
    NSNotificationName name;
    NSObject* object;
};

/// What a notification is answered with: a method with one `const NSNotification&`, or with none.
using NSNotificationSelector = Selector<void(const NSNotification&)>;

/// Hands notifications to those who registered for them. Any thread: observers are called on the
/// thread that posts, before the post returns, the newest registration first. Observers may come
/// and go during a post: one that has gone is not called any more, one that has come is called by
/// the next post.
class NSNotificationCenter : public NSObject {
  public:
    /// The one centre of the process.
    [[nodiscard]] static NSNotificationCenter& defaultCenter();

    /// Registers `observer`, which is not owned, for `name`, from `object` only, or from any sender
    /// where `object` is null. Each registration counts: one made twice is called twice.
    virtual void addObserver_selector_name_object(NSObject* observer,
                                                  NSNotificationSelector selector,
                                                  NSNotificationName name,
                                                  const NSObject* object) = 0;

    /// Takes back every registration of `observer`; none is no error. To be called in the
    /// observer's destructor at the latest.
    virtual void removeObserver(const NSObject* observer) = 0;

    /// Calls who registered for `name` and `object`. `object` may be null.
    virtual void postNotificationName_object(NSNotificationName name, NSObject* object) = 0;
};
