#pragma once

#include <QLabel>
#include <QToolButton>
#include <QWidget>

namespace quorl {

/// The bar above a pane: its title, and a button back to the pane below. Main thread.
class HeaderBar final : public QWidget {
    Q_OBJECT

  public:
    HeaderBar(const QColor& tint, QWidget* parent);

    /// `below` names the pane that the button goes back to; empty for no button.
    void setTitles(const QString& title, const QString& below);

  Q_SIGNALS:
    void backClicked();

  protected:
    void resizeEvent(QResizeEvent* event) override;
    void changeEvent(QEvent* event) override;

  private:
    void dress();
    void fitTexts();

    QString title_;
    QString below_;
    QToolButton* back_;
    QLabel* label_;
    const QColor tint_;
};

} // namespace quorl
