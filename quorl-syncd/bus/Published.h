#pragma once

#include <utility>

#include "services/engine/Interface.h"

namespace quorl::syncd {

/// The properties of a bus object as the bus was told them.
template <class State>
class Published {
  public:
    explicit Published(const State& state) : state_(engine::speakable(state)) {}

    [[nodiscard]] const State& operator*() const { return state_; }

    [[nodiscard]] const State* operator->() const { return &state_; }

    /// Has `object` tell which of the properties have changed, if any.
    template <class Object>
    void change(Object& object, const State& state) {
        auto now = engine::speakable(state);
        const auto names = engine::changedProperties(state_, now);
        state_ = std::move(now);
        if (!names.empty()) {
            object.emitPropertiesChangedSignal(engine::Interface<State>::name, names);
        }
    }

  private:
    State state_;
};

} // namespace quorl::syncd
