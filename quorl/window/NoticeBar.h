#pragma once

#include <QVBoxLayout>
#include <QWidget>

#include "quorl/app/Notices.h"
#include "quorl/window/look/WindowScreen.h"

namespace quorl {

class NoticeRow;

/// Shows the notices at the top of a window, each until it is put away or has become void, with a
/// button where something can be done. Never takes the focus; a screen reader is told of a new one
/// as a notification. Main thread.
class NoticeBar final : public QWidget {
    Q_OBJECT

  public:
    /// `notices` and `screen` outlive the bar.
    NoticeBar(Notices& notices, WindowScreen& screen, QWidget* parent);

  protected:
    void paintEvent(QPaintEvent* event) override;

  private:
    struct Row {
        std::string text;
        std::string actionName;
        NoticeRow* widget; ///< owned by the bar
    };

    using Rows = std::map<Notices::Topic, Row>;

    void showNotices();
    Rows::iterator remove(Rows::iterator row);
    void add(Notices::Topic topic, const Notice& notice);
    void putAway(Notices::Topic topic);

    Notices& notices_;
    WindowScreen& screen_;
    QVBoxLayout* column_;
    Rows rows_;
    std::map<Notices::Topic, std::string> putAway_; ///< the texts that nobody wants to see again
};

} // namespace quorl
