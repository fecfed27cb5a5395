#pragma once

#include <QPainter>
#include <QPixmap>
#include <map>

#include "quorl/window/look/Fade.h"
#include "quorl/window/rows/RowsLayout.h"

namespace quorl {

/// What rows looked like that have been loaded anew, fading out over what they look like now. Main
/// thread.
class RowFades final : public QObject {
    Q_OBJECT

  public:
    RowFades();

    /// Keeps what a row looks like.
    void keep(NSInteger row, const QPixmap& picture) { pictures_[row] = picture; }

    void begin(Motion motion) { fade_.begin(motion); }

    /// The rows have moved: nothing fades any more.
    void end();

    void paint(QPainter& painter, const RowsLayout& layout) const;

  Q_SIGNALS:
    /// The row looks different now.
    void changed(NSInteger row);

  private:
    void tellChanges();

    std::map<NSInteger, QPixmap> pictures_;
    Fade fade_;
};

} // namespace quorl
