#pragma once

#include <QScrollArea>

namespace quorl {

/// What a window shows in place of a pane that there is not: what is wrong, to read and to copy.
class ProblemPage final : public QScrollArea {
    Q_OBJECT

  public:
    ProblemPage(const QString& text, QWidget* parent);
};

} // namespace quorl
