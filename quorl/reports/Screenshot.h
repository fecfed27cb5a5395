#pragma once

#include "quorl/app/CommandLine.h"
#include "quorl/window/MainWindow.h"

namespace quorl {

/// Takes a picture of a window once it shows what is there: the music folder has been read, the
/// wearable has answered, what that led to has been done, and the pane that is wanted is open. Then
/// ends the application's event loop, with an exit code. Main thread.
class Screenshot final : public QObject {
    Q_OBJECT

  public:
    /// Both outlive the picture.
    Screenshot(Options options, Companion& companion, MainWindow& window);

  private:
    void beginWhenSettled();
    void openPane();
    void take();

    const Options options_;
    Companion& companion_;
    MainWindow& window_;
};

} // namespace quorl
