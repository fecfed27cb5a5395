#pragma once

#include <QTest>
#include <memory>

namespace quorl::tests {

/// A finger on a touch screen.
class Finger {
  public:
    void press(QWidget& widget, QPoint place) {
        QTest::touchEvent(&widget, screen_.get()).press(0, place, &widget);
    }

    void release(QWidget& widget, QPoint place) {
        QTest::touchEvent(&widget, screen_.get()).release(0, place, &widget);
    }

    void tap(QWidget& widget, QPoint place) {
        press(widget, place);
        release(widget, place);
    }

  private:
    std::unique_ptr<QPointingDevice> screen_ =
        std::unique_ptr<QPointingDevice>(QTest::createTouchDevice());
};

} // namespace quorl::tests
