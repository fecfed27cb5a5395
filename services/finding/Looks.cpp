#include "services/finding/Looks.h"

#include <condition_variable>
#include <iterator>
#include <mutex>
#include <set>
#include <system_error>
#include <utility>

namespace quorl::finding {

/// Shared with the threads that look.
class Looks::Round {
  public:
    void expect(const std::filesystem::path& directory) {
        const std::scoped_lock lock(mutex_);
        open_.insert(directory);
    }

    /// @param found nothing where nobody could be sent
    void answer(const std::filesystem::path& directory, std::optional<Find> found) {
        const std::scoped_lock lock(mutex_);
        open_.erase(directory);
        if (found) {
            found_.insert_or_assign(directory, std::move(*found));
        }
        answered_.notify_all();
    }

    [[nodiscard]] bool isOpen(const std::filesystem::path& directory) const {
        const std::scoped_lock lock(mutex_);
        return open_.contains(directory);
    }

    [[nodiscard]] std::map<std::filesystem::path, Find> wait(std::chrono::milliseconds patience) {
        std::unique_lock lock(mutex_);
        answered_.wait_for(lock, patience, [this] { return open_.empty(); });
        return found_;
    }

  private:
    mutable std::mutex mutex_;
    std::condition_variable answered_;
    std::set<std::filesystem::path> open_;
    std::map<std::filesystem::path, Find> found_;
};

Looks::~Looks() = default;

std::map<std::filesystem::path, Find> Looks::at(const std::vector<Place>& places) {
    std::erase_if(hanging_,
                  [](const auto& sent) { return !sent.second.round->isOpen(sent.first); });
    const auto round = std::make_shared<Round>();
    for (const auto& place : places) {
        if (!hanging_.contains(place.directory)) {
            hanging_.emplace(place.directory, send(place, round));
        }
    }
    auto found = round->wait(patience_);
    std::erase_if(hanging_,
                  [](const auto& sent) { return !sent.second.round->isOpen(sent.first); });
    return found;
}

Looks::Sent Looks::send(const Place& place, const std::shared_ptr<Round>& round) const {
    round->expect(place.directory);
    try {
        return {round, std::make_unique<base::Errand>(
                           [look = look_, place, round](const std::stop_token& /*stop*/) {
                               round->answer(place.directory, look(place));
                           },
                           std::chrono::milliseconds(0))};
    } catch (const std::system_error&) {
        round->answer(place.directory, std::nullopt);
        return {round, nullptr};
    }
}

} // namespace quorl::finding
