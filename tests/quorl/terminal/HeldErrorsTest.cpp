#include "quorl/terminal/sheets/HeldErrors.h"

#include <array>
#include <cstdlib>
#include <optional>
#include <string>

#include <gmock/gmock.h>
#include <poll.h>
#include <pty.h>

namespace quorl::tests {

namespace {

/// Standard error is this terminal as long as it is there.
class ErrorTerminal : public testing::Test {
  protected:
    ErrorTerminal() : before_(dup(STDERR_FILENO)) {
        int master = -1;
        int slave = -1;
        EXPECT_EQ(openpty(&master, &slave, nullptr, nullptr, nullptr), 0);
        master_ = base::FileDescriptor(master);
        dup2(slave, STDERR_FILENO);
        close(slave);
    }

    ~ErrorTerminal() override { dup2(before_.get(), STDERR_FILENO); }

    static void say(const std::string& text) {
        ASSERT_EQ(write(STDERR_FILENO, text.data(), text.size()), text.size());
    }

    /// All that is in the terminal by now.
    [[nodiscard]] std::string shown() const {
        std::string text;
        std::array<char, 256> buffer{};
        for (pollfd readable{master_.get(), POLLIN, 0}; poll(&readable, 1, 0) == 1;) {
            const ssize_t length = read(master_.get(), buffer.data(), buffer.size());
            text.append(buffer.data(), static_cast<std::size_t>(length));
        }
        return text;
    }

  private:
    const base::FileDescriptor before_;
    base::FileDescriptor master_;
};

TEST_F(ErrorTerminal, isToldWhatWasHeldOnceItIsLeft) {
    HeldErrors errors;
    errors.hold();
    errors.hold();
    say("first\n");
    EXPECT_EQ(shown(), "");
    errors.release();
    EXPECT_EQ(shown(), "first\r\n");
    say("at once\n");
    EXPECT_EQ(shown(), "at once\r\n");
}

TEST_F(ErrorTerminal, isToldNothingTwice) {
    {
        HeldErrors errors;
        for (const std::string text : {"one\n", "two\n"}) {
            errors.hold();
            say(text);
            errors.release();
        }
        EXPECT_EQ(shown(), "one\r\ntwo\r\n");
        errors.hold();
        say("three\n");
    }
    EXPECT_EQ(shown(), "three\r\n") << "who forgets to release loses nothing";
}

TEST_F(ErrorTerminal, isToldWhatAnotherProcessSaid) {
    HeldErrors errors;
    errors.hold();
    ASSERT_EQ(std::system("echo from elsewhere >&2"),
              0); // NOLINT(cert-env33-c,concurrency-mt-unsafe)
    EXPECT_EQ(shown(), "");
    errors.release();
    EXPECT_EQ(shown(), "from elsewhere\r\n");
}

TEST(HeldErrors, areNoneWhereStandardErrorIsNoTerminal) {
    testing::internal::CaptureStderr();
    HeldErrors errors;
    errors.hold();
    ASSERT_EQ(write(STDERR_FILENO, "now", 3), 3);
    EXPECT_EQ(testing::internal::GetCapturedStderr(), "now");
}

} // namespace

} // namespace quorl::tests
