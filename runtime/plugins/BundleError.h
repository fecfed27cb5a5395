#pragma once

#include <filesystem>
#include <stdexcept>
#include <string>

namespace quorl {

/// What is wrong with a bundle.
class BundleError : public std::runtime_error {
  public:
    BundleError(std::filesystem::path file, const std::string& problem)
        : std::runtime_error(file.string() + ": " + problem), file_(std::move(file)) {}

    /// The file that the problem is in.
    [[nodiscard]] const std::filesystem::path& file() const { return file_; }

  private:
    std::filesystem::path file_;
};

} // namespace quorl
