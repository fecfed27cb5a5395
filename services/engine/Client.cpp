#include "services/engine/Client.h"

#include <optional>
#include <thread>
#include <utility>

#include "services/base/Utf8.h"
#include "services/engine/BusLoop.h"
#include "services/engine/Interface.h"
#include "services/engine/Reducer.h"
#include "services/language/Translated.h"

namespace quorl::engine {

using language::filled;
using language::translated;

namespace {

constexpr auto managerInterface = "org.freedesktop.DBus.ObjectManager";
constexpr auto propertiesInterface = "org.freedesktop.DBus.Properties";
constexpr auto daemonName = "org.freedesktop.DBus";

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

BusMessage addedBy(sdbus::Message& message) {
    sdbus::ObjectPath path;
    Interfaces interfaces;
    message >> path >> interfaces;
    return ObjectAdded{path, interfaces};
}

BusMessage removedBy(sdbus::Message& message) {
    sdbus::ObjectPath path;
    std::vector<std::string> interfaces;
    message >> path >> interfaces;
    return ObjectRemoved{path, interfaces};
}

BusMessage changedBy(sdbus::Message& message) {
    PropertiesChanged changed{.path = message.getPath(), .interface = {}, .properties = {}};
    message >> changed.interface >> changed.properties;
    return changed;
}

BusMessage signalledBy(sdbus::Message& message) {
    ObjectSignalled signalled{.path = message.getPath(),
                              .interface = message.getInterfaceName(),
                              .signal = message.getMemberName()};
    if (signalled.signal == "Completed") {
        message >> signalled.success >> signalled.message;
    }
    return signalled;
}

/// The plain value of a signal. Throws where it does not have what its name promises.
BusMessage messageOf(sdbus::Message& signal) {
    const auto interface = signal.getInterfaceName();
    const auto member = signal.getMemberName();
    if (interface == managerInterface) {
        return member == "InterfacesAdded" ? addedBy(signal) : removedBy(signal);
    }
    return interface == propertiesInterface ? changedBy(signal) : signalledBy(signal);
}

} // namespace

/// The thread and what belongs to it. Besides `request`, everything happens there.
class Client::Connection {
  public:
    Connection(Listener listener, std::string name);
    ~Connection();

    using Action = std::function<void(std::function<void(const sdbus::Error*)> done)>;

    void request(Action action, Reply reply);

    template <class State, PropertyName name>
    void setPath(const char* object, const std::string& path, Reply&& reply) {
        if (base::validUtf8(path) == path) {
            setProperty<State, name>(object, path, std::move(reply));
        } else {
            refuse(filled(translated("{path} cannot be told to the sync engine, for its name is "
                                     "not in UTF-8. Rename it."),
                          {{"path", base::printable(path)}}),
                   std::move(reply));
        }
    }

    void refuse(const std::string& why, Reply reply);
    void setWatching(bool isWatching, Reply reply);
    void callMethod(const char* path, const char* interface, const char* method, Reply reply);

    template <class State, PropertyName name, class T>
    void setProperty(const char* path, const T& value, Reply&& reply) {
        constexpr auto property = propertyOf<State, name>();
        static_assert(property.access == Access::ReadWrite);
        static_assert(std::is_same_v<T, std::decay_t<decltype(valueOf<name>(State()))>>);
        set(path, Interface<State>::name, property.name, sdbus::Variant(value), std::move(reply));
    }

  private:
    /// What a property is to become. Of many values in a row only the last one is sent, once the
    /// engine has answered to the one before.
    struct Setting {
        const char* path;
        const char* interface;
        const char* property;
        bool isUnderWay = false;
        std::optional<sdbus::Variant> value = {};
        /// Of all who want the value, or one that it has replaced.
        std::vector<Reply> replies = {};
    };

    void set(const char* path, const char* interface, const char* property, sdbus::Variant value,
             Reply reply);
    void send(Setting& setting);
    void wasSent(Setting& setting, const std::vector<Reply>& replies, const std::string& problem);
    void perform(const Action& action, Reply reply);
    void work();
    void open();
    void fetchState();
    void hear(const BusMessage& message);
    void tellWatching(Reply reply);
    void noteEngineGone(const std::string& reason);
    void answer(std::uint64_t number, const std::string& problem);
    void answerAll(const std::string& problem);

    void onOwnerChanged(sdbus::Message& message);

    const Listener listener_;
    const std::string name_;

    /// Empty as long as the bus is there.
    std::string busProblem_;
    BusLoop loop_;
    std::unique_ptr<sdbus::IProxy> manager_;
    std::map<std::string, std::unique_ptr<sdbus::IProxy>> proxies_;
    std::map<std::uint64_t, Reply> replies_;
    /// By the name of the property.
    std::map<std::string, Setting> settings_;
    std::uint64_t lastRequest_ = 0;
    bool isClosed_ = false;
    bool isWatching_ = false;
    /// Which answer about all objects is the one that counts.
    std::uint64_t fetches_ = 0;

    std::shared_ptr<const EngineState> state_ = std::make_shared<EngineState>();

    std::thread thread_;
};

Client::Connection::Connection(Listener listener, std::string name)
    : listener_(std::move(listener)), name_(std::move(name)), loop_(connectToSession(busProblem_)) {
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
        busProblem_ = filled(translated("The session bus is gone ({reason}). Log in again."),
                             {{"reason", busProblem_}});
        ++fetches_;
        hear(BusGone{busProblem_});
        answerAll(busProblem_);
        static_cast<void>(loop_.run());
    }
    isClosed_ = true;
    answerAll(translated("The connection to the sync engine was closed."));
    // Before the bus that they belong to.
    proxies_.clear();
    manager_.reset();
}

/// Subscribes first, so that nothing is missed between the state and the first signal.
void Client::Connection::open() {
    auto& bus = loop_.bus();
    const auto sender = "type='signal',sender='" + name_ + "',path_namespace='" + managerPath + "'";
    bus.addMatch(sender, tolerant([this](sdbus::Message& message) { hear(messageOf(message)); }),
                 sdbus::floating_slot);
    bus.addMatch("type='signal',sender='" + std::string(daemonName) +
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
                hear(ObjectsListed{objects});
            }
        });
}

void Client::Connection::hear(const BusMessage& message) {
    const auto reduced = reduce(state_, message);
    state_ = reduced.state;
    if (reduced.event) {
        listener_(*reduced.event);
    }
    if (isWatching_ && reduced.event && reduced.event->kind == Event::Kind::EngineDidAppear) {
        tellWatching({});
    }
}

void Client::Connection::tellWatching(Reply reply) {
    callMethod(enginePath, engineInterface, isWatching_ ? "Watch" : "Unwatch", std::move(reply));
}

void Client::Connection::setWatching(bool isWatching, Reply reply) {
    loop_.post([this, isWatching, reply = std::move(reply)]() mutable {
        const bool isNews = std::exchange(isWatching_, isWatching) != isWatching;
        if (isNews && state_->isThere) {
            tellWatching(std::move(reply));
        } else if (reply) {
            reply({});
        }
    });
}

void Client::Connection::noteEngineGone(const std::string& reason) {
    ++fetches_;
    hear(EngineGone{reason});
}

void Client::Connection::onOwnerChanged(sdbus::Message& message) {
    std::string name;
    std::string before;
    std::string now;
    message >> name >> before >> now;
    if (!before.empty()) {
        // The sessions of another engine are others, whatever their paths.
        noteEngineGone(translated("The sync engine has ended."));
    }
    if (!now.empty()) {
        fetchState();
    }
}

void Client::Connection::request(Action action, Reply reply) {
    loop_.post([this, action = std::move(action), reply = std::move(reply)]() mutable {
        perform(action, std::move(reply));
    });
}

void Client::Connection::perform(const Action& action, Reply reply) {
    const auto number = ++lastRequest_;
    replies_.emplace(
        number, reply ? std::move(reply) : [](const std::string&) {});
    if (!busProblem_.empty()) {
        answer(number, busProblem_);
        return;
    }
    try {
        action([this, number](const sdbus::Error* error) {
            answer(number, error == nullptr ? std::string() : error->getMessage());
        });
    } catch (const sdbus::Error& error) {
        answer(number, error.getMessage());
    }
}

void Client::Connection::refuse(const std::string& why, Reply reply) {
    request(
        [why](const auto&) { throw sdbus::Error("org.freedesktop.DBus.Error.InvalidArgs", why); },
        std::move(reply));
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
    loop_.post([this, path, interface, property, value = std::move(value),
                reply = std::move(reply)]() mutable {
        auto& setting =
            settings_.try_emplace(property, Setting{path, interface, property}).first->second;
        setting.value = std::move(value);
        setting.replies.push_back(std::move(reply));
        if (!setting.isUnderWay) {
            send(setting);
        }
    });
}

void Client::Connection::send(Setting& setting) {
    setting.isUnderWay = true;
    perform(
        [this, &setting, value = *std::exchange(setting.value, std::nullopt)](auto done) {
            auto& proxy = proxies_[setting.path];
            if (!proxy) {
                proxy = sdbus::createProxy(loop_.bus(), name_, setting.path);
            }
            proxy->callMethodAsync("Set")
                .onInterface(propertiesInterface)
                .withArguments(std::string(setting.interface), std::string(setting.property), value)
                .uponReplyInvoke(std::move(done));
        },
        [this, &setting, replies = std::exchange(setting.replies, {})](const std::string& problem) {
            wasSent(setting, replies, problem);
        });
}

void Client::Connection::wasSent(Setting& setting, const std::vector<Reply>& replies,
                                 const std::string& problem) {
    setting.isUnderWay = false;
    for (const auto& reply : replies) {
        if (reply) {
            reply(problem);
        }
    }
    if (isClosed_ && setting.value) {
        setting.value.reset();
        wasSent(setting, std::exchange(setting.replies, {}), problem);
    } else if (setting.value) {
        send(setting);
    }
}

Client::Client(Listener listener, std::string name)
    : connection_(std::make_unique<Connection>(std::move(listener), std::move(name))) {}

Client::~Client() = default;

void Client::startNow(Reply reply) {
    connection_->callMethod(enginePath, engineInterface, "StartNow", std::move(reply));
}

void Client::cancel(Reply reply) {
    connection_->callMethod(enginePath, engineInterface, "Cancel", std::move(reply));
}

void Client::setMusicFolder(const std::string& path, Reply reply) {
    connection_->setPath<EngineStatus, "MusicFolder">(enginePath, path, std::move(reply));
}

void Client::setRateLimit(std::uint64_t bytesPerSecond, Reply reply) {
    connection_->setProperty<EngineStatus, "RateLimit">(enginePath, bytesPerSecond,
                                                        std::move(reply));
}

void Client::setWearableDirectory(const std::string& path, Reply reply) {
    connection_->setPath<WearableStatus, "Directory">(wearablePath, path, std::move(reply));
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

void Client::setWatching(bool isWatching, Reply reply) {
    connection_->setWatching(isWatching, std::move(reply));
}

void Client::removeMusic(Reply reply) {
    connection_->callMethod(wearablePath, wearableInterface, "RemoveMusic", std::move(reply));
}

} // namespace quorl::engine
