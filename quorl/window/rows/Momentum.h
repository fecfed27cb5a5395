#pragma once

#include <QScroller>
#include <QWidget>

class QWheelEvent;

namespace quorl {

/// The motion that a flick leaves rows in. A press on moving rows only stops them: nobody can aim
/// at one. Main thread.
class Momentum final : public QObject {
    Q_OBJECT

  public:
    /// Has the viewport of a scroll area flicked by touch from now on. It outlives this object.
    explicit Momentum(QWidget& viewport);

    /// Whether the press that has just come stops rows that move, and does nothing else.
    [[nodiscard]] bool takesPress();

    /// Whether a wheel's event still belongs to a motion that was stopped.
    [[nodiscard]] bool isOver(const QWheelEvent& event);

    void stop();

  Q_SIGNALS:
    /// The finger that is down drags the rows now.
    void dragged();

  private:
    void follow(QScroller::State state);

    QScroller& scroller_;
    QScroller::State state_ = QScroller::Inactive;
    bool stopsByTouch_ = false; ///< the finger came down on rows that moved
    bool rollsByWheel_ = false; ///< the wheel has been let go of and still turns
    bool ignoresWheel_ = false; ///< until a hand turns it again
};

} // namespace quorl
