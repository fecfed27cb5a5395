#pragma once

#include <cstddef>
#include <cstdint>
#include <system_error>
#include <vector>

#include "services/engine/Message.h"

/// What the user is told of a sync.
namespace quorl::syncd {

/// What is wrong with a device when an operation on it fails.
[[nodiscard]] engine::Message messageOf(const std::error_code& error);

/// No device is to blame.
[[nodiscard]] engine::Message notSynced(const std::error_code& error);

/// Both in bytes.
[[nodiscard]] engine::Message notEnoughSpace(std::uint64_t needed, std::uint64_t available);

/// @param leftOut how many songs could not be found or read.
[[nodiscard]] engine::Message synced(std::size_t songs, std::size_t leftOut);

/// @param problems one for each song that was not sent; at least one.
[[nodiscard]] engine::Message notAllSent(const std::vector<engine::Message>& problems);

} // namespace quorl::syncd
