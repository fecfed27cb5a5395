#pragma once

#include <QSocketNotifier>
#include <QTimer>
#include <optional>
#include <string>

#include "quorl/app/Companion.h"
#include "quorl/content/PaneContent.h"

namespace quorl {

/// The panes in a terminal: prints the top one again whenever it says something else, and takes
/// commands from standard input, one a line. Ends the application's event loop at the end of the
/// input. Main thread.
class TextSession final : public QObject {
    Q_OBJECT

  public:
    /// `companion` outlives the session. Reads no command before the music folder has been read, so
    /// that a script meets the same panes each time.
    explicit TextSession(Companion& companion);

  private:
    void readInput();
    void takeNextLine();
    void take(const std::string& command);
    void tap(NSInteger row);
    void scroll(NSInteger rows);
    void show();
    void print(const std::string& text);
    void drawContent();

    Companion& companion_;
    std::unique_ptr<PaneContent> content_; ///< of the top pane; null for none
    NSInteger firstRow_ = 0;
    std::string shown_; ///< what was printed last
    QSocketNotifier input_;
    QTimer nextLine_;
    std::string unread_; ///< input that is not taken yet
    bool isAtEnd_ = false;
};

} // namespace quorl
