#pragma once

#include <iosfwd>

#include "quorl/terminal/sheets/Sheet.h"

namespace quorl {

/// A file, a pipe, or a terminal that only adds lines: of a page of which only few lines have
/// changed, these alone are printed.
class PrintedSheet final : public Sheet {
  public:
    /// Prints how to go on. `terminal` is the descriptor that may be that of a terminal, which then
    /// says how much it has room for; `output` outlives the sheet.
    PrintedSheet(std::ostream& output, int terminal);

    [[nodiscard]] SheetForm form() const override;
    void show(const std::vector<TextLine>& page) override;
    void showAgain() override;
    void answer(const std::string& text) override;

    void setTyped(const std::string& /*text*/) override {} // the terminal itself shows it

  private:
    void printChanges(const std::vector<TextLine>& page);

    std::ostream& output_;
    const int terminal_;
    std::vector<TextLine> shown_;
};

} // namespace quorl
