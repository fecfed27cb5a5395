#include "quorl/window/ProblemPage.h"

#include <QLabel>

namespace quorl {

namespace {

constexpr int margin = 24;

/// `text` with places to break the line within paths, which have no spaces.
QString breakable(QString text) { return text.replace(u'/', QStringLiteral("/\u200b")); }

} // namespace

ProblemPage::ProblemPage(const QString& text, QWidget* parent) : QScrollArea(parent) {
    auto* label = new QLabel(breakable(text), this);
    label->setAccessibleName(text);
    label->setWordWrap(true);
    label->setTextFormat(Qt::PlainText);
    label->setTextInteractionFlags(Qt::TextSelectableByMouse | Qt::TextSelectableByKeyboard);
    label->setAlignment(Qt::AlignLeading | Qt::AlignTop);
    label->setMargin(margin);
    setWidget(label);
    setWidgetResizable(true);
    setFrameShape(QFrame::NoFrame);
    setHorizontalScrollBarPolicy(Qt::ScrollBarAlwaysOff);
}

} // namespace quorl
