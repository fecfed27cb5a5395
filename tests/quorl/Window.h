#pragma once

#include "quorl/MainWindow.h"
#include "tests/quorl/Music.h"

namespace quorl::tests {

/// The app's window over a music folder of its own, with the real plug-in and the real services.
class Window {
  public:
    /// Shows the window, phone-sized, and waits until the music folder has been read.
    Window();

    [[nodiscard]] Music& music() { return music_; }

    [[nodiscard]] Companion& companion() { return companion_; }

    [[nodiscard]] MainWindow& widget() { return window_; }

    /// The view of the top pane.
    [[nodiscard]] RowsView& view() { return *window_.topView(); }

    /// The title of the top pane.
    [[nodiscard]] std::string title();

    /// Clicks into the middle of a row that is on the screen.
    void click(NSInteger row);

    void press(Qt::Key key);

    /// Runs the event loop until the top pane has this among its `rows`; false where that does not
    /// come.
    [[nodiscard]] bool waitForRow(const QString& text);

    /// The rows on the screen: "title", "title: value", and "✓ " before one that is checked.
    [[nodiscard]] QStringList rows();

  private:
    Music music_;
    WindowScreen screen_;
    Notices notices_;
    Companion companion_;
    MainWindow window_;
};

} // namespace quorl::tests
