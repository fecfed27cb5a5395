#pragma once

#include <QAbstractScrollArea>
#include <QVariantAnimation>
#include <map>
#include <memory>

#include "quorl/content/PaneContent.h"
#include "quorl/window/accessible/RowTexts.h"
#include "quorl/window/look/PaneColors.h"
#include "quorl/window/look/WindowScreen.h"
#include "quorl/window/rows/RowsLayout.h"

namespace quorl {

/// A pane in a window: groups of rows on cards, painted on one surface that scrolls by touch, wheel
/// and keys. Main thread.
class RowsView final : public QAbstractScrollArea {
    Q_OBJECT

  public:
    /// `screen` outlives the view.
    RowsView(std::unique_ptr<PaneContent> content, WindowScreen& screen, QWidget* parent);

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

    /// What a finger on the row does: nothing where that is not the row that was drawn.
    void tap(NSInteger row);

    /// Makes a row the one that keys act on, and scrolls until it is seen.
    void setCurrentRow(NSInteger row);

  protected:
    void paintEvent(QPaintEvent* event) override;
    void resizeEvent(QResizeEvent* event) override;
    void changeEvent(QEvent* event) override;
    void scrollContentsBy(int horizontally, int vertically) override;
    void mousePressEvent(QMouseEvent* event) override;
    void mouseMoveEvent(QMouseEvent* event) override;
    void mouseReleaseEvent(QMouseEvent* event) override;
    void keyPressEvent(QKeyEvent* event) override;
    void focusInEvent(QFocusEvent* event) override;
    void focusOutEvent(QFocusEvent* event) override;

  private:
    struct Press {
        NSInteger row;
        QPointF position;
    };

    void connectScreen();
    void drawRows();
    void layOut();
    void tellAccessibility();
    void tellChanges(int line, const RowTexts& before, const RowTexts& now);
    void releasePress();
    [[nodiscard]] std::optional<NSInteger> rowByKey(int key) const;
    [[nodiscard]] QFont smallFont() const;

    void fadeRows(const UITableView& table, const std::vector<NSIndexPath>& paths);
    void startFading(QVariantAnimation& animation, int milliseconds);
    void fadeHighlight();
    void endHighlight();

    void paintSection(QPainter& painter, std::size_t number, const QRectF& exposed) const;
    void paintCard(QPainter& painter, const RowsLayout::Section& section,
                   const QRectF& exposed) const;
    void paintRow(QPainter& painter, NSInteger row, bool isLast) const;
    void paintFade(QPainter& painter) const;

    std::unique_ptr<PaneContent> content_;
    WindowScreen& screen_;
    RowsLayout layout_;
    PaneColors colors_;
    NSInteger currentRow_ = 0;
    bool showsCurrentRow_ = false; ///< keys were used last
    std::optional<Press> press_;   ///< a finger is down
    std::optional<NSInteger> highlightedRow_;
    QVariantAnimation highlight_;             ///< its opacity, from 1 to 0
    std::map<NSInteger, QPixmap> fadingRows_; ///< what reloaded rows looked like
    QVariantAnimation fade_;                  ///< its opacity, from 1 to 0

    std::map<NSInteger, RowTexts> told_; ///< what assistive technology knows of the rows on screen
};

} // namespace quorl
