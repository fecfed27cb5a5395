#include "quorl/window/NoticeBar.h"

#include <QHBoxLayout>
#include <QPainter>
#include <QToolButton>

#include "quorl/window/look/PaneColors.h"

namespace quorl {

namespace {

constexpr int margin = 16;
constexpr int buttonSide = 44;

} // namespace

NoticeBar::NoticeBar(Notices& notices, const QColor& tint, QWidget* parent)
    : QFrame(parent), notices_(notices), tint_(tint), label_(new QLabel(this)) {
    label_->setWordWrap(true);
    label_->setTextFormat(Qt::PlainText);
    label_->setTextInteractionFlags(Qt::TextSelectableByMouse);
    auto* close = new QToolButton(this);
    close->setAutoRaise(true);
    close->setText(QStringLiteral("✕"));
    close->setAccessibleName(tr("Put the notice away"));
    close->setFixedSize(buttonSide, buttonSide);
    auto* row = new QHBoxLayout(this);
    row->setContentsMargins(margin, margin / 2, margin / 2, margin / 2);
    row->addWidget(label_, 1);
    row->addWidget(close, 0, Qt::AlignTop);
    connect(close, &QToolButton::clicked, this, &QWidget::hide);
    connect(&notices_, &Notices::changed, this, &NoticeBar::showNotices);
    showNotices();
}

void NoticeBar::showNotices() {
    QStringList texts;
    for (const std::string& text : notices_.texts()) {
        texts << QString::fromStdString(text);
    }
    label_->setText(texts.join(u'\n'));
    setVisible(!texts.isEmpty());
}

void NoticeBar::paintEvent(QPaintEvent* /*event*/) {
    QPainter(this).fillRect(rect(), PaneColors::of(palette(), tint_).notice);
}

} // namespace quorl
