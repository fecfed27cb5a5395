#pragma once

#include <QPixmap>
#include <QWidget>

#include "quorl/window/look/Fade.h"

namespace quorl {

/// Slides one page over another, above both, and takes what is pressed meanwhile: nobody can aim at
/// a row that moves. Main thread.
class PageSlide final : public QWidget {
    Q_OBJECT

  public:
    enum class Direction { Forward, Back };

    /// Lies above all that is in `pages`.
    explicit PageSlide(QWidget* pages);

    /// From what the page in this place of `pages` looked like to what it looks like; at once where
    /// nothing is to move.
    void begin(const QRect& place, const QPixmap& before, const QPixmap& after, Direction direction,
               Motion motion);

    [[nodiscard]] bool isRunning() const { return fade_.isRunning(); }

  protected:
    void paintEvent(QPaintEvent* event) override;

  private:
    void end();

    QPixmap before_;
    QPixmap after_;
    Direction direction_ = Direction::Forward;
    Fade fade_;
};

} // namespace quorl
