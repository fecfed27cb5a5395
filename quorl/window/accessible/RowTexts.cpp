#include "quorl/window/accessible/RowTexts.h"

#include <algorithm>

#include "quorl/content/SwitchCell.h"

namespace quorl {

namespace {

QString withoutDigits(QString text) {
    text.removeIf([](QChar character) { return character.isDigit(); });
    return text;
}

/// In whichever digits.
int numberIn(const QString& text) {
    int number = 0;
    for (const QChar character : text) {
        number = character.isDigit() ? number * 10 + character.digitValue() : number;
    }
    return number;
}

bool isPercentage(const QString& text) {
    constexpr QStringView signs = u"%٪％";
    return std::any_of(text.begin(), text.end(),
                       [signs](QChar character) { return signs.contains(character); });
}

bool isOtherValue(const QString& before, const QString& now) {
    const bool runs = isPercentage(now) && withoutDigits(before) == withoutDigits(now);
    return runs ? numberIn(before) / 25 != numberIn(now) / 25 : before != now;
}

} // namespace

RowTexts textsOf(const UITableViewCell& cell) {
    const auto* toggle = dynamic_cast<const SwitchCell*>(&cell);
    return {QString::fromStdString(cell.textLabel().text().value_or("")),
            QString::fromStdString(cell.detailTextLabel().text().value_or("")),
            toggle ? toggle->isOn()
                   : cell.accessoryType() == UITableViewCellAccessoryType::Checkmark};
}

std::vector<QAccessible::Event> newsOf(const RowTexts& before, const RowTexts& now) {
    std::vector<QAccessible::Event> news;
    if (before.title != now.title) {
        news.push_back(QAccessible::NameChanged);
    }
    if (isOtherValue(before.value, now.value)) {
        news.push_back(QAccessible::DescriptionChanged);
    }
    if (before.isChecked != now.isChecked) {
        news.push_back(QAccessible::StateChanged);
    }
    return news;
}

} // namespace quorl
