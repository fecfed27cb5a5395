#include "quorl/adapters/EngineLink.h"

#include <mutex>

#include "platform/Dispatch.h"
#include "services/engine/PendingEvents.h"

namespace quorl {

using Kind = engine::Event::Kind;

/// What the client's thread leaves for the main thread.
struct EngineLink::Inbox {
    /// True: nothing was there before.
    bool add(const engine::Event& event) {
        const std::lock_guard lock(mutex);
        const bool wasEmpty = events.isEmpty();
        events.add(event);
        return wasEmpty;
    }

    [[nodiscard]] std::vector<engine::Event> take() {
        const std::lock_guard lock(mutex);
        return events.take();
    }

    std::mutex mutex;
    engine::PendingEvents events;
};

namespace {

bool isAboutTask(Kind kind) {
    return kind == Kind::TaskWillBegin || kind == Kind::TaskDidBegin ||
           kind == Kind::TaskDidUpdate || kind == Kind::TaskDidFinish;
}

/// Whether sessions may have come or gone.
bool isAboutSet(Kind kind) {
    return !isAboutTask(kind) && kind != Kind::SessionDidFinish && kind != Kind::StatusDidChange;
}

using TaskMessage = void (DVSessionObserver::*)(DVSession&, DVSessionTask&);

TaskMessage taskMessage(Kind kind) {
    switch (kind) {
    case Kind::TaskWillBegin:
        return &DVSessionObserver::session_willBeginSessionTask;
    case Kind::TaskDidBegin:
        return &DVSessionObserver::session_didBeginSessionTask;
    case Kind::TaskDidUpdate:
        return &DVSessionObserver::session_didUpdateSessionTask;
    default:
        return &DVSessionObserver::session_didFinishSessionTask;
    }
}

} // namespace

EngineLink::EngineLink(base::Purpose purpose, Changed changed)
    : changed_(std::move(changed)),
      inbox_(std::make_shared<Inbox>()),
      client_(
          [this](const engine::Event& event) {
              if (inbox_->add(event)) {
                  // The link may be gone when the main thread gets to it.
                  dispatch_async(dispatch_get_main_queue(), [this, inbox = std::weak_ptr(inbox_)] {
                      if (!inbox.expired()) {
                          fetch();
                      }
                  });
              }
          },
          engine::busNameFor(purpose)) {}

NSArray<DVSession> EngineLink::sessions(const std::string& type) const {
    auto sessions = std::make_shared<std::vector<std::shared_ptr<DVSession>>>();
    std::copy_if(sessions_.begin(), sessions_.end(), std::back_inserter(*sessions),
                 [&type](const auto& session) { return session->type() == type; });
    return sessions;
}

void EngineLink::ask(Request request, Done done) {
    (client_.*request)(onMainQueue(std::move(done)));
}

void EngineLink::chooseWearable(const std::filesystem::path& directory, Done done) {
    client_.setWearableDirectory(directory.string(), onMainQueue(std::move(done)));
}

void EngineLink::setWatching(bool isWatching, Done done) {
    client_.setWatching(isWatching, onMainQueue(std::move(done)));
}

engine::Client::Reply EngineLink::onMainQueue(Done done) const {
    return [inbox = std::weak_ptr(inbox_), done = std::move(done)](const std::string& problem) {
        dispatch_async(dispatch_get_main_queue(), [inbox, done, problem] {
            if (!inbox.expired()) {
                done(problem);
            }
        });
    };
}

void EngineLink::fetch() {
    for (const engine::Event& event : inbox_->take()) {
        take(event);
    }
}

void EngineLink::take(const engine::Event& event) {
    state_ = event.state;
    showAll(sessions_, state_->sessions, state_);
    tellObservers(event);
    if (isAboutSet(event.kind)) {
        NSNotificationCenter::defaultCenter().postNotificationName_object(
            DVSessionsDidChangeNotification, nullptr);
    }
    changed_(event);
}

void EngineLink::tellObservers(const engine::Event& event) const {
    const auto session = event.session ? find(sessions_, event.session->path) : nullptr;
    if (!session) {
        return;
    }
    session->tellObservers([&](DVSessionObserver& observer) {
        if (event.kind == Kind::SessionWillBegin) {
            observer.sessionWillBegin(*session);
        } else if (event.kind == Kind::SessionDidFinish) {
            observer.sessionDidFinish(*session);
        } else if (event.task) {
            (observer.*taskMessage(event.kind))(*session, *session->task(event.task->path));
        }
    });
}

} // namespace quorl
