#pragma once

#include <QProcess>
#include <map>
#include <optional>
#include <string>
#include <vector>

namespace quorl::tests {

using Environment = std::map<std::string, std::string>;

/// `quorl`, running beside the test. Whatever takes longer than a minute throws, with what the
/// program has said.
class QuorlProcess {
  public:
    /// Starts `quorl` with `arguments`. An empty value takes a variable out of the environment.
    explicit QuorlProcess(const std::vector<std::string>& arguments,
                          const Environment& environment = {});

    /// Writes a line to its standard input.
    void say(const std::string& line);

    void closeInput();

    /// Waits until it has written `text` to its standard output since the last call, and gives
    /// back all up to and with that.
    std::string readUntil(const std::string& text);

    /// The same for its standard error.
    std::string readErrorsUntil(const std::string& text);

    /// Ends it at once, as SIGKILL does, and waits for that.
    void kill();

    /// How often each of its threads was awake so far, other than the main thread; nothing while
    /// one of them is.
    [[nodiscard]] std::optional<std::string> wakeUpsOfSleepingThreads() const;

    /// Closes its input, waits for its end and gives back how it ended: the exit code.
    int end();

    /// What it wrote, as far as `readUntil` did not take it; after `end`, all.
    [[nodiscard]] const std::string& output() const { return output_; }

    [[nodiscard]] const std::string& errors() const { return errors_; }

  private:
    void takeOutput();
    std::string take(std::string& from, QProcess::ProcessChannel channel, const std::string& text);

    QProcess process_;
    std::string output_;
    std::string errors_;
};

} // namespace quorl::tests
