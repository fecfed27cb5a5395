#pragma once

#include "platform/UserInterface.h"

namespace quorl {

/// A label that is measured by the host's screen.
class Label : public UILabel {
  public:
    [[nodiscard]] const std::optional<std::string>& text() const override { return text_; }

    void setText(std::optional<std::string> text) override { text_ = std::move(text); }

    [[nodiscard]] const std::optional<UIColor>& textColor() const override { return textColor_; }

    void setTextColor(std::optional<UIColor> color) override { textColor_ = std::move(color); }

    [[nodiscard]] CGRect frame() const override { return frame_; }

    void setFrame(const CGRect& frame) override;
    [[nodiscard]] CGSize sizeThatFits(const CGSize& size) const override;

  private:
    std::optional<std::string> text_;
    std::optional<UIColor> textColor_;
    CGRect frame_;
};

} // namespace quorl
