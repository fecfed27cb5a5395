#pragma once

#include <list>
#include <mutex>
#include <unordered_map>

#include "platform/Foundation.h"

namespace quorl {

/// The runtime's notification centre.
class NotificationCenter : public NSNotificationCenter {
  public:
    /// The one that every process has, with or without a host. It lives as long as the process.
    [[nodiscard]] static NotificationCenter& processWide();

    void addObserver_selector_name_object(NSObject* observer, NSNotificationSelector selector,
                                          NSNotificationName name, const NSObject* object) override;
    void removeObserver(const NSObject* observer) override;
    void postNotificationName_object(NSNotificationName name, NSObject* object) override;

  private:
    struct Registration {
        const NSObject* observer; ///< tells whose registration it is, also during its destruction
        std::weak_ptr<NSObject> reference;
        NSNotificationSelector selector;
        const NSObject* sender; ///< null for any
        bool removed = false;
    };

    using Registrations = std::vector<std::shared_ptr<Registration>>;

    [[nodiscard]] Registrations registrationsFor(NSNotificationName name, const NSObject* sender);
    [[nodiscard]] std::shared_ptr<NSObject> observerOf(const Registration& registration);

    std::mutex mutex_;
    std::unordered_map<NSNotificationName, Registrations> registrations_;
};

} // namespace quorl
