#pragma once

#include <memory>
#include <string>

#include <termios.h>

#include "quorl/terminal/sheets/HeldErrors.h"

namespace quorl {

/// The terminal of this process, where it can be written anywhere. While it is entered it shows
/// what is typed not by itself, none of what was on it before, and nothing of what is said on
/// standard error until it is left. Main thread.
class Terminal {
  public:
    struct Size {
        int width;  ///< in columns
        int height; ///< in lines
    };

    /// Null where standard input or output is no terminal, or one that cannot be written anywhere.
    [[nodiscard]] static std::unique_ptr<Terminal> ofProcess();

    Terminal(const Terminal&) = delete;
    Terminal& operator=(const Terminal&) = delete;

    /// Leaves it.
    ~Terminal();

    /// Empty, and with its lines not going on in the next one. Nothing where it is entered.
    void enter();

    /// As it was before it was entered. Nothing where it is not.
    void leave();

    [[nodiscard]] Size size() const;

    void clear();

    /// Puts `text` in place of what a line, counted from 0, says.
    void write(int line, const std::string& text);

    /// Moves the cursor, and brings all that was written to the terminal.
    void show(int line, int column);

    /// What a key sends, by its name in the database of terminals; empty for nothing.
    [[nodiscard]] static std::string key(const char* name);

  private:
    explicit Terminal(const termios& before) : before_(before) {}

    const termios before_;
    bool isEntered_ = false;
    HeldErrors errors_;
};

} // namespace quorl
