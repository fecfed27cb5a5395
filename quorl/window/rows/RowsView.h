#pragma once

#include <QAbstractScrollArea>
#include <QTimer>
#include <map>
#include <memory>

#include "quorl/content/PaneContent.h"
#include "quorl/content/RowPlaces.h"
#include "quorl/search/RowFinder.h"
#include "quorl/window/accessible/RowTexts.h"
#include "quorl/window/look/PaneColors.h"
#include "quorl/window/look/WindowScreen.h"
#include "quorl/window/rows/Momentum.h"
#include "quorl/window/rows/OverlayScrollBar.h"
#include "quorl/window/rows/RowFades.h"
#include "quorl/window/rows/RowTouch.h"
#include "quorl/window/rows/RowsLayout.h"
#include "quorl/window/search/SearchField.h"
#include "quorl/window/search/TypeAhead.h"

namespace quorl {

/// A pane in a window: groups of rows on cards, painted on one surface that scrolls by touch, wheel
/// and keys, and can be searched where it is long. It opens at the row that is checked. A person's
/// place in it stays at the same rows when they are loaded anew. Main thread.
class RowsView final : public QAbstractScrollArea {
    Q_OBJECT

  public:
    /// `screen` outlives the view.
    RowsView(std::unique_ptr<PaneContent> content, WindowScreen& screen, QWidget* parent);
    ~RowsView() override;

    /// Draws the pane and shows what has changed.
    void draw();

    [[nodiscard]] PaneContent& content() const { return *content_; }

    /// Where things are, in points from the top of the whole pane.
    [[nodiscard]] const RowsLayout& layout() const { return layout_; }

    /// The same place on the viewport.
    [[nodiscard]] QRectF onViewport(const QRectF& place) const;
    [[nodiscard]] QPointF onPane(QPointF onViewport) const;

    /// The row that keys act on; null for an empty pane.
    [[nodiscard]] std::optional<NSInteger> currentRow() const;

    /// Whether the row whose pane is open is marked: where both panes are seen.
    enum class OpenRow { Plain, Marked };

    void setOpenRow(OpenRow openRow);

    /// The row that is marked; null for none.
    [[nodiscard]] std::optional<NSInteger> markedRow() const;

    /// What a finger on the row does: nothing where that is not the row that was drawn.
    void tap(NSInteger row);

    /// Makes a row the one that keys act on, and scrolls until it is seen.
    void setCurrentRow(NSInteger row);

    /// Whether the pane has more rows than are seen at once, or is being searched.
    [[nodiscard]] bool canBeSearched() const;

    /// Opens a field that leaves only rows with its text, where the pane can be searched.
    void openSearch();

    /// Shows all rows again, at the one that was found.
    void closeSearch();

    [[nodiscard]] bool isSearched() const { return search_ != nullptr && !search_->isHidden(); }

  Q_SIGNALS:
    /// A person asks what there is to know of a row: by the right button, the menu key or a long
    /// press there.
    void contextAsked(NSInteger row, QPoint onScreen);

    /// Assistive technology is told this of a line on the screen.
    void told(int line, QAccessible::Event news);

  protected:
    bool viewportEvent(QEvent* event) override;
    void paintEvent(QPaintEvent* event) override;
    void resizeEvent(QResizeEvent* event) override;
    void changeEvent(QEvent* event) override;
    void scrollContentsBy(int horizontally, int vertically) override;
    void wheelEvent(QWheelEvent* event) override;
    void mousePressEvent(QMouseEvent* event) override;
    void mouseDoubleClickEvent(QMouseEvent* event) override;
    void mouseMoveEvent(QMouseEvent* event) override;
    void mouseReleaseEvent(QMouseEvent* event) override;
    void contextMenuEvent(QContextMenuEvent* event) override;
    void keyPressEvent(QKeyEvent* event) override;
    void focusInEvent(QFocusEvent* event) override;
    void focusOutEvent(QFocusEvent* event) override;

  private:
    /// What is seen of a line, by which a change is told.
    struct ShownLine {
        QRectF place;
        RowTexts texts;
        bool isMarked = false;

        [[nodiscard]] bool operator==(const ShownLine&) const = default;
    };

    void connectScreen();
    void connectSearch();
    void makeSearchField();
    void drawRows();
    void layOut();
    void keepPlaces(const RowsLayout& before, int scrolled);
    void showChanges(const RowsLayout& before);
    [[nodiscard]] std::map<int, ShownLine> linesOnScreen() const;
    [[nodiscard]] RowTexts textsOfLine(const RowsLayout::Line& line) const;
    void tell(int line, QAccessible::Event news);
    Q_INVOKABLE void tellFocus();
    void updatePlace(const QRectF& place);
    void updateRow(NSInteger row);
    void updateCurrentRow();
    void makeCurrent(NSInteger row);
    void notePlaces();

    void showMatches(std::optional<std::vector<NSInteger>> paneRows);
    void placeSearch();
    void typeAhead(const QKeyEvent& event);
    void goToPaneRow(NSInteger paneRow);
    void openAt(NSInteger paneRow);
    bool takeKey(const QKeyEvent& event);
    void pressAt(QPointF onViewport);
    void releaseAt(QPointF onViewport);
    void takeTouch(const QTouchEvent& event);
    void askContext(NSInteger row);
    [[nodiscard]] NSInteger rowsOnPage() const;
    [[nodiscard]] std::optional<NSInteger> rowAt(QPointF onViewport) const;
    [[nodiscard]] QString toolTipAt(QPointF onViewport) const;

    void fadeRows(const UITableView& table, const std::vector<NSIndexPath>& paths);
    [[nodiscard]] TouchState stateOf(NSInteger row) const;
    [[nodiscard]] bool showsFocus() const;

    std::unique_ptr<PaneContent> content_;
    WindowScreen& screen_;
    RowsLayout layout_;
    PaneColors colors_;
    RowPlaces places_;
    NSInteger currentRow_ = 0;
    RowTouch touch_;
    QTimer longPress_;
    RowFades fades_;
    Momentum momentum_;
    RowFinder finder_;
    TypeAhead typeAhead_;
    /// Null until there was a search.
    SearchField* search_ = nullptr;
    OverlayScrollBar* scrollBar_;
    OpenRow openRow_ = OpenRow::Plain;
    bool wasPressed_ = false;        ///< ever
    bool isOpened_ = false;          ///< it has been seen
    std::map<int, ShownLine> shown_; ///< as last drawn; what assistive technology knows
};

} // namespace quorl
