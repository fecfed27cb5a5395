#pragma once

#include <chrono>
#include <functional>
#include <memory>
#include <string>
#include <variant>

#include "services/wearable/Usage.h"

namespace quorl::wearable {

/// Looks at a wearable for callers that cannot wait for it.
///
/// A device that hangs, such as a network drive whose machine is gone, costs at most four threads,
/// which are left behind; later questions are answered with an error in time, and with figures once
/// the device comes back. Any thread.
class UsageReader {
  public:
    using Answer = std::variant<Usage, Unseen>;

    /// Called exactly once, on a thread of the reader's own, one call at a time and in the order
    /// of the questions. Must not throw, nor destroy the reader.
    using Reply = std::function<void(const Answer&)>;

    /// Looks at the device. Called on threads that may outlive the reader, several at a time, so
    /// it must own all that it uses. A failure is a `std::exception` whose text is the sentence.
    using Look = std::function<Usage()>;

    static constexpr std::chrono::seconds usualPatience{10};

    /// @param wearable whether something is mounted there is found out.
    explicit UsageReader(const Wearable& wearable);

    /// @param patience how long a question waits for `look` until it is answered with an error.
    explicit UsageReader(Look look, std::chrono::milliseconds patience = usualPatience);

    /// Answers every question that is still open, with an error. Waits for no device.
    ~UsageReader();

    UsageReader(const UsageReader&) = delete;
    UsageReader& operator=(const UsageReader&) = delete;

    /// Returns at once. The figures are of a moment after the call.
    void ask(Reply reply);

  private:
    class Questions;

    std::shared_ptr<Questions> questions_;
};

} // namespace quorl::wearable
