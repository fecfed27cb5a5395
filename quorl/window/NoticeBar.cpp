#include "quorl/window/NoticeBar.h"

#include <QPainter>

#include "quorl/window/NoticeRow.h"
#include "quorl/window/look/PaneColors.h"

namespace quorl {

NoticeBar::NoticeBar(Notices& notices, WindowScreen& screen, QWidget* parent)
    : QWidget(parent), notices_(notices), screen_(screen), column_(new QVBoxLayout(this)) {
    column_->setContentsMargins(0, 0, 0, 0);
    column_->setSpacing(0);
    connect(&notices_, &Notices::changed, this, &NoticeBar::showNotices);
    connect(&screen, &WindowScreen::lookChanged, this, qOverload<>(&QWidget::update));
    showNotices();
}

/// Those that stay keep their widgets, and with them the focus.
void NoticeBar::showNotices() {
    const auto& all = notices_.all();
    for (auto row = rows_.begin(); row != rows_.end();) {
        const auto now = all.find(row->first);
        const bool stays = now != all.end() && row->second.text == now->second.text &&
                           row->second.actionName == now->second.actionName;
        if (stays) {
            ++row;
            continue;
        }
        row = remove(row);
    }
    std::erase_if(putAway_, [&all](const auto& each) {
        const auto now = all.find(each.first);
        return now == all.end() || now->second.text != each.second;
    });
    for (const auto& [topic, notice] : all) {
        if (!rows_.contains(topic) && !putAway_.contains(topic)) {
            add(topic, notice);
        }
    }
    setVisible(!rows_.empty());
}

/// In the order of the topics.
void NoticeBar::add(Notices::Topic topic, const Notice& notice) {
    auto* widget = new NoticeRow(notice, screen_, this);
    const auto row = rows_.emplace(topic, Row{notice.text, notice.actionName, widget}).first;
    column_->insertWidget(static_cast<int>(std::distance(rows_.begin(), row)), widget);
    connect(widget, &NoticeRow::putAway, this, [this, topic] { putAway(topic); });
    widget->show();
}

void NoticeBar::putAway(Notices::Topic topic) {
    const auto row = rows_.find(topic);
    putAway_[topic] = row->second.text;
    remove(row);
    setVisible(!rows_.empty());
}

/// Perhaps it is a button of the row that was clicked.
NoticeBar::Rows::iterator NoticeBar::remove(Rows::iterator row) {
    column_->removeWidget(row->second.widget);
    row->second.widget->hide();
    row->second.widget->deleteLater();
    return rows_.erase(row);
}

void NoticeBar::paintEvent(QPaintEvent* /*event*/) {
    QPainter(this).fillRect(rect(), PaneColors::of(palette(), screen_.look()).notice);
}

} // namespace quorl
