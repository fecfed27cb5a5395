#pragma once

#include <QProcess>
#include <functional>
#include <string>

namespace quorl {

/// The sync engine of a trial, which runs for as long as this object, or the process, is there.
/// Main thread.
class TrialEngine final {
  public:
    /// Is told with a sentence for the user why the engine does not run.
    using Problem = std::function<void(const std::string& text)>;

    /// Starts the `quorl-syncd` beside the running program.
    explicit TrialEngine(const Problem& problem);

    /// Ends it, and waits for that for some seconds.
    ~TrialEngine();

    TrialEngine(const TrialEngine&) = delete;
    TrialEngine& operator=(const TrialEngine&) = delete;

  private:
    QProcess process_;
};

} // namespace quorl
