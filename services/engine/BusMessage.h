#pragma once

#include <map>
#include <string>
#include <variant>
#include <vector>

#include "services/engine/EngineState.h"

/// What the bus says about an engine, as plain values.
namespace quorl::engine {

/// By the name of the interface.
using Interfaces = std::map<std::string, Properties>;
using Objects = std::map<sdbus::ObjectPath, Interfaces>;

/// All that there is at this moment: the answer of the object manager.
struct ObjectsListed {
    Objects objects;
};

struct ObjectAdded {
    std::string path;
    Interfaces interfaces;
};

struct ObjectRemoved {
    std::string path;
    std::vector<std::string> interfaces;
};

struct PropertiesChanged {
    std::string path;
    std::string interface;
    Properties properties;
};

/// A signal of a session or of a task.
struct ObjectSignalled {
    std::string path;
    std::string interface;
    std::string signal;
    /// What `Completed` brings; nothing for other signals.
    bool success = false;
    std::string message = {};
};

/// There is no engine, or none any more; a sentence for the user says why.
struct EngineGone {
    std::string reason;
};

/// The same for the bus itself.
struct BusGone {
    std::string problem;
};

using BusMessage = std::variant<ObjectsListed, ObjectAdded, ObjectRemoved, PropertiesChanged,
                                ObjectSignalled, EngineGone, BusGone>;

} // namespace quorl::engine
