#pragma once

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <stdexcept>
#include <string>

namespace quorl::wearable::testing {

/// A new empty directory, removed at the end with all that is in it.
class TemporaryDirectory {
  public:
    TemporaryDirectory() {
        auto name = (std::filesystem::temp_directory_path() / "wearable-XXXXXX").string();
        if (mkdtemp(name.data()) == nullptr) {
            throw std::runtime_error{"no temporary directory"};
        }
        path_ = name;
    }

    TemporaryDirectory(const TemporaryDirectory&) = delete;
    TemporaryDirectory& operator=(const TemporaryDirectory&) = delete;

    ~TemporaryDirectory() {
        std::error_code ignored;
        std::filesystem::remove_all(path_, ignored);
    }

    [[nodiscard]] const std::filesystem::path& path() const { return path_; }

    /// Writes a file, and the directories on the way to it.
    void write(const std::filesystem::path& name, const std::string& text) const {
        std::filesystem::create_directories((path_ / name).parent_path());
        std::ofstream{path_ / name, std::ios::binary} << text;
    }

  private:
    std::filesystem::path path_;
};

} // namespace quorl::wearable::testing
