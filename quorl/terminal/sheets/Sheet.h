#pragma once

#include <optional>
#include <string>
#include <vector>

#include "platform/Foundation.h"

namespace quorl {

/// A line of what is shown.
struct TextLine {
    std::string text;                  ///< printable, without a line feed
    std::optional<NSInteger> row = {}; ///< the row that it is; null for none
    bool goesOn = false;               ///< whether it belongs to the line above
};

/// What a sheet has room for.
struct SheetForm {
    /// Whether lines are written behind those that are there, for good, or in their place.
    enum class Kind { Printed, Rewritten };

    int columns;
    int lines; ///< for a page, at least one
    Kind kind;
};

/// What a session in a terminal is shown on: at its head how to go on, then a page, then the answer
/// to the last command, then what is being typed. Main thread.
class Sheet {
  public:
    Sheet() = default;
    Sheet(const Sheet&) = delete;
    Sheet& operator=(const Sheet&) = delete;
    virtual ~Sheet() = default;

    [[nodiscard]] virtual SheetForm form() const = 0;

    /// Shows a page in place of the last one. One that says the same changes nothing.
    virtual void show(const std::vector<TextLine>& page) = 0;

    /// Shows the page once more, whole.
    virtual void showAgain() = 0;

    /// Sentences in lines, in place of those before; empty for none.
    virtual void answer(const std::string& text) = 0;

    /// What has been typed of a command that is not complete.
    virtual void setTyped(const std::string& text) = 0;
};

} // namespace quorl
