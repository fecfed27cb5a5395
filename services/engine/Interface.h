#pragma once

#include <algorithm>
#include <string_view>
#include <tuple>

#include "services/base/Utf8.h"
#include "services/engine/EngineState.h"
#include "services/engine/Names.h"

/// The properties of the engine's bus interfaces, each of them declared once: for the client, which
/// takes them over, and for the engine, which gives them and tells which have changed. What they
/// mean stands in resources/dbus; a test compares.
namespace quorl::engine {

enum class Access { Read, ReadWrite };

/// A property of a bus object, and where a plain value keeps it.
template <class State, class T>
struct Property {
    const char* name;
    T State::*member;
    Access access = Access::Read;
};

template <class State, class T>
Property(const char*, T State::*) -> Property<State, T>;
template <class State, class T>
Property(const char*, T State::*, Access) -> Property<State, T>;

/// The bus interface that tells what a `State` holds.
template <class State>
struct Interface;

template <>
struct Interface<EngineStatus> {
    static constexpr auto name = engineInterface;
    static constexpr auto properties = std::tuple{
        Property{"MusicFolder", &EngineStatus::musicFolder, Access::ReadWrite},
        Property{"RateLimit", &EngineStatus::rateLimit, Access::ReadWrite},
        Property{"Status", &EngineStatus::status},
        Property{"StatusCode", &EngineStatus::statusCode},
        Property{"StatusArguments", &EngineStatus::statusArguments},
        Property{"SyncState", &EngineStatus::syncState},
        Property{"PlaylistName", &EngineStatus::playlistName},
        Property{"PlaylistID", &EngineStatus::playlistID},
        Property{"LimitType", &EngineStatus::limitType},
        Property{"Limit", &EngineStatus::limit},
        Property{"LastSuccess", &EngineStatus::lastSuccess},
        Property{"LastMessage", &EngineStatus::lastMessage},
        Property{"LastCode", &EngineStatus::lastCode},
        Property{"LastArguments", &EngineStatus::lastArguments},
        Property{"LastTime", &EngineStatus::lastTime},
        Property{"LastComplete", &EngineStatus::lastComplete},
        Property{"LeftOut", &EngineStatus::leftOut},
        Property{"LeftOutCount", &EngineStatus::leftOutCount},
        Property{"BeyondLimit", &EngineStatus::beyondLimit},
    };
};

template <>
struct Interface<WearableStatus> {
    static constexpr auto name = wearableInterface;
    static constexpr auto properties = std::tuple{
        Property{"Directory", &WearableStatus::directory, Access::ReadWrite},
        Property{"Name", &WearableStatus::name},
        Property{"Embedded", &WearableStatus::isEmbedded},
        Property{"Connected", &WearableStatus::isConnected, Access::ReadWrite},
        Property{"OnCharger", &WearableStatus::isOnCharger, Access::ReadWrite},
        Property{"Capacity", &WearableStatus::capacity},
        Property{"Available", &WearableStatus::available},
        Property{"Songs", &WearableStatus::songs},
        Property{"SongCount", &WearableStatus::songCount},
    };
};

template <>
struct Interface<SessionState> {
    static constexpr auto name = sessionInterface;
    static constexpr auto properties = std::tuple{
        Property{"TypeIdentifier", &SessionState::typeIdentifier},
        Property{"Finished", &SessionState::isFinished},
        Property{"Operation", &SessionState::operation},
        Property{"CurrentItem", &SessionState::currentItem},
        Property{"Progress", &SessionState::progress},
        Property{"ProgressValid", &SessionState::isProgressValid},
        Property{"Bytes", &SessionState::bytes},
        Property{"Rate", &SessionState::rate},
        Property{"StartTime", &SessionState::startTime},
        Property{"Cancelable", &SessionState::isCancelable},
    };
};

template <>
struct Interface<TaskState> {
    static constexpr auto name = taskInterface;
    static constexpr auto properties = std::tuple{
        Property{"Session", &TaskState::session},
        Property{"GroupingKey", &TaskState::groupingKey},
        Property{"Running", &TaskState::isRunning},
        Property{"TotalItemCount", &TaskState::totalItemCount},
        Property{"CompletedItemCount", &TaskState::completedItemCount},
        Property{"Progress", &TaskState::progress},
    };
};

/// Calls `visit` with each property, in the order of the table.
template <class State, class Visitor>
constexpr void forEachProperty(Visitor&& visit) {
    std::apply([&visit](const auto&... property) { (visit(property), ...); },
               Interface<State>::properties);
}

/// What a member of type T is on the bus.
template <class T>
using OnBus = std::conditional_t<std::is_same_v<T, Fraction>, double, T>;

/// Takes over those of the properties that are known and of the right type; the others are left as
/// they are, so that other engines may have more.
template <class State>
void update(State& state, const Properties& properties) {
    forEachProperty<State>([&]<class T>(const Property<State, T>& property) {
        const auto found = properties.find(property.name);
        if (found != properties.end() && found->second.template containsValueOfType<OnBus<T>>()) {
            state.*property.member = T(found->second.template get<OnBus<T>>());
        }
    });
}

/// The names of the properties in which the two differ.
template <class State>
std::vector<std::string> changedProperties(const State& before, const State& now) {
    std::vector<std::string> names;
    forEachProperty<State>([&](const auto& property) {
        if (before.*property.member != now.*property.member) {
            names.emplace_back(property.name);
        }
    });
    return names;
}

inline void makeSpeakable(std::string& text) { text = base::validUtf8(text); }

inline void makeSpeakable(LeftOutItem& item) {
    makeSpeakable(std::get<0>(item));
    makeSpeakable(std::get<1>(item));
}

template <class T>
void makeSpeakable(std::vector<T>& list) {
    for (auto& each : list) {
        makeSpeakable(each);
    }
}

/// There is nothing in it that is no text.
template <class T>
concept Wordless = std::is_arithmetic_v<T> || std::is_same_v<T, Fraction>;

template <Wordless T>
void makeSpeakable(T& /*value*/) {}

/// `state` as the bus can carry it, which breaks off with whoever says what is not UTF-8: paths may
/// have any bytes.
template <class State>
[[nodiscard]] State speakable(State state) {
    forEachProperty<State>(
        [&state](const auto& property) { makeSpeakable(state.*property.member); });
    return state;
}

/// The name of a property as an argument of a template.
template <std::size_t size>
struct PropertyName {
    // NOLINTNEXTLINE(google-explicit-constructor): made of a literal.
    consteval PropertyName(const char (&name)[size]) { std::copy_n(name, size, text); }

    char text[size];
};

/// The property of this name; does not compile where there is none.
template <class State, PropertyName name, std::size_t index = 0>
consteval auto propertyOf() {
    constexpr auto property = std::get<index>(Interface<State>::properties);
    if constexpr (std::string_view(property.name) == name.text) {
        return property;
    } else {
        return propertyOf<State, name, index + 1>();
    }
}

template <PropertyName name, class State>
[[nodiscard]] const auto& valueOf(const State& state) {
    return state.*propertyOf<State, name>().member;
}

} // namespace quorl::engine
