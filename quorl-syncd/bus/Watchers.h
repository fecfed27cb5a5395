#pragma once

#include <functional>
#include <map>
#include <string>

#include <sdbus-c++/sdbus-c++.h>

namespace quorl::syncd {

/// The clients on the bus that show a person how the engine does. Who leaves the bus is none any
/// more. The bus loop's thread.
class Watchers {
  public:
    enum class Presence { Nobody, Somebody };

    using Changed = std::function<void(Presence presence)>;

    /// @param bus outlives this.
    /// @param changed called when there is one where there was none, and the other way round.
    Watchers(sdbus::IConnection& bus, Changed changed);

    /// A client that is added several times is to be removed as often.
    /// @param client its unique name.
    void add(const std::string& client);

    /// Nothing where it is none.
    void remove(const std::string& client);

  private:
    void leave(sdbus::Message& signal);
    void drop(const std::string& client);

    const Changed changed_;
    std::map<std::string, unsigned> clients_; ///< how often each was added
    const sdbus::Slot leaving_;               ///< last, for it calls this object
};

} // namespace quorl::syncd
