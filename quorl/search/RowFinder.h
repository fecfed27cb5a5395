#pragma once

#include <QStringList>
#include <QTimer>

#include "quorl/content/RowNames.h"

namespace quorl {

/// Finds rows of a pane by what they are called. The names of a long list are read bit by bit, in
/// turns of the event loop, so what is found may be told later. Main thread.
class RowFinder final : public QObject {
    Q_OBJECT

  public:
    /// Rows are those of the pane, whichever are shown. `content` outlives the finder.
    explicit RowFinder(PaneContent& content);

    /// Looks for the row that is checked, once.
    void findChecked();

    void stopFindingChecked() { findsChecked_ = false; }

    /// Looks for the rows with a text in their names, until `endFilter`.
    void filter(const QString& text);
    void endFilter();

    /// Looks for the first row from `start` on, then from the top, whose name begins like this.
    void findBeginning(const QString& beginning, NSInteger start);

    /// The pane has been drawn with other rows.
    void rowsDidChange();

    /// Whether names are still to be read for what is looked for.
    [[nodiscard]] bool isReading() const;

  Q_SIGNALS:
    void checkedFound(NSInteger paneRow);
    void beginningFound(NSInteger paneRow);

    /// The rows that match now; more may follow.
    void matchesChanged(const std::vector<NSInteger>& paneRows);

  private:
    struct Beginning {
        QString text;
        NSInteger start;
    };

    void readSlice(NSInteger rows);
    void advance();
    void addMatches();
    void tellChecked();
    void tellBeginning();

    RowNames names_;
    PaneContent& content_;
    QStringList folded_; ///< the names that have been read
    bool findsChecked_ = false;
    std::optional<QString> filter_;
    std::vector<NSInteger> matches_;
    qsizetype unmatched_ = 0;    ///< the first name that was not yet held against the filter
    bool isMatchedAnew_ = false; ///< old matches stay until all names are read
    std::optional<Beginning> beginning_;
    QTimer timer_;
};

} // namespace quorl
