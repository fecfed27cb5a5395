#include "quorl/window/NoticeRow.h"

#include <QAccessibleWidget>
#include <QHBoxLayout>

#include "quorl/window/look/FlatButton.h"

namespace quorl {

namespace {

constexpr int margin = 16;

/// Screen readers speak a notification when it comes, an alert only when the focus gets there.
QAccessibleInterface* readAsNotification(const QString& /*className*/, QObject* object) {
    auto* row = qobject_cast<NoticeRow*>(object);
    return row ? new QAccessibleWidget(row, QAccessible::Notification, row->accessibleName())
               : nullptr;
}

} // namespace

NoticeRow::NoticeRow(const Notice& notice, WindowScreen& screen, QWidget* parent)
    : QWidget(parent) {
    QAccessible::installFactory(readAsNotification); // more than once does no harm
    const auto text = QString::fromStdString(notice.text);
    setAccessibleName(text);
    auto* label = new QLabel(text, this);
    label->setWordWrap(true);
    label->setTextFormat(Qt::PlainText);
    label->setTextInteractionFlags(Qt::TextSelectableByMouse);
    auto* line = new QHBoxLayout(this);
    line->setContentsMargins(margin, margin / 2, margin / 2, margin / 2);
    line->addWidget(label, 1);
    if (!notice.actionName.empty()) {
        auto* action = new FlatButton(screen, nullptr, this);
        action->setText(QString::fromStdString(notice.actionName));
        line->addWidget(action, 0, Qt::AlignVCenter);
        connect(action, &QToolButton::clicked, this, [act = notice.act] { act(); });
    }
    auto* close = new FlatButton(screen, nullptr, this);
    close->setText(QStringLiteral("✕"));
    close->setAccessibleName(tr("Put the notice away"));
    line->addWidget(close, 0, Qt::AlignTop);
    connect(close, &QToolButton::clicked, this, &NoticeRow::putAway);
}

} // namespace quorl
