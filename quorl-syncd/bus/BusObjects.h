#pragma once

#include <functional>
#include <memory>
#include <string>

#include <sdbus-c++/sdbus-c++.h>

namespace quorl::syncd {

class Engine;

/// The engine and its wearable as bus objects, and the manager of these and of the sessions. The
/// bus loop's thread.
class BusObjects {
  public:
    /// Says why the engine cannot work with a directory; an empty text where it can.
    using ObjectionTo = std::function<std::string(const std::string& directory)>;

    /// All of these outlive the objects.
    BusObjects(sdbus::IConnection& bus, Engine& engine, const ObjectionTo& objectionTo);
    ~BusObjects();

    BusObjects(const BusObjects&) = delete;
    BusObjects& operator=(const BusObjects&) = delete;

    /// Tells which properties have changed since the last time.
    void publish();

  private:
    class EngineObject;
    class WearableObject;

    const std::unique_ptr<EngineObject> engine_;
    const std::unique_ptr<WearableObject> wearable_;
};

} // namespace quorl::syncd
