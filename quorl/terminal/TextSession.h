#pragma once

#include <QSocketNotifier>

#include "quorl/app/Companion.h"
#include "quorl/content/PaneContent.h"
#include "quorl/search/RowFinder.h"
#include "quorl/terminal/LineEntry.h"
#include "quorl/terminal/TypedCommand.h"
#include "quorl/terminal/sheets/Sheet.h"

namespace quorl {

/// The panes on a sheet: shows the top one again whenever it says something else, and takes
/// commands, one a line. Ends the application's event loop at the end of the input. Main thread.
class TextSession final : public QObject {
    Q_OBJECT

  public:
    /// Reads commands from the descriptor `input`. On a printed sheet none is taken before the
    /// music folder has been read and the pane been shown, so that a script meets the same panes
    /// each time. `companion` and `sheet` outlive the session, and the descriptor stays open as
    /// long.
    TextSession(Companion& companion, int input, Sheet& sheet, LineEntry::Keys keys);

    /// Shows all once more, in the form that the sheet has now.
    void showAgain();

  private:
    /// Rows from `first` to before `end`.
    struct RowRange {
        NSInteger first = 0;
        NSInteger end = 0;
    };

    [[nodiscard]] static RowRange rowsOf(const std::vector<TextLine>& lines);
    [[nodiscard]] std::string textOfPlace(const RowRange& rows) const;

    void listenToNotices();
    void readInput();
    void takeNextLine();
    void takeNextLineOnceShown();
    void take(const std::string& line);
    void follow(const TypedCommand& command, const std::string& line);
    void choose(NSInteger number);
    void tap(NSInteger row);
    void goBack();
    void search(const std::string& words);
    void endSearch();
    enum class Direction { Forward, Backward };
    void turnPage(Direction direction);
    void leave();
    void show();
    void takeTopPane();
    [[nodiscard]] std::vector<TextLine> page();
    [[nodiscard]] std::vector<TextLine> allLines(const SheetForm& form);
    [[nodiscard]] std::vector<TextLine> linesOfPane(const SheetForm& form);
    void cut(std::vector<TextLine>& lines, const SheetForm& form);
    [[nodiscard]] std::string textOfSearch() const;

    Companion& companion_;
    const int input_;
    Sheet& sheet_;
    std::unique_ptr<PaneContent> content_; ///< of the top pane; null for none
    std::unique_ptr<RowFinder> finder_;    ///< of its rows
    std::string words_;                    ///< that are searched for; empty for no search
    NSInteger firstLine_ = 0;              ///< of the page, of all that there is to say
    NSInteger firstDrawnRow_ = 0;
    RowRange shown_;
    QSocketNotifier notifier_;
    LineEntry entry_;
    bool isWaiting_ = true; ///< for what the last command leads to
};

} // namespace quorl
