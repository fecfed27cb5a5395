#pragma once

#include "quorl/content/PaneContent.h"

namespace quorl {

/// What the rows of a pane are called, whether they are shown or not. A pane says that of one row
/// at a time, so a hundred thousand are read a slice at a time. Main thread.
class RowNames {
  public:
    /// `content` outlives the names.
    explicit RowNames(PaneContent& content) : content_(content) {}

    /// Those of the first rows of the pane, as far as they have been read.
    [[nodiscard]] const std::vector<std::string>& names() const { return names_; }

    [[nodiscard]] bool areComplete() const;

    /// The first of these rows that is checked; null where none is.
    [[nodiscard]] std::optional<NSInteger> checkedRow() const { return checkedRow_; }

    /// Reads at most `count` more. Nothing can be read while the content is not current.
    void readMore(NSInteger count);

    /// Begins anew: the pane has other rows.
    void forget();

  private:
    PaneContent& content_;
    std::vector<std::string> names_;
    std::optional<NSInteger> checkedRow_;
};

} // namespace quorl
