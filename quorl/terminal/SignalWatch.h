#pragma once

#include <QSocketNotifier>
#include <memory>

#include "services/base/FileDescriptor.h"

namespace quorl {

/// Takes the signals that a terminal and its shell send, so that the terminal can be put in order
/// before they have their effect. One per process. A signal that is ignored stays so; one that ends
/// a program does so at once when it comes a second time. Main thread.
class SignalWatch final : public QObject {
    Q_OBJECT

  public:
    SignalWatch();

    /// Gives every signal its usual effect again.
    ~SignalWatch() override;

    /// Has the process stopped, as SIGTSTP does where nobody takes it; comes back when it goes on.
    static void stop();

    /// Ends the process as `number` does where nobody takes it. After the watch.
    [[noreturn]] static void end(int number);

  Q_SIGNALS:
    /// SIGINT, SIGTERM or SIGHUP: the process is to end.
    void ending(int number);

    /// The process is to be stopped.
    void stopping();

    /// The process goes on after it was stopped.
    void goingOn();

    /// The terminal has another size.
    void resized();

  private:
    void take();

    base::FileDescriptor caught_;
    std::unique_ptr<QSocketNotifier> notifier_;
};

} // namespace quorl
