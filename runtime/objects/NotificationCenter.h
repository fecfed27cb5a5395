#pragma once

#include <atomic>
#include <mutex>
#include <unordered_map>
#include <vector>

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
        Registration(NSObject& observing, NSNotificationSelector answer, const NSObject* from)
            : observer(&observing),
              reference(observing.weak_from_this()),
              selector(answer),
              sender(from) {}

        const NSObject* observer; ///< tells whose registration it is, also during its destruction
        std::weak_ptr<NSObject> reference;
        NSNotificationSelector selector;
        const NSObject* sender; ///< null for any
        std::atomic<bool> removed = false;
    };

    /// The newest first. Never changed but replaced, so that a post goes on with those it began
    /// with.
    using Registrations = std::vector<std::shared_ptr<Registration>>;

    [[nodiscard]] std::shared_ptr<const Registrations> registrationsFor(NSNotificationName name);
    [[nodiscard]] static std::shared_ptr<NSObject> observerOf(const Registration& registration);

    std::mutex mutex_;
    std::unordered_map<NSNotificationName, std::shared_ptr<const Registrations>> registrations_;
};

} // namespace quorl
