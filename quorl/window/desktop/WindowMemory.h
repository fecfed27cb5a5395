#pragma once

#include <QSize>
#include <QString>
#include <optional>
#include <string>
#include <vector>

#include "quorl/app/Places.h"

namespace quorl {

/// How a window stood when it was closed.
struct WindowState {
    QSize size;
    std::vector<std::string> panes; ///< the classes of those over the front page, from below
};

/// Keeps how the window stood for the next start of the app, in a file: it is of this machine, and
/// nothing that a person chose. Main thread.
class WindowMemory final {
  public:
    /// `file` need not be there; empty for a memory that keeps nothing.
    explicit WindowMemory(QString file) : file_(std::move(file)) {}

    /// The person's own; a trial leaves it alone and has none.
    [[nodiscard]] static WindowMemory of(base::Purpose purpose);

    /// The size in points to open a window with on a screen that has so much room: as it was kept,
    /// or the usual one where nothing was that makes sense, but never larger than the room.
    [[nodiscard]] QSize size(const QSize& room) const;

    /// As they were kept; null where nothing was.
    [[nodiscard]] std::optional<std::vector<std::string>> panes() const;

    /// Gives back a sentence for the person where it could not be kept, else an empty text.
    [[nodiscard]] QString keep(const WindowState& state) const;

  private:
    const QString file_;
};

} // namespace quorl
