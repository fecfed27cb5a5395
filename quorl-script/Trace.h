#pragma once

#include <mutex>
#include <optional>
#include <set>
#include <string>
#include <string_view>
#include <thread>

#include "quorl-script/output/Json.h"

namespace quorl {

/// The calls that were made since the last reply. Any thread.
class Trace {
  public:
    /// Notes a call: the receiver's class, the selector, the arguments. A call off the thread that
    /// made the trace gets a last element that says so.
    template <class... Arguments>
    void record(std::string_view receiver, const Arguments&... arguments) {
        JsonList entry;
        entry.add(receiver);
        (entry.add(arguments), ...);
        add(receiver, std::move(entry));
    }

    /// The same for a call whose entry was put together elsewhere.
    void add(std::string_view receiver, JsonList entry);

    /// Notes that an object was destroyed.
    void recordDealloc(const std::string& className);

    /// From now on only these receivers are noted; all for null. "life" stands for the ends of
    /// objects.
    void select(std::optional<std::set<std::string, std::less<>>> receivers);

    /// The entries so far, which are then forgotten.
    [[nodiscard]] JsonList take();

    /// Nothing is noted while one of these lives: what drawing asks for is the host's own doing.
    class Pause {
      public:
        explicit Pause(Trace& trace) : trace_(trace) { trace_.pause(1); }

        Pause(const Pause&) = delete;
        Pause& operator=(const Pause&) = delete;

        ~Pause() { trace_.pause(-1); }

      private:
        Trace& trace_;
    };

  private:
    [[nodiscard]] bool isSelected(std::string_view receiver) const;
    void pause(int change);

    const std::thread::id mainThread_ = std::this_thread::get_id();
    std::mutex mutex_;
    JsonList entries_;
    std::optional<std::set<std::string, std::less<>>> receivers_;
    int pauses_ = 0;
};

/// A number as JSON, without a fraction where it has none.
[[nodiscard]] Json numberOf(double value);

} // namespace quorl
