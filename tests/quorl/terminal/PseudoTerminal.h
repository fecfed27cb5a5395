#pragma once

#include <memory>
#include <string>
#include <vector>

#include <sys/types.h>
#include <vterm.h>

#include "services/base/FileDescriptor.h"
#include "tests/quorl/QuorlProcess.h"

namespace quorl::tests {

/// A program in a terminal of its own, with what a person sees on that. Whatever takes longer than
/// a minute throws, with what is on the screen.
class PseudoTerminal {
  public:
    struct Size {
        int columns;
        int lines;
    };

    /// Starts `command`, a program with its arguments. An empty value takes a variable out of the
    /// environment.
    PseudoTerminal(const std::vector<std::string>& command, Size size,
                   const Environment& environment = {});

    PseudoTerminal(const PseudoTerminal&) = delete;
    PseudoTerminal& operator=(const PseudoTerminal&) = delete;

    /// Takes the terminal away from the program, and ends that.
    ~PseudoTerminal();

    void type(const std::string& bytes);
    void signal(int number) const;
    void resize(Size size);

    /// Waits until this is on the screen, or is not.
    void waitFor(const std::string& text);
    void waitUntilGone(const std::string& text);

    /// Waits until what was written to the terminal ends with this.
    void waitForEnding(const std::string& written);

    /// The lines of the screen, without blanks at their ends.
    [[nodiscard]] std::vector<std::string> lines() const;

    [[nodiscard]] std::string screen() const;

    /// The line of the screen that has this, or "".
    [[nodiscard]] std::string lineWith(const std::string& text) const;

    /// The column of the cursor, counted from 0.
    [[nodiscard]] int cursorColumn() const;

    /// Whether the terminal itself shows what is typed, and makes lines of it.
    [[nodiscard]] bool hasUsualMode() const;

    /// All that was written to the terminal since the last call.
    [[nodiscard]] std::string takeWritten();

    /// Waits for the program's end and gives back its status, as `waitpid` does.
    int end();

  private:
    /// False where the program has left the terminal.
    bool readMore();

    Size size_;
    const std::unique_ptr<VTerm, decltype(&vterm_free)> emulator_;
    VTermScreen* const screen_;
    base::FileDescriptor master_;
    pid_t process_ = -1;
    std::string written_;
};

} // namespace quorl::tests
