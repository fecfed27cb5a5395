#include "services/engine/Client.h"

#include <algorithm>
#include <thread>
#include <utility>

#include "services/engine/BusLoop.h"
#include "services/engine/Interface.h"

namespace quorl::engine {

namespace {

constexpr auto managerInterface = "org.freedesktop.DBus.ObjectManager";
constexpr auto propertiesInterface = "org.freedesktop.DBus.Properties";
constexpr auto daemonName = "org.freedesktop.DBus";

using Interfaces = std::map<std::string, Properties>;
using Objects = std::map<sdbus::ObjectPath, Interfaces>;

std::unique_ptr<sdbus::IConnection> connectToSession(std::string& problem) {
    try {
        return sdbus::createSessionBusConnection();
    } catch (const sdbus::Error& error) {
        problem = error.getMessage();
        return nullptr;
    }
}

/// A handler of messages that passes over those which are not as they should be.
template <class Handler>
sdbus::message_handler tolerant(Handler handler) {
    return [handler](sdbus::Message& message) {
        try {
            handler(message);
        } catch (const sdbus::Error&) {
            // Some other engine; what it meant cannot be known.
        }
    };
}

template <class Item>
Item* find(std::vector<Item>& items, const std::string& path) {
    const auto found = std::ranges::find(items, path, &Item::path);
    return found == items.end() ? nullptr : &*found;
}

const Properties* propertiesOf(const Interfaces& interfaces, const char* name) {
    const auto found = interfaces.find(name);
    return found == interfaces.end() ? nullptr : &found->second;
}

std::string sessionOf(const Properties& task) {
    const auto found = task.find("Session");
    return found != task.end() && found->second.containsValueOfType<sdbus::ObjectPath>()
               ? found->second.get<sdbus::ObjectPath>()
               : std::string{};
}

} // namespace

/// The thread and what belongs to it. Besides `state` and `request`, everything happens there.
class Client::Connection {
  public:
    Connection(Listener& listener, std::string name);
    ~Connection();

    [[nodiscard]] EngineState state() const {
        const std::scoped_lock lock{mutex_};
        return state_;
    }

    using Action = std::function<void(std::function<void(const sdbus::Error*)> done)>;

    void request(Action action, Reply reply);
    void callMethod(const char* path, const char* interface, const char* method, Reply reply);

    template <class State, PropertyName name, class T>
    void setProperty(const char* path, const T& value, Reply reply) {
        constexpr auto property = propertyOf<State, name>();
        static_assert(property.access == Access::ReadWrite);
        static_assert(std::is_same_v<T, std::decay_t<decltype(valueOf<name>(State()))>>);
        set(path, Interface<State>::name, property.name, sdbus::Variant(value), std::move(reply));
    }

  private:
    void set(const char* path, const char* interface, const char* property, sdbus::Variant value,
             Reply reply);
    void work();
    void open();
    void fetchState();
    void takeState(const Objects& objects);
    void noteEngineGone(const std::string& reason);
    void answer(std::uint64_t number, const std::string& problem);
    void answerAll(const std::string& problem);

    void onOwnerChanged(sdbus::Message& message);
    void onSignal(sdbus::Message& message);
    void onAdded(const std::string& path, const Interfaces& interfaces);
    void onRemoved(const std::string& path);
    void onChanged(const std::string& path, const std::string& interface,
                   const Properties& properties);
    void onTaskSignal(const std::string& path, const std::string& signal, sdbus::Message& message);
    void onSessionCompleted(const std::string& path, sdbus::Message& message);

    /// Adds what the object is to `state`; true where it was a session or a task.
    static void add(EngineState& state, const std::string& path, const Interfaces& interfaces);
    static std::pair<SessionState*, TaskState*> findTask(EngineState& state,
                                                         const std::string& path);

    template <class Change>
    auto change(Change change) {
        const std::scoped_lock lock{mutex_};
        return change(state_);
    }

    Listener& listener_;
    const std::string name_;

    /// Empty as long as the bus is there.
    std::string busProblem_;
    BusLoop loop_;
    std::unique_ptr<sdbus::IProxy> manager_;
    std::map<std::string, std::unique_ptr<sdbus::IProxy>> proxies_;
    std::map<std::uint64_t, Reply> replies_;
    std::uint64_t lastRequest_ = 0;
    /// Which answer about all objects is the one that counts.
    std::uint64_t fetches_ = 0;

    mutable std::mutex mutex_;
    EngineState state_;

    std::thread thread_;
};

Client::Connection::Connection(Listener& listener, std::string name)
    : listener_{listener}, name_{std::move(name)}, loop_{connectToSession(busProblem_)} {
    thread_ = std::thread{[this] { work(); }};
}

Client::Connection::~Connection() {
    loop_.stop();
    thread_.join();
}

void Client::Connection::work() {
    if (busProblem_.empty()) {
        loop_.post([this] { open(); });
        busProblem_ = loop_.run();
    }
    if (!busProblem_.empty()) {
        busProblem_ = "The session bus is gone (" + busProblem_ + "). Log in again.";
        noteEngineGone(busProblem_);
        listener_.busDidVanish(busProblem_);
        answerAll(busProblem_);
        static_cast<void>(loop_.run());
    }
    answerAll("The connection to the sync engine was closed.");
    // Before the bus that they belong to.
    proxies_.clear();
    manager_.reset();
}

/// Subscribes first, so that nothing is missed between the state and the first signal.
void Client::Connection::open() {
    auto& bus = loop_.bus();
    const auto sender = "type='signal',sender='" + name_ + "',path_namespace='" + managerPath + "'";
    bus.addMatch(sender, tolerant([this](sdbus::Message& message) { onSignal(message); }),
                 sdbus::floating_slot);
    bus.addMatch("type='signal',sender='" + std::string{daemonName} +
                     "',member='NameOwnerChanged',arg0='" + name_ + "'",
                 tolerant([this](sdbus::Message& message) { onOwnerChanged(message); }),
                 sdbus::floating_slot);
    manager_ = sdbus::createProxy(bus, name_, managerPath);
    // The bus starts the engine where it can.
    fetchState();
}

void Client::Connection::fetchState() {
    const auto number = ++fetches_;
    manager_->callMethodAsync("GetManagedObjects")
        .onInterface(managerInterface)
        .uponReplyInvoke([this, number](const sdbus::Error* error, const Objects& objects) {
            if (number != fetches_) {
                return;
            }
            if (error != nullptr) {
                noteEngineGone(error->getMessage());
            } else {
                takeState(objects);
            }
        });
}

/// What was signalled before this answer is in it, and was passed over.
void Client::Connection::takeState(const Objects& objects) {
    EngineState state;
    state.isThere = true;
    for (const auto& [path, interfaces] : objects) {
        if (propertiesOf(interfaces, taskInterface) == nullptr) {
            add(state, path, interfaces);
        }
    }
    for (const auto& [path, interfaces] : objects) {
        if (propertiesOf(interfaces, taskInterface) != nullptr) {
            add(state, path, interfaces);
        }
    }
    change([&](EngineState& ours) { ours = state; });
    listener_.engineDidAppear(state);
}

void Client::Connection::noteEngineGone(const std::string& reason) {
    ++fetches_;
    change([](EngineState& state) { state = {}; });
    listener_.engineDidVanish(reason);
}

void Client::Connection::onOwnerChanged(sdbus::Message& message) {
    std::string name;
    std::string before;
    std::string now;
    message >> name >> before >> now;
    if (now.empty()) {
        noteEngineGone("The sync engine has ended.");
    } else {
        fetchState();
    }
}

void Client::Connection::onSignal(sdbus::Message& message) {
    if (!state().isThere) {
        return;
    }
    const auto interface = message.getInterfaceName();
    const auto member = message.getMemberName();
    const auto path = message.getPath();
    if (interface == managerInterface && member == "InterfacesAdded") {
        sdbus::ObjectPath added;
        Interfaces interfaces;
        message >> added >> interfaces;
        onAdded(added, interfaces);
    } else if (interface == managerInterface && member == "InterfacesRemoved") {
        sdbus::ObjectPath removed;
        message >> removed;
        onRemoved(removed);
    } else if (interface == propertiesInterface && member == "PropertiesChanged") {
        std::string changed;
        Properties properties;
        message >> changed >> properties;
        onChanged(path, changed, properties);
    } else if (interface == taskInterface) {
        onTaskSignal(path, member, message);
    } else if (interface == sessionInterface && member == "Completed") {
        onSessionCompleted(path, message);
    }
}

void Client::Connection::add(EngineState& state, const std::string& path,
                             const Interfaces& interfaces) {
    if (const auto* const properties = propertiesOf(interfaces, engineInterface)) {
        update(state.engine, *properties);
    }
    if (const auto* const properties = propertiesOf(interfaces, wearableInterface)) {
        update(state.wearable, *properties);
    }
    if (const auto* const properties = propertiesOf(interfaces, sessionInterface)) {
        auto& session = state.sessions.emplace_back();
        session.path = path;
        update(session, *properties);
    }
    if (const auto* const properties = propertiesOf(interfaces, taskInterface)) {
        if (auto* const session = find(state.sessions, sessionOf(*properties))) {
            auto& task = session->tasks.emplace_back();
            task.path = path;
            update(task, *properties);
        }
    }
}

void Client::Connection::onAdded(const std::string& path, const Interfaces& interfaces) {
    const auto session = change([&](EngineState& state) {
        add(state, path, interfaces);
        const auto* const added = find(state.sessions, path);
        return added == nullptr ? SessionState{} : *added;
    });
    if (!session.path.empty()) {
        listener_.sessionWillBegin(session);
    }
}

void Client::Connection::onRemoved(const std::string& path) {
    const auto session = change([&](EngineState& state) {
        SessionState removed;
        if (const auto* const found = find(state.sessions, path)) {
            removed = *found;
        }
        std::erase_if(state.sessions, [&](const SessionState& each) { return each.path == path; });
        for (auto& each : state.sessions) {
            std::erase_if(each.tasks, [&](const TaskState& task) { return task.path == path; });
        }
        return removed;
    });
    if (!session.path.empty()) {
        listener_.sessionDidVanish(session);
    }
}

void Client::Connection::onChanged(const std::string& path, const std::string& interface,
                                   const Properties& properties) {
    if (interface == taskInterface) {
        SessionState session;
        TaskState task;
        const bool isUpdate = change([&](EngineState& state) {
            const auto [ofTask, changed] = findTask(state, path);
            if (changed == nullptr) {
                return false;
            }
            const bool wasRunning = changed->isRunning;
            update(*changed, properties);
            session = *ofTask;
            task = *changed;
            // Its beginning and its end are told on their own.
            return task.isRunning == wasRunning;
        });
        if (isUpdate) {
            listener_.taskDidUpdate(session, task);
        }
    } else if (interface == sessionInterface) {
        change([&](EngineState& state) {
            if (auto* const session = find(state.sessions, path)) {
                update(*session, properties);
            }
        });
    } else if (interface == engineInterface || interface == wearableInterface) {
        change([&](EngineState& state) {
            if (interface == engineInterface) {
                update(state.engine, properties);
            } else {
                update(state.wearable, properties);
            }
        });
        listener_.statusDidChange();
    }
}

std::pair<SessionState*, TaskState*> Client::Connection::findTask(EngineState& state,
                                                                  const std::string& path) {
    for (auto& session : state.sessions) {
        if (auto* const task = find(session.tasks, path)) {
            return {&session, task};
        }
    }
    return {nullptr, nullptr};
}

void Client::Connection::onTaskSignal(const std::string& path, const std::string& signal,
                                      sdbus::Message& message) {
    auto now = state();
    const auto [session, task] = findTask(now, path);
    if (task == nullptr) {
        return;
    }
    if (signal == "WillBegin") {
        listener_.taskWillBegin(*session, *task);
    } else if (signal == "DidBegin") {
        listener_.taskDidBegin(*session, *task);
    } else if (signal == "Completed") {
        bool success = false;
        std::string text;
        message >> success >> text;
        listener_.taskDidFinish(*session, *task, success, text);
    }
}

void Client::Connection::onSessionCompleted(const std::string& path, sdbus::Message& message) {
    bool success = false;
    std::string text;
    message >> success >> text;
    auto now = state();
    if (const auto* const session = find(now.sessions, path)) {
        listener_.sessionDidFinish(*session, success, text);
    }
}

void Client::Connection::request(Action action, Reply reply) {
    loop_.post([this, action = std::move(action), reply = std::move(reply)]() mutable {
        const auto number = ++lastRequest_;
        replies_.emplace(
            number, reply ? std::move(reply) : [](const std::string&) {});
        if (!busProblem_.empty()) {
            answer(number, busProblem_);
            return;
        }
        try {
            action([this, number](const sdbus::Error* error) {
                answer(number, error == nullptr ? std::string{} : error->getMessage());
            });
        } catch (const sdbus::Error& error) {
            answer(number, error.getMessage());
        }
    });
}

void Client::Connection::answer(std::uint64_t number, const std::string& problem) {
    if (const auto found = replies_.extract(number)) {
        found.mapped()(problem);
    }
}

void Client::Connection::answerAll(const std::string& problem) {
    while (!replies_.empty()) {
        answer(replies_.begin()->first, problem);
    }
}

void Client::Connection::callMethod(const char* path, const char* interface, const char* method,
                                    Reply reply) {
    request(
        [this, path, interface, method](auto done) {
            auto& proxy = proxies_[path];
            if (!proxy) {
                proxy = sdbus::createProxy(loop_.bus(), name_, path);
            }
            proxy->callMethodAsync(method).onInterface(interface).uponReplyInvoke(std::move(done));
        },
        std::move(reply));
}

void Client::Connection::set(const char* path, const char* interface, const char* property,
                             sdbus::Variant value, Reply reply) {
    request(
        [this, path, interface, property, value = std::move(value)](auto done) {
            auto& proxy = proxies_[path];
            if (!proxy) {
                proxy = sdbus::createProxy(loop_.bus(), name_, path);
            }
            proxy->callMethodAsync("Set")
                .onInterface(propertiesInterface)
                .withArguments(std::string{interface}, std::string{property}, value)
                .uponReplyInvoke(std::move(done));
        },
        std::move(reply));
}

Client::Client(Listener& listener, std::string name)
    : connection_{std::make_unique<Connection>(listener, std::move(name))} {}

Client::~Client() = default;

EngineState Client::state() const { return connection_->state(); }

void Client::startNow(Reply reply) {
    connection_->callMethod(enginePath, engineInterface, "StartNow", std::move(reply));
}

void Client::cancel(Reply reply) {
    connection_->callMethod(enginePath, engineInterface, "Cancel", std::move(reply));
}

void Client::setMusicFolder(const std::string& path, Reply reply) {
    connection_->setProperty<EngineStatus, "MusicFolder">(enginePath, path, std::move(reply));
}

void Client::setRateLimit(std::uint64_t bytesPerSecond, Reply reply) {
    connection_->setProperty<EngineStatus, "RateLimit">(enginePath, bytesPerSecond,
                                                        std::move(reply));
}

void Client::setWearableDirectory(const std::string& path, Reply reply) {
    connection_->setProperty<WearableStatus, "Directory">(wearablePath, path, std::move(reply));
}

void Client::setConnected(bool connected, Reply reply) {
    connection_->setProperty<WearableStatus, "Connected">(wearablePath, connected,
                                                          std::move(reply));
}

void Client::setOnCharger(bool onCharger, Reply reply) {
    connection_->setProperty<WearableStatus, "OnCharger">(wearablePath, onCharger,
                                                          std::move(reply));
}

void Client::refreshWearable(Reply reply) {
    connection_->callMethod(wearablePath, wearableInterface, "Refresh", std::move(reply));
}

} // namespace quorl::engine
