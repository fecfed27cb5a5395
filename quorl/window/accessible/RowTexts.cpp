#include "quorl/window/accessible/RowTexts.h"

#include "quorl/content/SwitchCell.h"

namespace quorl {

namespace {

QString withoutDigits(QString text) {
    text.removeIf([](QChar character) { return character.isDigit(); });
    return text;
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
    if (withoutDigits(before.value) != withoutDigits(now.value)) {
        news.push_back(QAccessible::DescriptionChanged);
    }
    if (before.isChecked != now.isChecked) {
        news.push_back(QAccessible::StateChanged);
    }
    return news;
}

} // namespace quorl
