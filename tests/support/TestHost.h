#pragma once

#include "doubles/HostDouble.h"
#include "tests/support/Journal.h"

namespace quorl::tests {

/// A host of which everything is told and seen: one with music and platform sizes, at some moment
/// of the present, whose wearable replies when the test has it reply. The process-wide objects of
/// the plug-in keep to the host that was there when they were made, so each test runs in a process
/// of its own, as ctest does it.
class TestHost : public HostDouble {
  public:
    TestHost();

    /// Makes one and installs it.
    static std::shared_ptr<TestHost> installed();

    Journal& journal;

  private:
    explicit TestHost(const std::shared_ptr<Journal>& recorder);
};

} // namespace quorl::tests
