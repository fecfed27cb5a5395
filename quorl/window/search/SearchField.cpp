#include "quorl/window/search/SearchField.h"

#include <QHBoxLayout>
#include <QKeyEvent>

#include "quorl/window/look/FlatButton.h"

namespace quorl {

namespace {

constexpr int margin = 16;
constexpr int gap = 8;

} // namespace

SearchField::SearchField(WindowScreen& screen, QWidget* parent)
    : QWidget(parent), edit_(new QLineEdit(this)), nothing_(new QLabel(tr("Not found"), this)) {
    edit_->setPlaceholderText(tr("Search"));
    edit_->setAccessibleName(tr("Search"));
    edit_->setClearButtonEnabled(true);
    edit_->setMinimumHeight(FlatButton::smallestSide - gap);
    edit_->installEventFilter(this);
    auto* close = new FlatButton(screen, nullptr, this);
    close->setText(QStringLiteral("✕"));
    close->setAccessibleName(tr("End the search"));
    auto* row = new QHBoxLayout(this);
    row->setContentsMargins(margin, 0, gap, 0);
    row->addWidget(edit_, 1);
    row->addWidget(nothing_);
    row->addWidget(close);
    nothing_->hide();
    hide();
    connect(edit_, &QLineEdit::textChanged, this, &SearchField::textChanged);
    connect(edit_, &QLineEdit::returnPressed, this, &SearchField::left);
    connect(close, &QToolButton::clicked, this, &SearchField::closed);
}

void SearchField::open() {
    if (isHidden()) {
        edit_->clear();
    }
    show();
    edit_->selectAll();
    edit_->setFocus(Qt::ShortcutFocusReason);
}

void SearchField::setFound(bool isAnyFound) { nothing_->setVisible(!isAnyFound); }

bool SearchField::eventFilter(QObject* watched, QEvent* event) {
    const auto* press =
        event->type() == QEvent::KeyPress ? static_cast<QKeyEvent*>(event) : nullptr;
    if (press && (press->key() == Qt::Key_Down || press->key() == Qt::Key_PageDown)) {
        Q_EMIT left();
        return true;
    }
    return QWidget::eventFilter(watched, event);
}

} // namespace quorl
