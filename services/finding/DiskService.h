#pragma once

#include <functional>
#include <memory>
#include <string>
#include <vector>

#include <sdbus-c++/sdbus-c++.h>

#include "services/finding/Drive.h"

/// The system's disk service, UDisks2, where there is one.
namespace quorl::finding {

/// Makes a connection to the bus that the service is on. Throws `sdbus::Error`.
using Connect = std::function<std::unique_ptr<sdbus::IConnection>()>;

/// All drives that the service knows. Waits for its answer for some seconds. Throws `sdbus::Error`
/// where there is no service or it does not answer.
[[nodiscard]] std::vector<Drive> drivesOf(sdbus::IConnection& bus);

/// Has `changed` called in turns of the bus whenever something may have changed in what the service
/// tells, for as long as the bus is there.
void watchService(sdbus::IConnection& bus, const std::function<void()>& changed);

/// Unmounts a drive and makes it ready to be taken away; where that is done, all that was written
/// is on it. Waits for the device and for a person who is asked for leave, which takes minutes at
/// worst. Gives back an empty text, or a sentence that says what is in the way and what to do.
/// @param name what people call the drive
[[nodiscard]] std::string remove(const Removal& removal, const std::string& name,
                                 const Connect& connect);

} // namespace quorl::finding
