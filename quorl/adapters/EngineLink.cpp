#include "quorl/adapters/EngineLink.h"

#include <algorithm>

#include "platform/Dispatch.h"

namespace quorl {

/// What the client's thread and the main thread have in common. Held weakly by what is on its way
/// from the one to the other.
struct EngineLink::Shared {
    explicit Shared(Changed callback) : changed(std::move(callback)) {}

    [[nodiscard]] std::shared_ptr<EngineSession> session(const engine::SessionState& session);

    const Changed changed; ///< main thread only
    std::mutex mutex;
    std::vector<std::pair<std::string, std::shared_ptr<EngineSession>>> sessions; ///< by path
};

namespace {

/// Tells the main thread that something changed; the set of sessions too, where `setChanged` says
/// so.
template <class Shared>
void announce(const std::shared_ptr<Shared>& shared, bool setChanged, std::string problem = {}) {
    dispatch_async(dispatch_get_main_queue(),
                   [reference = std::weak_ptr(shared), setChanged, problem = std::move(problem)] {
                       const auto alive = reference.lock();
                       if (!alive) {
                           return;
                       }
                       if (setChanged) {
                           NSNotificationCenter::defaultCenter().postNotificationName_object(
                               DVSessionsDidChangeNotification, nullptr);
                       }
                       alive->changed(problem);
                   });
}

} // namespace

/// The object that stands for a session, with its figures taken over; made where there is none yet.
std::shared_ptr<EngineSession> EngineLink::Shared::session(const engine::SessionState& session) {
    const std::lock_guard lock(mutex);
    const auto known =
        std::find_if(sessions.begin(), sessions.end(),
                     [&session](const auto& entry) { return entry.first == session.path; });
    if (known != sessions.end()) {
        known->second->update(session);
        return known->second;
    }
    return sessions.emplace_back(session.path, std::make_shared<EngineSession>(session)).second;
}

EngineLink::EngineLink(Places places, Changed changed)
    : places_(std::move(places)),
      shared_(std::make_shared<Shared>(std::move(changed))),
      client_(*this) {}

NSArray<DVSession> EngineLink::sessions(const std::string& type) const {
    auto sessions = std::make_shared<std::vector<std::shared_ptr<DVSession>>>();
    const std::lock_guard lock(shared_->mutex);
    for (const auto& [path, session] : shared_->sessions) {
        if (session->type() == type) {
            sessions->push_back(session);
        }
    }
    return sessions;
}

void EngineLink::tellPlaces() {
    const auto state = client_.state();
    if (!state.isThere) {
        return;
    }
    // A place is told only where it is another one: the engine begins anew with it.
    if (places_.music != std::filesystem::path(state.engine.musicFolder)) {
        client_.setMusicFolder(places_.music.string());
    }
    const bool isOther = places_.wearable.empty()
                             ? !state.wearable.isEmbedded
                             : places_.wearable != std::filesystem::path(state.wearable.directory);
    if (isOther) {
        client_.setWearableDirectory(places_.wearable.string());
    }
}

void EngineLink::engineDidAppear(const engine::EngineState& state) {
    replaceSessions(state.sessions);
    dispatch_async(dispatch_get_main_queue(), [this, reference = std::weak_ptr(shared_)] {
        if (!reference.expired()) {
            tellPlaces();
        }
    });
}

void EngineLink::engineDidVanish(const std::string& /*reason*/) { replaceSessions({}); }

void EngineLink::busDidVanish(const std::string& problem) {
    replaceSessions({});
    announce(shared_, false, problem);
}

void EngineLink::sessionWillBegin(const engine::SessionState& session) {
    const auto object = shared_->session(session);
    object->tellObservers(
        [&object](DVSessionObserver& observer) { observer.sessionWillBegin(*object); });
    announce(shared_, true);
}

void EngineLink::taskWillBegin(const engine::SessionState& session, const engine::TaskState& task) {
    tellTask(session, task, &DVSessionObserver::session_willBeginSessionTask);
}

void EngineLink::taskDidBegin(const engine::SessionState& session, const engine::TaskState& task) {
    tellTask(session, task, &DVSessionObserver::session_didBeginSessionTask);
}

void EngineLink::taskDidUpdate(const engine::SessionState& session, const engine::TaskState& task) {
    tellTask(session, task, &DVSessionObserver::session_didUpdateSessionTask);
}

void EngineLink::taskDidFinish(const engine::SessionState& session, const engine::TaskState& task,
                               bool /*success*/, const std::string& /*message*/) {
    tellTask(session, task, &DVSessionObserver::session_didFinishSessionTask);
}

void EngineLink::sessionDidFinish(const engine::SessionState& session, bool /*success*/,
                                  const std::string& /*message*/) {
    const auto object = shared_->session(session);
    object->tellObservers(
        [&object](DVSessionObserver& observer) { observer.sessionDidFinish(*object); });
    announce(shared_, false);
}

void EngineLink::sessionDidVanish(const engine::SessionState& session) {
    {
        const std::lock_guard lock(shared_->mutex);
        std::erase_if(shared_->sessions,
                      [&session](const auto& entry) { return entry.first == session.path; });
    }
    announce(shared_, true);
}

void EngineLink::statusDidChange() { announce(shared_, false); }

void EngineLink::tellTask(const engine::SessionState& session, const engine::TaskState& task,
                          TaskMessage message) {
    const auto object = shared_->session(session);
    const auto taskObject = object->update(task);
    object->tellObservers([&object, &taskObject, message](DVSessionObserver& observer) {
        (observer.*message)(*object, *taskObject);
    });
}

/// Sessions that stay keep their objects.
void EngineLink::replaceSessions(const std::vector<engine::SessionState>& sessions) {
    std::vector<std::pair<std::string, std::shared_ptr<EngineSession>>> current;
    for (const engine::SessionState& session : sessions) {
        current.emplace_back(session.path, shared_->session(session));
    }
    {
        const std::lock_guard lock(shared_->mutex);
        shared_->sessions = std::move(current);
    }
    announce(shared_, true);
}

} // namespace quorl
