#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <system_error>
#include <vector>

/// What the user is told of a sync.
namespace quorl::syncd {

/// What is wrong with a device when an operation on it fails.
enum class DeviceTrouble { Full, WriteProtected, Away, Obstructed, Other };

[[nodiscard]] DeviceTrouble troubleOf(const std::error_code& error);

[[nodiscard]] std::string sentence(DeviceTrouble trouble, const std::error_code& error);

[[nodiscard]] std::string anotherProgramIsSyncing();

[[nodiscard]] std::string notEnoughMemory();

/// Both in bytes.
[[nodiscard]] std::string notEnoughSpace(std::uint64_t needed, std::uint64_t available);

[[nodiscard]] std::string synced(std::size_t songs);

/// @param problems a sentence for each song that was not sent; at least one.
[[nodiscard]] std::string notAllSent(const std::vector<std::string>& problems);

} // namespace quorl::syncd
