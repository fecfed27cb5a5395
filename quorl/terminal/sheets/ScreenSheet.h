#pragma once

#include "quorl/terminal/sheets/Sheet.h"
#include "quorl/terminal/sheets/Terminal.h"

namespace quorl {

/// A terminal whose lines are written anew where they have changed, and only there. What is too
/// long for a line is shortened.
class ScreenSheet final : public Sheet {
  public:
    /// Enters `terminal`, which outlives the sheet.
    explicit ScreenSheet(Terminal& terminal);

    [[nodiscard]] SheetForm form() const override;
    void show(const std::vector<TextLine>& page) override;
    void showAgain() override;
    void answer(const std::string& text) override;
    void setTyped(const std::string& text) override;

  private:
    void paint();
    [[nodiscard]] std::vector<std::string> lines() const;
    [[nodiscard]] std::vector<std::string> linesOfAnswer() const;
    [[nodiscard]] std::string shownOfTyped() const;

    Terminal& terminal_;
    std::vector<TextLine> page_;
    std::string answer_;
    std::string typed_;
    std::vector<std::string> painted_;
};

} // namespace quorl
