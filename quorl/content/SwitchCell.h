#pragma once

#include "platform/UserInterface.h"

namespace quorl {

/// A row with a switch at its end. Main thread.
class SwitchCell final : public UITableViewCell {
  public:
    [[nodiscard]] bool isOn() const { return isOn_; }

    void setOn(bool isOn) { isOn_ = isOn; }

  private:
    bool isOn_ = false;
};

} // namespace quorl
