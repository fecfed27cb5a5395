#include "quorl/window/frame/WindowFrame.h"

#include <QWindow>

#include "quorl/window/frame/FrameEdge.h"

namespace quorl {

namespace {

void toggleMaximized(QWidget& window) {
    window.setWindowState(window.windowState() ^ Qt::WindowMaximized);
}

void press(WindowButton button, QWidget& window) {
    switch (button) {
    case WindowButton::Minimize:
        return window.showMinimized();
    case WindowButton::Maximize:
        return toggleMaximized(window);
    case WindowButton::Close:
        window.close();
    }
}

} // namespace

bool isFrameLeftToApps(const QString& platform, const QString& desktops) {
    const bool hasWindows =
        platform == QStringLiteral("wayland") || platform == QStringLiteral("xcb");
    const auto names = desktops.split(u':');
    return hasWindows &&
           (names.contains(QStringLiteral("GNOME")) || names.contains(QStringLiteral("Pantheon")));
}

void frameByHeader(QWidget& window, HeaderBar& header, WindowScreen& screen) {
    window.setWindowFlag(Qt::FramelessWindowHint);
    new FrameEdge(screen, window); // NOLINT(cppcoreguidelines-owning-memory): owned by the window
    header.setWindowButtons(windowButtonsIn(screen.look().windowButtons));
    QObject::connect(&screen, &WindowScreen::lookChanged, &header, [&header, &screen] {
        header.setWindowButtons(windowButtonsIn(screen.look().windowButtons));
    });
    QObject::connect(&header, &HeaderBar::windowButtonClicked, &window,
                     [&window](WindowButton button) { press(button, window); });
    QObject::connect(&header, &HeaderBar::doubleClicked, &window,
                     [&window] { toggleMaximized(window); });
    QObject::connect(&header, &HeaderBar::dragged, &window,
                     [&window] { window.windowHandle()->startSystemMove(); });
}

} // namespace quorl
