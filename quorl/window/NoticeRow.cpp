#include "quorl/window/NoticeRow.h"

#include <QAccessibleWidget>
#include <QGuiApplication>

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

/// What a button has on each side of its text.
int besideText(const FlatButton& button) {
    return (button.sizeHint().width() - button.fontMetrics().horizontalAdvance(button.text())) / 2;
}

QMargins fromStart(int start, int others) {
    return QGuiApplication::isRightToLeft() ? QMargins(others, others, start, others)
                                            : QMargins(start, others, others, others);
}

} // namespace

NoticeRow::NoticeRow(const Notice& notice, WindowScreen& screen, QWidget* parent)
    : QWidget(parent),
      line_(new QHBoxLayout(this)),
      textAndAction_(new QBoxLayout(QBoxLayout::LeftToRight)) {
    QAccessible::installFactory(readAsNotification); // more than once does no harm
    const auto text = QString::fromStdString(notice.text);
    setAccessibleName(text);
    auto* label = new QLabel(text, this);
    label->setWordWrap(true);
    label->setTextFormat(Qt::PlainText);
    label->setTextInteractionFlags(Qt::TextSelectableByMouse);
    line_->addLayout(textAndAction_, 1);
    textAndAction_->addWidget(label, 1);
    int indent = 0; // so that the text begins where that of the button does
    if (!notice.actionName.empty()) {
        auto* action = new FlatButton(screen, nullptr, this);
        action->setText(QString::fromStdString(notice.actionName));
        indent = besideText(*action);
        textAndAction_->addWidget(action, 0, Qt::AlignLeft | Qt::AlignVCenter);
        connect(action, &QToolButton::clicked, this, [act = notice.act] { act(); });
    }
    auto* close = new FlatButton(screen, nullptr, this);
    close->setText(QStringLiteral("✕"));
    close->setAccessibleName(tr("Put the notice away"));
    line_->addWidget(close, 0, Qt::AlignTop);
    line_->setContentsMargins(fromStart(margin - indent, margin / 2));
    label->setContentsMargins(fromStart(indent, 0));
    connect(close, &QToolButton::clicked, this, &NoticeRow::putAway);
}

void NoticeRow::resizeEvent(QResizeEvent* event) {
    QWidget::resizeEvent(event);
    int wanted = 0;
    for (const auto* label : findChildren<QLabel*>()) {
        wanted += label->fontMetrics().horizontalAdvance(label->text());
    }
    for (const auto* button : findChildren<FlatButton*>()) {
        wanted += button->sizeHint().width() + line_->spacing();
    }
    textAndAction_->setDirection(wanted <= line_->contentsRect().width() ? QBoxLayout::LeftToRight
                                                                         : QBoxLayout::TopToBottom);
}

} // namespace quorl
