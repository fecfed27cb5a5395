#pragma once

#include <QLabel>
#include <QLineEdit>

#include "quorl/window/look/WindowScreen.h"

namespace quorl {

/// A field above rows for what is looked for in their names. Main thread.
class SearchField final : public QWidget {
    Q_OBJECT

  public:
    /// `screen` outlives the field.
    SearchField(WindowScreen& screen, QWidget* parent);

    /// Shows itself, empty, and takes the focus. Where it is open, its text is there to be typed
    /// over.
    void open();

    /// Whether the text is to be told to match no row.
    void setFound(bool isAnyFound);

    bool eventFilter(QObject* watched, QEvent* event) override;

  Q_SIGNALS:
    void textChanged(const QString& text);
    void closed();

    /// The keys are to go to the rows.
    void left();

  private:
    QLineEdit* edit_;
    QLabel* nothing_;
};

} // namespace quorl
