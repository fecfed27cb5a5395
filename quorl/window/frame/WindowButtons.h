#pragma once

#include <QStringView>
#include <vector>

namespace quorl {

enum class WindowButton { Minimize, Maximize, Close };

/// The buttons of a window's title bar, in the order in which they are read.
struct WindowButtons {
    std::vector<WindowButton> atStart;
    std::vector<WindowButton> atEnd;

    [[nodiscard]] bool operator==(const WindowButtons&) const = default;
};

/// What a desktop says as "appmenu:minimize,maximize,close", the colon between both ends. What is
/// not known counts for nothing, for other apps may have such buttons.
[[nodiscard]] WindowButtons windowButtonsIn(QStringView text);

} // namespace quorl
