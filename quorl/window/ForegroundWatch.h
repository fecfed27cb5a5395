#pragma once

#include <QWidget>

#include "quorl/app/Companion.h"

namespace quorl {

/// Tells the companion when its window leaves the screen (hidden, minimised, or the whole app put
/// aside by the system) and when it is about to come back. Another window in front is neither, but
/// then a person may not see the panes. Main thread.
class ForegroundWatch final : public QObject {
    Q_OBJECT

  public:
    /// Both outlive the watch. The window counts as in the foreground until it leaves the screen.
    ForegroundWatch(QWidget& window, Companion& companion);

    bool eventFilter(QObject* watched, QEvent* event) override;

  private:
    void setInBackground(bool isInBackground);
    void tellSeen();

    QWidget& window_;
    Companion& companion_;
    bool isInBackground_ = false;
};

} // namespace quorl
