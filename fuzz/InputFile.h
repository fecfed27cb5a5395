#pragma once

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <stdexcept>
#include <string>
#include <string_view>

namespace quorl::fuzz {

/// Writes inputs to a file, in a directory of its own, that is named as those who read it want.
class InputFile {
  public:
    explicit InputFile(const std::filesystem::path& name) {
        std::string pattern = std::filesystem::temp_directory_path() / "quorl-fuzz-XXXXXX";
        if (mkdtemp(pattern.data()) == nullptr) {
            throw std::runtime_error("cannot make a temporary directory");
        }
        directory_ = pattern;
        path_ = directory_ / name;
        std::filesystem::create_directories(path_.parent_path());
    }

    InputFile(const InputFile&) = delete;
    InputFile& operator=(const InputFile&) = delete;

    ~InputFile() {
        std::error_code ignored; // nothing that could be done about it
        std::filesystem::remove_all(directory_, ignored);
    }

    [[nodiscard]] const std::filesystem::path& directory() const { return directory_; }

    [[nodiscard]] const std::filesystem::path& path() const { return path_; }

    /// Makes the file anew, for a file system may see to it that what replaces the contents of one
    /// is on the disk at once.
    void write(std::string_view bytes) const {
        std::filesystem::remove(path_);
        std::ofstream(path_, std::ios::binary) << bytes;
    }

  private:
    std::filesystem::path directory_;
    std::filesystem::path path_;
};

} // namespace quorl::fuzz
