#pragma once

#include <cstdint>
#include <string>

#include "services/engine/Message.h"

namespace quorl::syncd {

/// What became of a sync.
struct LastResult {
    /// Everything that was wished for is on the wearable.
    bool success = false;
    /// No code before the first sync.
    engine::Message message;
    /// Microseconds since 1970; 0 before the first sync.
    std::uint64_t time = 0;
    /// Of the last sync that was a success; 0 before the first.
    std::uint64_t lastComplete = 0;

    bool operator==(const LastResult&) const = default;
};

/// The last result of each wearable. It is not kept on the wearable, which may be gone when there
/// is something to tell.
class ResultStore {
  public:
    virtual ~ResultStore() = default;

    /// Of the wearable with this top directory.
    [[nodiscard]] virtual LastResult of(const std::string& wearable) const = 0;

    /// Also outlives a loss of power. Throws `std::system_error` where that is not possible; then
    /// it is remembered as long as this object is there.
    virtual void remember(const std::string& wearable, LastResult result) = 0;
};

} // namespace quorl::syncd
