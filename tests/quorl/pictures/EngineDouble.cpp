#include "tests/quorl/pictures/EngineDouble.h"

#include "services/engine/Interface.h"

namespace quorl::tests {

using namespace engine;

template <class State>
void EngineDouble::publish(const std::string& path, const State& state) {
    auto& object = objects_.emplace_back(sdbus::createObject(*bus_, path));
    forEachProperty<State>([&]<class T>(const Property<State, T>& property) {
        object->registerProperty(property.name)
            .onInterface(Interface<State>::name)
            .withGetter([value = static_cast<OnBus<T>>(state.*property.member)] { return value; });
    });
    object->finishRegistration();
}

EngineDouble::EngineDouble(const EngineState& state) : bus_(sdbus::createSessionBusConnection()) {
    objects_.push_back(sdbus::createObject(*bus_, managerPath));
    objects_.back()->addObjectManager();
    publish(enginePath, state.engine);
    publish(wearablePath, state.wearable);
    for (const auto& session : state.sessions) {
        publish(session.path, session);
        for (const auto& task : session.tasks) {
            publish(task.path, task);
        }
    }
    bus_->requestName(busName);
    bus_->enterEventLoopAsync();
}

EngineDouble::~EngineDouble() { bus_->leaveEventLoop(); }

} // namespace quorl::tests
