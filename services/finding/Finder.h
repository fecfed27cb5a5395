#pragma once

#include <functional>
#include <vector>

#include "services/finding/Looks.h"
#include "services/finding/Offer.h"
#include "services/finding/SurroundingsWatch.h"

namespace quorl::finding {

/// What was found at one moment.
struct Found {
    Surroundings surroundings;
    std::vector<Offer> offers;

    bool operator==(const Found&) const = default;
};

/// Finds wearables, and drives that can become one, by themselves. Any thread.
class Finder {
  public:
    /// Called on a thread of the finder's own, also when the finder is gone already.
    using Tell = std::function<void(const Found&)>;

    /// Tells what there is at first, and whenever what is mounted changes. What does not answer is
    /// waited for for some seconds, and then told without what is on it.
    /// @param home of the user, in which wearables may be directories; empty for none
    /// @param tell owns all that it uses. Must not throw.
    /// Throws `std::system_error` where no thread can be started.
    Finder(Tell tell, std::filesystem::path home, Sources sources = {});

  private:
    SurroundingsWatch watch_;
};

/// The same once, at this moment, for who can wait for some seconds.
[[nodiscard]] Found findNow(const std::filesystem::path& home, const Sources& sources = {});

/// The user's home directory; empty where there is none.
[[nodiscard]] std::filesystem::path homeDirectory();

} // namespace quorl::finding
