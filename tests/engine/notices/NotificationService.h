#pragma once

#include <condition_variable>
#include <functional>
#include <map>
#include <memory>
#include <mutex>
#include <optional>
#include <string>
#include <vector>

#include <sdbus-c++/sdbus-c++.h>

namespace quorl::syncd::testing {

/// What the service was asked to show.
struct Notification {
    std::uint32_t replaced = 0;
    std::string app = {};
    std::string icon = {};
    std::string title = {};
    std::string body = {};
    std::vector<std::string> actions = {};
    std::map<std::string, sdbus::Variant> hints = {};
};

/// What stands on the session bus for the notification service of a desktop. It numbers what it
/// shows from 1 on.
class NotificationService {
  public:
    enum class Manner {
        Answers,
        Fails,       ///< Each call is answered with an error.
        KeepsSilent, ///< No call is answered until the manner changes.
    };

    explicit NotificationService(std::vector<std::string> abilities = {"actions", "body"});
    ~NotificationService();

    NotificationService(const NotificationService&) = delete;
    NotificationService& operator=(const NotificationService&) = delete;

    /// Answers at once what was not answered, where it answers again.
    void behave(Manner manner);

    /// All calls so far, in order: "ask", "show 1", "show 2 for 1", "close 2".
    [[nodiscard]] std::vector<std::string> calls();

    /// Waits until there are so many calls; gives them back.
    std::vector<std::string> awaitCalls(std::size_t count);

    /// Waits until this was called.
    void awaitCall(const std::string& call);

    /// Waits until all that was told and answered so far has been heard by the program of this
    /// name.
    void awaitHeard(const std::string& name);

    /// The last one.
    [[nodiscard]] Notification shown();

    /// What a person does, or the desktop.
    void tell(const std::string& signal, std::uint32_t number, const sdbus::Variant& detail);

  private:
    using Number = std::uint32_t;
    using Abilities = std::vector<std::string>;

    void registerMethods();
    void note(const std::string& call);
    /// Now, or once it answers again.
    void answer(std::function<void(Manner)> reply);
    [[nodiscard]] Number take(Notification notification);

    const Abilities abilities_;
    std::mutex mutex_;
    std::condition_variable more_;
    Manner manner_ = Manner::Answers;
    std::vector<std::string> calls_;
    Notification shown_;
    Number last_ = 0;
    std::unique_ptr<sdbus::IConnection> connection_;
    std::unique_ptr<sdbus::IObject> object_;
    std::vector<std::function<void(Manner)>> unanswered_; ///< over the connection
};

} // namespace quorl::syncd::testing
