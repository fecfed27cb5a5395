#include "quorl/window/look/Fade.h"

namespace quorl {

Fade::Fade(int milliseconds) : milliseconds_(milliseconds) {
    setStartValue(1.0);
    setEndValue(0.0);
    setEasingCurve(QEasingCurve::OutCubic);
}

void Fade::begin(Motion motion) {
    stop();
    setDuration(motion == Motion::Reduced ? 0 : milliseconds_);
    start();
}

double Fade::share() const { return isRunning() ? currentValue().toDouble() : 0; }

} // namespace quorl
