#pragma once

#include <functional>
#include <memory>
#include <string>

#include <sdbus-c++/sdbus-c++.h>

namespace quorl::syncd {

class Engine;
class Watchers;

/// The engine and its wearable as bus objects, and the manager of these and of the sessions. The
/// bus loop's thread.
class BusObjects {
  public:
    /// What is done with a directory that a client has chosen. Gives back an empty text, or a
    /// sentence that says why it cannot be done.
    using Directory = std::function<std::string(const std::string& directory)>;

    /// What it takes to choose a place, besides the engine.
    struct PlaceKeeper {
        Directory check; ///< whether the engine can work with it
        Directory rememberMusicFolder;
        Directory rememberWearable;
    };

    /// All of these outlive the objects.
    BusObjects(sdbus::IConnection& bus, Engine& engine, const PlaceKeeper& keeper,
               Watchers& watchers);
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
