#pragma once

#include <cstdint>
#include <filesystem>
#include <map>
#include <string>

namespace quorl::syncd {

/// What became of a sync.
struct LastResult {
    /// Everything that was wished for is on the wearable.
    bool success = false;
    /// For the user, in a sentence or several; empty before the first sync.
    std::string message;
    /// Microseconds since 1970; 0 before the first sync.
    std::uint64_t time = 0;

    bool operator==(const LastResult&) const = default;
};

/// The last result of each wearable, kept in a file so that it outlives the engine. It is not kept
/// on the wearable, which may be gone when there is something to tell. One thread.
class LastResults {
  public:
    /// Reads the file in `directory`, which need not be there yet. A file that cannot be read
    /// counts as an empty one, for the next result replaces it.
    explicit LastResults(std::filesystem::path directory);

    /// Of the wearable with this top directory.
    [[nodiscard]] LastResult of(const std::string& wearable) const;

    /// Also outlives a loss of power. Throws `std::system_error` or
    /// `std::filesystem::filesystem_error` where that is not possible; then it is remembered as
    /// long as this object is there.
    void remember(const std::string& wearable, LastResult result);

  private:
    std::filesystem::path directory_;
    std::map<std::string, LastResult> results_;
};

} // namespace quorl::syncd
