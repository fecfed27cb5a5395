#pragma once

#include <cstdint>
#include <map>
#include <memory>
#include <mutex>
#include <string>
#include <vector>

#include <sdbus-c++/sdbus-c++.h>

#include "services/finding/SurroundingsWatch.h"
#include "tests/engine/Process.h"

namespace quorl::finding::test {

/// What stands on a bus of its own for the disk service.
class DiskServiceDouble {
  public:
    DiskServiceDouble();
    ~DiskServiceDouble();

    /// A stick with this file system, which can be ejected.
    /// @param number of the device, as `stat` gives it
    void plugIn(const std::string& uuid, const std::string& label, std::uint64_t number);
    void pullOut(const std::string& uuid);

    /// Unmounting fails with this error of the service from now on; none where it is empty.
    void failWith(const std::string& error);

    /// What it was asked to do, in order, as in "Unmount A".
    [[nodiscard]] std::vector<std::string> asked() const;

    [[nodiscard]] const std::string& address() const { return bus_.address(); }

    [[nodiscard]] Connect connect() const;

  private:
    struct Stick;

    void note(const std::string& what);

    syncd::testing::SecondBus bus_;
    std::unique_ptr<sdbus::IConnection> connection_;
    std::map<std::string, std::unique_ptr<Stick>> sticks_;
    mutable std::mutex mutex_;
    std::vector<std::string> asked_;
    std::string error_;
};

} // namespace quorl::finding::test
