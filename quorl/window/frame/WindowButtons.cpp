#include "quorl/window/frame/WindowButtons.h"

#include <QStringTokenizer>

namespace quorl {

namespace {

std::vector<WindowButton> buttonsIn(QStringView names) {
    std::vector<WindowButton> buttons;
    for (const QStringView name : qTokenize(names, u',')) {
        if (name == u"minimize") {
            buttons.push_back(WindowButton::Minimize);
        } else if (name == u"maximize") {
            buttons.push_back(WindowButton::Maximize);
        } else if (name == u"close") {
            buttons.push_back(WindowButton::Close);
        }
    }
    return buttons;
}

} // namespace

WindowButtons windowButtonsIn(QStringView text) {
    const auto colon = text.indexOf(u':');
    return colon < 0 ? WindowButtons{buttonsIn(text), {}}
                     : WindowButtons{buttonsIn(text.left(colon)), buttonsIn(text.mid(colon + 1))};
}

} // namespace quorl
