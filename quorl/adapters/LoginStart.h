#pragma once

#include <filesystem>
#include <string>

namespace quorl {

/// Whether the sync engine is started when the person logs in, also where the app is not opened: an
/// entry among the desktop's autostart files. One that somebody else has written is left alone.
/// Main thread.
class LoginStart {
  public:
    /// @param directory where the desktop looks for such files; need not be there.
    explicit LoginStart(std::filesystem::path directory = usualDirectory());

    [[nodiscard]] static std::filesystem::path usualDirectory();

    [[nodiscard]] bool isOn() const;

    /// Gives back an empty text, or a sentence that says why it could not be done.
    [[nodiscard]] std::string set(bool isOn) const;

  private:
    [[nodiscard]] std::string contents() const;

    const std::filesystem::path directory_;
};

} // namespace quorl
