#pragma once

#include <filesystem>
#include <map>
#include <string>

#include "quorl-syncd/engine/ports/ResultStore.h"

namespace quorl::syncd {

/// The last results in a file, so that they outlive the engine. One thread.
class LastResults final : public ResultStore {
  public:
    /// Reads the file in `directory`, which need not be there yet. A file that cannot be read
    /// counts as an empty one, for the next result replaces it.
    explicit LastResults(std::filesystem::path directory);

    [[nodiscard]] LastResult of(const std::string& wearable) const override;
    void remember(const std::string& wearable, LastResult result) override;

  private:
    std::filesystem::path directory_;
    std::map<std::string, LastResult> results_;
};

} // namespace quorl::syncd
