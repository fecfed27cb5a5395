#pragma once

#include <QBoxLayout>
#include <QLabel>

#include "quorl/app/Notices.h"
#include "quorl/window/look/WindowScreen.h"

namespace quorl {

/// One notice in a window, with a button for what can be done, beside the text where both fit into
/// one line and else below it, and one that puts it away. To a screen reader it is a notification.
/// Main thread.
class NoticeRow final : public QWidget {
    Q_OBJECT

  public:
    /// `screen` outlives the row.
    NoticeRow(const Notice& notice, WindowScreen& screen, QWidget* parent);

  Q_SIGNALS:
    void putAway();

  protected:
    void resizeEvent(QResizeEvent* event) override;

  private:
    QBoxLayout* const line_;
    QBoxLayout* const textAndAction_;
};

} // namespace quorl
