// Any bytes as what an engine says on the bus: whatever comes in whatever order, what is known of
// the engine stays consistent, and each event is about something that is there.

#include <cmath>
#include <cstddef>
#include <cstdint>
#include <limits>
#include <set>
#include <string>
#include <string_view>

#include "fuzz/Demand.h"
#include "services/engine/Names.h"
#include "services/engine/PendingEvents.h"
#include "services/engine/Reducer.h"

namespace {

using namespace quorl::engine;
using quorl::fuzz::demand;

/// Takes an input apart. Where it is at its end, everything is zero.
class Input {
  public:
    Input(const std::uint8_t* data, std::size_t size) : data_(data), end_(data + size) {}

    [[nodiscard]] bool isAtEnd() const { return data_ == end_; }

    std::uint8_t byte() { return isAtEnd() ? std::uint8_t{0} : *data_++; }

    template <std::size_t size>
    const char* oneOf(const char* const (&choices)[size]) {
        return choices[byte() % size];
    }

    std::uint64_t number() {
        std::uint64_t value = 0;
        for (auto count = byte() % 9; count > 0; --count) {
            value = value << 8U | byte();
        }
        return value;
    }

  private:
    const std::uint8_t* data_;
    const std::uint8_t* const end_;
};

const char* pathIn(Input& input) {
    return input.oneOf(
        {enginePath, wearablePath, "/s/1", "/s/2", "/s/1/t/1", "/s/1/t/2", "/s/2/t/1", "/s/9"});
}

const char* interfaceIn(Input& input) {
    return input.oneOf(
        {engineInterface, wearableInterface, sessionInterface, taskInterface, "org.example.Other"});
}

double realIn(Input& input) {
    using Limits = std::numeric_limits<double>;
    constexpr double special[]{Limits::quiet_NaN(),
                               Limits::infinity(),
                               -Limits::infinity(),
                               -1.0,
                               Limits::max(),
                               Limits::denorm_min(),
                               1.0};
    const auto choice = input.byte();
    return choice < std::size(special) ? special[choice] : choice / 255.0;
}

sdbus::Variant valueIn(Input& input) {
    switch (input.byte() % 6) {
    case 0:
        return sdbus::Variant(input.byte() % 2 != 0);
    case 1:
        return sdbus::Variant(input.number());
    case 2:
        return sdbus::Variant(realIn(input));
    case 3:
        return sdbus::Variant(std::string(input.byte(), 'x'));
    case 4:
        return sdbus::Variant(sdbus::ObjectPath(pathIn(input)));
    default:
        return sdbus::Variant(std::int32_t{input.byte()});
    }
}

Properties propertiesIn(Input& input) {
    Properties properties;
    for (auto count = input.byte() % 5; count > 0; --count) {
        const auto* const name =
            input.oneOf({"Status", "SyncState", "RateLimit", "LastTime", "Directory", "Connected",
                         "Available", "Finished", "Progress", "ProgressValid", "Bytes", "Session",
                         "GroupingKey", "Running", "TotalItemCount", "CompletedItemCount"});
        properties.insert_or_assign(name, valueIn(input));
    }
    return properties;
}

Interfaces interfacesIn(Input& input) {
    Interfaces interfaces;
    for (auto count = input.byte() % 3; count > 0; --count) {
        const auto* const interface = interfaceIn(input);
        interfaces.insert_or_assign(interface, propertiesIn(input));
    }
    return interfaces;
}

ObjectsListed objectsIn(Input& input) {
    ObjectsListed listed;
    for (auto count = input.byte() % 6; count > 0; --count) {
        const sdbus::ObjectPath path(pathIn(input));
        listed.objects.insert_or_assign(path, interfacesIn(input));
    }
    return listed;
}

BusMessage messageIn(Input& input) {
    switch (input.byte() % 8) {
    case 0:
        return objectsIn(input);
    case 1:
        return ObjectRemoved{pathIn(input), {interfaceIn(input)}};
    case 2:
        return EngineGone{"gone"};
    case 3:
        return BusGone{"gone"};
    case 4: {
        const auto* const path = pathIn(input);
        const auto* const interface = interfaceIn(input);
        return ObjectSignalled{path, interface,
                               input.oneOf({"WillBegin", "DidBegin", "Completed", "Other"}),
                               input.byte() % 2 != 0, "message"};
    }
    case 5:
    case 6: {
        const auto* const path = pathIn(input);
        const auto* const interface = interfaceIn(input);
        return PropertiesChanged{path, interface, propertiesIn(input)};
    }
    default: {
        const auto* const path = pathIn(input);
        return ObjectAdded{path, interfacesIn(input)};
    }
    }
}

bool isFraction(double value) { return value >= 0 && value <= 1; }

/// Each object is there once, and each task is where it says.
void check(const EngineState& state) {
    demand(state.isThere || state == EngineState());
    std::set<std::string> paths;
    for (const auto& session : state.sessions) {
        demand(paths.insert(session.path).second);
        demand(isFraction(session.progress));
        for (const auto& task : session.tasks) {
            demand(isFraction(task.progress));
        }
    }
}

bool isAboutTask(Event::Kind kind) {
    return kind == Event::Kind::TaskWillBegin || kind == Event::Kind::TaskDidBegin ||
           kind == Event::Kind::TaskDidUpdate || kind == Event::Kind::TaskDidFinish;
}

void check(const Event& event, const EngineState& state) {
    demand(event.state.get() == &state);
    demand(!isAboutTask(event.kind) || (event.session && event.task));
    demand(event.kind != Event::Kind::SessionDidVanish || event.session);
    demand(!event.task || event.session);
    const bool isGone =
        event.kind == Event::Kind::EngineDidVanish || event.kind == Event::Kind::BusDidVanish;
    demand(state.isThere != isGone);
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    Input input(data, size);
    std::shared_ptr<const EngineState> state = std::make_shared<EngineState>();
    PendingEvents pending;
    while (!input.isAtEnd()) {
        const auto before = *state;
        const auto reduced = reduce(state, messageIn(input));
        demand(reduced.state != nullptr);
        demand(*state == before);
        check(*reduced.state);
        if (reduced.event) {
            check(*reduced.event, *reduced.state);
            pending.add(*reduced.event);
        }
        state = reduced.state;
    }
    for (const auto& event : pending.take()) {
        demand(event.state != nullptr);
    }
    return 0;
}
