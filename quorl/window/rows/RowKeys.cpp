#include "quorl/window/rows/RowKeys.h"

#include <QKeyEvent>
#include <algorithm>

namespace quorl {

std::optional<NSInteger> rowByKey(int key, NSInteger from, NSInteger last, NSInteger page) {
    const auto within = [last](NSInteger row) {
        return std::clamp<NSInteger>(row, 0, std::max<NSInteger>(last, 0));
    };
    switch (key) {
    case Qt::Key_Up:
        return within(from - 1);
    case Qt::Key_Down:
        return within(from + 1);
    case Qt::Key_PageUp:
        return within(from - page);
    case Qt::Key_PageDown:
        return within(from + page);
    case Qt::Key_Home:
        return within(0);
    case Qt::Key_End:
        return within(last);
    default:
        return std::nullopt;
    }
}

} // namespace quorl
