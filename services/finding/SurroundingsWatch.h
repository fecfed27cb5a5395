#pragma once

#include <filesystem>
#include <functional>

#include "services/base/Errand.h"
#include "services/finding/DiskService.h"

namespace quorl::finding {

/// The system bus. Throws `sdbus::Error`.
[[nodiscard]] std::unique_ptr<sdbus::IConnection> connectToSystem();

/// Where it is told what is mounted and plugged in.
struct Sources {
    /// As in `surroundingsIn`.
    std::filesystem::path files = "/";
    Connect connect = connectToSystem;
};

/// What is mounted now, and all that is known of it: by the disk service where there is one, else
/// by the system's files. Waits for the service for some seconds at most, and for no device.
[[nodiscard]] Surroundings survey(const Sources& sources = {});

/// Tells what is mounted, at first and whenever that changes. Any thread.
class SurroundingsWatch {
  public:
    /// Called on a thread of the watch's own, also when the watch is gone already.
    using Tell = std::function<void(const Surroundings&)>;

    /// @param tell owns all that it uses. Must not throw.
    /// Throws `std::system_error` where no thread can be started.
    explicit SurroundingsWatch(Tell tell, Sources sources = {});

  private:
    base::Errand errand_;
};

} // namespace quorl::finding
