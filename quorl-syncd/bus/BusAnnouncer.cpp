#include "quorl-syncd/bus/BusAnnouncer.h"

#include <utility>

#include "quorl-syncd/bus/SessionObject.h"

namespace quorl::syncd {

BusAnnouncer::BusAnnouncer(sdbus::IConnection& bus, std::function<void()> publish)
    : bus_(bus), publish_(std::move(publish)) {}

std::unique_ptr<SessionReport> BusAnnouncer::beginSession(std::uint64_t number,
                                                          std::function<void()> cancel) {
    return std::make_unique<SessionObject>(bus_, number, std::move(cancel));
}

} // namespace quorl::syncd
