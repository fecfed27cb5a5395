#include "services/engine/EngineState.h"

namespace quorl::engine {

namespace {

template <class T>
void take(const Properties& properties, const char* name, T& value) {
    const auto found = properties.find(name);
    if (found != properties.end() && found->second.containsValueOfType<T>()) {
        value = found->second.get<T>();
    }
}

} // namespace

void update(TaskState& task, const Properties& properties) {
    take(properties, "GroupingKey", task.groupingKey);
    take(properties, "Running", task.isRunning);
    take(properties, "TotalItemCount", task.totalItemCount);
    take(properties, "CompletedItemCount", task.completedItemCount);
    take(properties, "Progress", task.progress);
}

void update(SessionState& session, const Properties& properties) {
    take(properties, "TypeIdentifier", session.typeIdentifier);
    take(properties, "Finished", session.isFinished);
}

void update(WearableStatus& wearable, const Properties& properties) {
    take(properties, "Directory", wearable.directory);
    take(properties, "Name", wearable.name);
    take(properties, "Embedded", wearable.isEmbedded);
    take(properties, "Connected", wearable.isConnected);
    take(properties, "OnCharger", wearable.isOnCharger);
    take(properties, "Capacity", wearable.capacity);
    take(properties, "Available", wearable.available);
    take(properties, "Songs", wearable.songs);
}

void update(EngineStatus& engine, const Properties& properties) {
    take(properties, "MusicFolder", engine.musicFolder);
    take(properties, "RateLimit", engine.rateLimit);
    take(properties, "Status", engine.status);
    take(properties, "LastSuccess", engine.lastSuccess);
    take(properties, "LastMessage", engine.lastMessage);
    take(properties, "LastTime", engine.lastTime);
}

} // namespace quorl::engine
