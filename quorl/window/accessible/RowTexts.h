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

    [[nodiscard]] bool operator==(const RowTexts&) const = default;
};

[[nodiscard]] RowTexts textsOf(const UITableViewCell& cell);

/// What to tell a screen reader of a row that said `before` and says `now`. Of a percentage that
/// runs only the quarters are news: it would be told without end.
[[nodiscard]] std::vector<QAccessible::Event> newsOf(const RowTexts& before, const RowTexts& now);

} // namespace quorl
