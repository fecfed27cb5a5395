#pragma once

#include <QLabel>
#include <QWidget>
#include <optional>
#include <vector>

#include "quorl/window/frame/WindowButtons.h"
#include "quorl/window/look/FlatButton.h"

namespace quorl {

/// The bar above a pane: its title, a button back to the pane below, and one that finds rows. Over
/// the lowest pane there is room for the app's menu. May be the window's title bar, too. Main
/// thread.
class HeaderBar final : public QWidget {
    Q_OBJECT

  public:
    /// Whether the pane's rows can be searched.
    enum class Search { None, Offered };

    /// `screen` outlives the bar.
    HeaderBar(WindowScreen& screen, QWidget* parent);

    /// What the button of the menu opens.
    void setMenu(QMenu* menu) { menu_->setMenu(menu); }

    /// `below` names the pane that the button goes back to; empty for no button.
    void setTitles(const QString& title, const QString& below, Search search);

    /// None at first.
    void setWindowButtons(const WindowButtons& buttons);

  Q_SIGNALS:
    void backClicked();
    void searchClicked();
    void windowButtonClicked(WindowButton button);

    /// Somebody pulls at the bar itself with the mouse, or with a finger.
    void dragged();
    void doubleClicked();

  protected:
    void mousePressEvent(QMouseEvent* event) override;
    void mouseMoveEvent(QMouseEvent* event) override;
    void mouseReleaseEvent(QMouseEvent* event) override;
    void mouseDoubleClickEvent(QMouseEvent* event) override;
    void resizeEvent(QResizeEvent* event) override;
    void changeEvent(QEvent* event) override;

  private:
    void fitTexts();
    [[nodiscard]] int backWidth(const QString& text) const;
    [[nodiscard]] QString fittingBackText() const;
    [[nodiscard]] FlatButton* add(WindowButton button);
    [[nodiscard]] int widthAtStart() const;
    [[nodiscard]] QRect roomForTitle(int backWidth) const;
    [[nodiscard]] std::vector<QWidget*> buttonsAtEnd() const;
    void place(QWidget& widget, const QRect& leftToRight) const;

    WindowScreen& screen_;
    QString title_;
    QString below_;
    FlatButton* back_;
    FlatButton* search_;
    FlatButton* menu_;
    QLabel* label_;
    WindowButtons windowButtons_;
    std::vector<FlatButton*> windowButtonsAtStart_; ///< from the edge inwards
    std::vector<FlatButton*> windowButtonsAtEnd_;   ///< from the edge inwards
    std::optional<QPoint> pressed_;                 ///< where the bar is held
};

} // namespace quorl
