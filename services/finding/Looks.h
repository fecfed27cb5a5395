#pragma once

#include <chrono>
#include <functional>
#include <map>
#include <memory>

#include "services/base/Errand.h"
#include "services/finding/Place.h"

namespace quorl::finding {

/// Looks at many places at once, and goes on without those whose device does not answer. One
/// thread.
class Looks {
  public:
    /// Called on threads of its own, which may outlive this, so it must own all that it uses.
    using Look = std::function<Find(const Place& place)>;

    static constexpr std::chrono::seconds usualPatience{2};

    /// @param patience how long all looks of one round are waited for.
    explicit Looks(Look look = lookAt, std::chrono::milliseconds patience = usualPatience)
        : look_(std::move(look)), patience_(patience) {}

    ~Looks();

    Looks(const Looks&) = delete;
    Looks& operator=(const Looks&) = delete;

    /// What was found, by the directory of the place. Where an earlier look still hangs, nobody is
    /// sent after it; places that do not answer, or for which no thread can be started, are left
    /// out.
    [[nodiscard]] std::map<std::filesystem::path, Find> at(const std::vector<Place>& places);

  private:
    class Round;

    struct Sent {
        std::shared_ptr<Round> round;
        std::unique_ptr<base::Errand> errand;
    };

    [[nodiscard]] Sent send(const Place& place, const std::shared_ptr<Round>& round) const;

    const Look look_;
    const std::chrono::milliseconds patience_;
    std::map<std::filesystem::path, Sent> hanging_;
};

} // namespace quorl::finding
