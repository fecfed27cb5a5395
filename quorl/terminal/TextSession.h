#pragma once

#include <QSocketNotifier>
#include <iosfwd>
#include <optional>
#include <string>

#include "quorl/app/Companion.h"
#include "quorl/content/PaneContent.h"

namespace quorl {

/// The panes in a terminal: prints the top one again whenever it says something else, and takes
/// commands, one a line. Ends the application's event loop at the end of the input. Main thread.
class TextSession final : public QObject {
    Q_OBJECT

  public:
    /// Reads commands from the descriptor `input`, and none before the music folder has been read
    /// and the pane been drawn, so that a script meets the same panes each time. `companion` and
    /// `output` outlive the session, and the descriptor stays open as long.
    TextSession(Companion& companion, int input, std::ostream& output);

  private:
    void readInput();
    void readOnceDrawn();
    void takeNextLine();
    void take(const std::string& command);
    void tap(NSInteger row);
    void scroll(NSInteger rows);
    void show();
    void print(const std::string& text);

    Companion& companion_;
    const int input_;
    std::ostream& output_;
    std::unique_ptr<PaneContent> content_; ///< of the top pane; null for none
    NSInteger firstRow_ = 0;
    std::string shown_; ///< what was printed last
    QSocketNotifier notifier_;
    std::string unread_;     ///< input that is not taken yet
    bool isWaiting_ = false; ///< for what the last command leads to
    bool isAtEnd_ = false;
};

} // namespace quorl
