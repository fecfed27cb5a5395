#pragma once

#include <QPointer>
#include <QWidget>

#include "quorl/window/look/WindowScreen.h"

namespace quorl {

/// The pages of the stack: the top one; and where there is room, the lowest one in a column beside
/// it. Main thread.
class PageColumns final : public QWidget {
    Q_OBJECT

  public:
    /// In points. From here on the columns are as wide as pages on two phones.
    static constexpr int widthForTwo = 720;

    /// `screen` outlives the columns.
    PageColumns(WindowScreen& screen, QWidget* parent);

    /// Takes a page in, which is not seen until it is shown.
    void add(QWidget* page);

    /// Shows these of the pages, which may be one. Without a lowest one the top one has all the
    /// room.
    void showPages(QWidget* lowest, QWidget* top);

    [[nodiscard]] bool hasTwo() const { return width() >= widthForTwo; }

    /// Where pages above the lowest one are.
    [[nodiscard]] QRect placeOfTop() const;

  Q_SIGNALS:
    /// There are two columns now, or one, and the pages are in their places.
    void countChanged();

  protected:
    void resizeEvent(QResizeEvent* event) override;
    void changeEvent(QEvent* event) override;
    void paintEvent(QPaintEvent* event) override;

  private:
    void placePages();
    void hideLowest();
    [[nodiscard]] QRect placeOfLowest() const;
    [[nodiscard]] int widthOfFirst() const;

    WindowScreen& screen_;
    QPointer<QWidget> lowest_;
    QPointer<QWidget> top_;
    bool hadTwo_ = false;
};

} // namespace quorl
