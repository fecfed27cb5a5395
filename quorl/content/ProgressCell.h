#pragma once

#include <string_view>

#include "platform/UserInterface.h"

namespace quorl {

/// The property of a row that holds how full its bar is, from "0" to "1"; without it a row has no
/// bar.
inline constexpr std::string_view RowProgressKey = "progress";

/// A row with a bar below its texts. Main thread.
class ProgressCell final : public UITableViewCell {
  public:
    /// From 0 to 1.
    [[nodiscard]] double progress() const { return progress_; }

    void setProgress(double progress) { progress_ = progress; }

  private:
    double progress_ = 0;
};

} // namespace quorl
