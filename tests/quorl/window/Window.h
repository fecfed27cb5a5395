#pragma once

#include <QRegularExpression>

#include "quorl/window/MainWindow.h"
#include "tests/quorl/SampleMusic.h"

namespace quorl::tests {

/// The app's window over a music folder of its own, with the real plug-in and the real services.
class Window {
  public:
    /// Shows the window, phone-sized, in which nothing moves by itself, and waits until the music
    /// folder has been read: the one given here, or one of its own.
    explicit Window(const std::filesystem::path& music = {});

    [[nodiscard]] SampleMusic& music() { return music_; }

    [[nodiscard]] Companion& companion() { return companion_; }

    [[nodiscard]] MainWindow& widget() { return window_; }

    [[nodiscard]] WindowScreen& screen() { return screen_; }

    /// The view of the top pane.
    [[nodiscard]] RowsView& view() { return *window_.topView(); }

    /// The title of the top pane.
    [[nodiscard]] std::string title();

    /// Clicks into the middle of a row that is on the screen.
    void click(NSInteger row);

    void press(Qt::Key key);

    /// Presses a key wherever the focus is.
    void pressWithFocus(Qt::Key key, Qt::KeyboardModifiers modifiers = Qt::NoModifier);

    /// Runs the event loop until the top pane has this among its `rows`; false where that does not
    /// come.
    [[nodiscard]] bool waitForRow(const QString& text);

    /// The same for a row that as a whole is like the pattern.
    [[nodiscard]] bool waitForRow(const QRegularExpression& pattern);

    /// The rows on the screen: "title", "title: value", and "✓ " before one that is checked.
    [[nodiscard]] QStringList rows();

  private:
    SampleMusic music_;
    WindowScreen screen_;
    Notices notices_;
    Companion companion_;
    MainWindow window_;
};

} // namespace quorl::tests
