#pragma once

#include <QDialog>

namespace quorl {

/// Tells what this app is, its version, and the licences of it and of what it uses. Its text is
/// read, scrolled and followed by keys, too. Main thread.
class AboutWindow final : public QDialog {
    Q_OBJECT

  public:
    /// Deletes itself when it is closed.
    explicit AboutWindow(QWidget* parent);
};

} // namespace quorl
