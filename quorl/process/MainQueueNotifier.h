#pragma once

#include <QSocketNotifier>

namespace quorl {

/// Runs the work of libdispatch's main queue from Qt's event loop. Main thread.
class MainQueueNotifier final : public QObject {
    Q_OBJECT

  public:
    /// To be made before another thread is started.
    MainQueueNotifier();

  Q_SIGNALS:
    /// The queue has just been emptied.
    void drained();

  private:
    QSocketNotifier notifier_;
};

} // namespace quorl
