#include "quorl/window/NoticeBar.h"

#include <QHBoxLayout>
#include <QPainter>

#include "quorl/window/look/FlatButton.h"
#include "quorl/window/look/PaneColors.h"

namespace quorl {

namespace {

constexpr int margin = 16;

} // namespace

NoticeBar::NoticeBar(Notices& notices, WindowScreen& screen, QWidget* parent)
    : QFrame(parent), notices_(notices), screen_(screen), label_(new QLabel(this)) {
    label_->setWordWrap(true);
    label_->setTextFormat(Qt::PlainText);
    label_->setTextInteractionFlags(Qt::TextSelectableByMouse);
    auto* close = new FlatButton(screen, nullptr, this);
    close->setText(QStringLiteral("✕"));
    close->setAccessibleName(tr("Put the notice away"));
    auto* row = new QHBoxLayout(this);
    row->setContentsMargins(margin, margin / 2, margin / 2, margin / 2);
    row->addWidget(label_, 1);
    row->addWidget(close, 0, Qt::AlignTop);
    connect(close, &QToolButton::clicked, this, &QWidget::hide);
    connect(&notices_, &Notices::changed, this, &NoticeBar::showNotices);
    connect(&screen, &WindowScreen::lookChanged, this, qOverload<>(&QWidget::update));
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
    QPainter(this).fillRect(rect(), PaneColors::of(palette(), screen_.look()).notice);
}

} // namespace quorl
