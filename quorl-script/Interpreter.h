#pragma once

#include <string_view>

#include "quorl-script/Commands.h"

namespace quorl {

/// Plays a script, line by line. Main thread; one for the process, since its host is installed as
/// the host of the process.
class Interpreter {
  public:
    /// `plugin` outlives the interpreter; `host`, which writes to `trace`, is installed.
    Interpreter(HostDouble& host, const std::shared_ptr<Trace>& trace, const Plugin& plugin)
        : stage_{host, trace, plugin, Panes(host.screen(), trace)} {}

    /// The reply to a line, without the end of the line. What is not a command has a reply too.
    [[nodiscard]] std::string reply(std::string_view line);

    /// The reply to a line that was not read because it is too long.
    [[nodiscard]] std::string replyToTooLongLine(std::size_t limit);

    /// Whether any command so far, or a step of one, was not carried out.
    [[nodiscard]] bool hasFailed() const { return hasFailed_; }

  private:
    [[nodiscard]] JsonObject carryOut(std::string_view line);
    [[nodiscard]] JsonObject perform(const Field& command);
    [[nodiscard]] JsonList performSteps(const Field& steps);
    [[nodiscard]] JsonObject performStep(const Field& step);
    [[nodiscard]] JsonObject failure(const std::exception& error);
    void runAndDraw();

    Stage stage_;
    bool hasFailed_ = false;
};

} // namespace quorl
