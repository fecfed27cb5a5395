#include "quorl-syncd/bus/Watchers.h"

#include <utility>

namespace quorl::syncd {

Watchers::Watchers(sdbus::IConnection& bus, Changed changed)
    : changed_(std::move(changed)),
      // From the beginning, for a client may have left when its call is served.
      leaving_(bus.addMatch("type='signal',sender='org.freedesktop.DBus',"
                            "member='NameOwnerChanged',arg2=''",
                            [this](sdbus::Message& signal) { leave(signal); })) {}

void Watchers::add(const std::string& client) {
    const bool isFirst = clients_.empty();
    ++clients_[client];
    if (isFirst) {
        changed_(Presence::Somebody);
    }
}

void Watchers::remove(const std::string& client) {
    const auto found = clients_.find(client);
    if (found != clients_.end() && --found->second == 0) {
        drop(client);
    }
}

void Watchers::leave(sdbus::Message& signal) {
    std::string name;
    signal >> name;
    drop(name);
}

void Watchers::drop(const std::string& client) {
    if (clients_.erase(client) > 0 && clients_.empty()) {
        changed_(Presence::Nobody);
    }
}

} // namespace quorl::syncd
