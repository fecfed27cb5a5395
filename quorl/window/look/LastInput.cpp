#include "quorl/window/look/LastInput.h"

#include <QCoreApplication>
#include <QEvent>

namespace quorl {

LastInput::LastInput() { QCoreApplication::instance()->installEventFilter(this); }

bool LastInput::eventFilter(QObject* watched, QEvent* event) {
    const Kind before = kind_;
    switch (event->type()) {
    case QEvent::KeyPress:
    case QEvent::ShortcutOverride: // all that there is of a key that is a shortcut
        kind_ = Kind::Keys;
        break;
    case QEvent::MouseButtonPress:
    case QEvent::TouchBegin:
    case QEvent::TabletPress:
        kind_ = Kind::Pointer;
        break;
    default:
        break;
    }
    if (kind_ != before) {
        Q_EMIT changed();
    }
    return QObject::eventFilter(watched, event);
}

} // namespace quorl
