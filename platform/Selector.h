#pragma once

#include <string_view>
#include <utility>

#include "platform/NSObject.h"

/// A message: the name of a method of an object that is known only when the message is sent. The
/// method may take fewer arguments than are sent; the rest is dropped.
template <class Signature>
class Selector;

template <class Result, class... Arguments>
class Selector<Result(Arguments...)> {
  public:
    /// The selector of `Method`, a member function of a class derived from `NSObject`. `name` is
    /// its name with a colon after each argument, and outlives the selector.
    template <auto Method>
    [[nodiscard]] static Selector of(std::string_view name) {
        return {name, [](NSObject& receiver, Arguments... arguments) -> Result {
                    return send(receiver, Method, std::forward<Arguments>(arguments)...);
                }};
    }

    [[nodiscard]] std::string_view name() const { return _name; }

    /// Sends the message. `receiver` is of the class that the selector was made for.
    Result operator()(NSObject& receiver, Arguments... arguments) const {
        return _invoke(receiver, std::forward<Arguments>(arguments)...);
    }

  private:
    using Invoke = Result (*)(NSObject&, Arguments...);

    Selector(std::string_view name, Invoke invoke) : _name(name), _invoke(invoke) {}

    template <class T>
    static Result send(NSObject& receiver, Result (T::*method)(Arguments...),
                       Arguments... arguments) {
        return (static_cast<T&>(receiver).*method)(std::forward<Arguments>(arguments)...);
    }

    template <class T>

    requires(sizeof...(Arguments) > 0) static Result
        send(NSObject& receiver, Result (T::*method)(), Arguments...) {
        return (static_cast<T&>(receiver).*method)();
    }

    std::string_view _name;
    Invoke _invoke;
};
