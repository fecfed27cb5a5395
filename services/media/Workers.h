#pragma once

#include <cstddef>
#include <functional>

namespace quorl::media {

/// How many threads share the work on a folder at most: one for each core.
[[nodiscard]] std::size_t workerCount();

/// Calls `work` once for each index below `count`, for several at a time and in no order, and
/// returns when all are done. What one call leaves behind must not be looked at by another;
/// `worker`, which is below `workerCount()`, is the same for no two calls at a time, so that each
/// worker can have things of its own. Must not throw.
void shareOut(std::size_t count,
              const std::function<void(std::size_t index, std::size_t worker)>& work);

} // namespace quorl::media
