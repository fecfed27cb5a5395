#pragma once

#include <QVariantAnimation>

#include "quorl/window/look/Look.h"

namespace quorl {

/// A share that goes from 1 to 0 on the screen, or at once where nothing is to move. Main thread.
class Fade final : public QVariantAnimation {
    Q_OBJECT

  public:
    explicit Fade(int milliseconds);

    void begin(Motion motion);

    /// From 1 to 0; 0 before the beginning and after the end.
    [[nodiscard]] double share() const;

    [[nodiscard]] bool isRunning() const { return state() == Running; }

  private:
    const int milliseconds_;
};

} // namespace quorl
