#pragma once

#include <chrono>
#include <functional>
#include <memory>
#include <string>
#include <variant>

#include "services/wearable/Report.h"

namespace quorl::wearable {

/// Looks at a wearable for callers that cannot wait for it.
///
/// A device that hangs, such as a network drive whose machine is gone, costs at most four threads,
/// which are left behind; later questions are answered with an error in time, and with figures once
/// the device comes back. Any thread.
class Reporter {
  public:
    /// The figures, or a sentence for the user that says why there are none.
    using Answer = std::variant<Report, std::string>;

    /// Called exactly once, on a thread of the reporter's own, one call at a time and in the order
    /// of the questions. Must not throw, nor destroy the reporter.
    using Reply = std::function<void(const Answer&)>;

    /// Looks at the device. Called on threads that may outlive the reporter, several at a time, so
    /// it must own all that it uses. A failure is a `std::exception` whose text is the sentence.
    using Look = std::function<Report()>;

    static constexpr std::chrono::seconds usualPatience{10};

    explicit Reporter(const Wearable& wearable);

    /// @param patience how long a question waits for `look` until it is answered with an error.
    explicit Reporter(Look look, std::chrono::milliseconds patience = usualPatience);

    /// Answers every question that is still open, with an error. Waits for no device.
    ~Reporter();

    Reporter(const Reporter&) = delete;
    Reporter& operator=(const Reporter&) = delete;

    /// Returns at once. The figures are of a moment after the call.
    void ask(Reply reply);

  private:
    class Desk;

    std::shared_ptr<Desk> desk_;
};

} // namespace quorl::wearable
