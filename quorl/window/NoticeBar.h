#pragma once

#include <QFrame>
#include <QLabel>

#include "quorl/app/Notices.h"
#include "quorl/window/look/WindowScreen.h"

namespace quorl {

/// Shows the notices at the top of a window until they are put away or have become void. Never
/// takes the focus. Main thread.
class NoticeBar final : public QFrame {
    Q_OBJECT

  public:
    /// `notices` and `screen` outlive the bar.
    NoticeBar(Notices& notices, WindowScreen& screen, QWidget* parent);

  protected:
    void paintEvent(QPaintEvent* event) override;

  private:
    void showNotices();

    Notices& notices_;
    const WindowScreen& screen_;
    QLabel* label_;
};

} // namespace quorl
