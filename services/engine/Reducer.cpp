#include "services/engine/Reducer.h"

#include <algorithm>

#include "services/engine/Interface.h"
#include "services/engine/Message.h"

namespace quorl::engine {

namespace {

using Kind = Event::Kind;
using StatePointer = std::shared_ptr<const EngineState>;

template <class Items>
auto* find(Items& items, const std::string& path) {
    const auto found =
        std::ranges::find_if(items, [&](const auto& item) { return item.path == path; });
    return found == items.end() ? nullptr : &*found;
}

/// The session that has the task of this path; null: none has.
template <class Sessions>
auto* findSessionOf(Sessions& sessions, const std::string& path) {
    const auto found = std::ranges::find_if(
        sessions, [&](auto& session) { return find(session.tasks, path) != nullptr; });
    return found == sessions.end() ? nullptr : &*found;
}

/// In the words of this program, which knows what language it is read in; those of the engine for
/// what is not known here.
void word(std::string& sentence, const std::string& code,
          const std::vector<std::string>& arguments) {
    if (auto own = engine::sentence({code, arguments}); !own.empty()) {
        sentence = std::move(own);
    }
}

void updateEngine(EngineStatus& engine, const Properties& properties) {
    update(engine, properties);
    word(engine.status, engine.statusCode, engine.statusArguments);
    word(engine.lastMessage, engine.lastCode, engine.lastArguments);
}

Reduced nothing(const StatePointer& state) { return {state}; }

Reduced tell(Kind kind, const StatePointer& state, const SessionState* session = nullptr,
             const TaskState* task = nullptr) {
    return {
        state,
        Event{.kind = kind, .state = state, .session = {state, session}, .task = {state, task}}};
}

Reduced tellEnd(Kind kind, const StatePointer& state, const std::string& message) {
    return {state, Event{.kind = kind, .state = state, .message = message}};
}

template <class State>
const Properties* propertiesOf(const Interfaces& interfaces) {
    const auto found = interfaces.find(Interface<State>::name);
    return found == interfaces.end() ? nullptr : &found->second;
}

/// Puts `item` with these properties at the end, or in the place of the one with this path.
template <class Item>
Item& put(std::vector<Item>& items, const std::string& path, const Properties& properties) {
    auto* item = find(items, path);
    if (item == nullptr) {
        item = &items.emplace_back();
        item->path = path;
    }
    update(*item, properties);
    return *item;
}

/// Where the properties do not name a session that is there, nobody could be told of the task.
void putTask(EngineState& state, const std::string& path, const Properties& properties) {
    TaskState task;
    update(task, properties);
    if (auto* const session = find(state.sessions, task.session)) {
        put(session->tasks, path, properties);
    }
}

Reduced take(const StatePointer& /*before*/, const ObjectsListed& message) {
    const auto state = std::make_shared<EngineState>();
    state->isThere = true;
    for (const auto& [path, interfaces] : message.objects) {
        if (const auto* const properties = propertiesOf<EngineStatus>(interfaces)) {
            updateEngine(state->engine, *properties);
        }
        if (const auto* const properties = propertiesOf<WearableStatus>(interfaces)) {
            update(state->wearable, *properties);
        }
        if (const auto* const properties = propertiesOf<SessionState>(interfaces)) {
            put(state->sessions, path, *properties);
        }
    }
    for (const auto& [path, interfaces] : message.objects) {
        if (const auto* const properties = propertiesOf<TaskState>(interfaces)) {
            putTask(*state, path, *properties);
        }
    }
    return tell(Kind::EngineDidAppear, state);
}

Reduced take(const StatePointer& before, const ObjectAdded& message) {
    const auto state = std::make_shared<EngineState>(*before);
    if (const auto* const properties = propertiesOf<SessionState>(message.interfaces)) {
        const bool isNew = find(state->sessions, message.path) == nullptr;
        const auto& session = put(state->sessions, message.path, *properties);
        return isNew ? tell(Kind::SessionWillBegin, state, &session) : nothing(state);
    }
    if (const auto* const properties = propertiesOf<TaskState>(message.interfaces)) {
        putTask(*state, message.path, *properties);
    }
    return nothing(state);
}

Reduced take(const StatePointer& before, const ObjectRemoved& message) {
    const auto isAt = [&](const auto& item) { return item.path == message.path; };
    const auto has = [&](const char* interface) {
        return std::ranges::find(message.interfaces, interface) != message.interfaces.end();
    };
    const auto state = std::make_shared<EngineState>(*before);
    if (has(taskInterface)) {
        for (auto& session : state->sessions) {
            std::erase_if(session.tasks, isAt);
        }
    }
    if (!has(sessionInterface) || std::erase_if(state->sessions, isAt) == 0) {
        return nothing(state);
    }
    auto reduced = tell(Kind::SessionDidVanish, state);
    reduced.event->session = {before, &*std::ranges::find_if(before->sessions, isAt)};
    return reduced;
}

Reduced takeTask(const std::shared_ptr<EngineState>& state, const PropertiesChanged& message) {
    auto* const session = findSessionOf(state->sessions, message.path);
    if (session == nullptr) {
        return nothing(state);
    }
    auto& task = *find(session->tasks, message.path);
    const bool wasRunning = task.isRunning;
    update(task, message.properties);
    // Its beginning and its end are told on their own.
    return task.isRunning == wasRunning ? tell(Kind::TaskDidUpdate, state, session, &task)
                                        : nothing(state);
}

Reduced take(const StatePointer& before, const PropertiesChanged& message) {
    const auto state = std::make_shared<EngineState>(*before);
    if (message.interface == taskInterface) {
        return takeTask(state, message);
    }
    if (message.interface == sessionInterface) {
        if (auto* const session = find(state->sessions, message.path)) {
            update(*session, message.properties);
        }
        return nothing(state);
    }
    if (message.interface == engineInterface) {
        updateEngine(state->engine, message.properties);
    } else if (message.interface == wearableInterface) {
        update(state->wearable, message.properties);
    } else {
        return nothing(before);
    }
    return tell(Kind::StatusDidChange, state);
}

Reduced takeTask(const StatePointer& state, const ObjectSignalled& message) {
    const auto* const session = findSessionOf(state->sessions, message.path);
    if (session == nullptr) {
        return nothing(state);
    }
    const auto* const task = find(session->tasks, message.path);
    if (message.signal == "WillBegin") {
        return tell(Kind::TaskWillBegin, state, session, task);
    }
    if (message.signal == "DidBegin") {
        return tell(Kind::TaskDidBegin, state, session, task);
    }
    return message.signal == "Completed" ? tell(Kind::TaskDidFinish, state, session, task)
                                         : nothing(state);
}

Reduced takeSession(const StatePointer& state, const ObjectSignalled& message) {
    const auto* const session = find(state->sessions, message.path);
    return session != nullptr && message.signal == "Completed"
               ? tell(Kind::SessionDidFinish, state, session)
               : nothing(state);
}

Reduced take(const StatePointer& state, const ObjectSignalled& message) {
    auto reduced = message.interface == taskInterface      ? takeTask(state, message)
                   : message.interface == sessionInterface ? takeSession(state, message)
                                                           : nothing(state);
    if (reduced.event) {
        reduced.event->success = message.success;
        reduced.event->message = message.message;
    }
    return reduced;
}

Reduced take(const StatePointer& /*before*/, const EngineGone& message) {
    return tellEnd(Kind::EngineDidVanish, std::make_shared<EngineState>(), message.reason);
}

Reduced take(const StatePointer& /*before*/, const BusGone& message) {
    return tellEnd(Kind::BusDidVanish, std::make_shared<EngineState>(), message.problem);
}

/// Whether a message counts also as long as nothing is known of the engine. What is signalled then
/// is in the list that is on its way.
bool countsWithoutEngine(const BusMessage& message) {
    return std::holds_alternative<ObjectsListed>(message) ||
           std::holds_alternative<EngineGone>(message) || std::holds_alternative<BusGone>(message);
}

} // namespace

Reduced reduce(const StatePointer& state, const BusMessage& message) {
    if (!state->isThere && !countsWithoutEngine(message)) {
        return nothing(state);
    }
    return std::visit([&](const auto& each) { return take(state, each); }, message);
}

} // namespace quorl::engine
