#pragma once

#include <QAccessible>
#include <QString>
#include <vector>

#include "platform/UserInterface.h"

namespace quorl {

/// What a row says.
struct RowTexts {
    QString title;
    QString value;
    bool isChecked = false;
};

[[nodiscard]] RowTexts textsOf(const UITableViewCell& cell);

/// What to tell a screen reader of a row that said `before` and says `now`. Numbers that change
/// within a value are no news: a running percentage would be told without end.
[[nodiscard]] std::vector<QAccessible::Event> newsOf(const RowTexts& before, const RowTexts& now);

} // namespace quorl
