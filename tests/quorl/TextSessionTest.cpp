#include "quorl/terminal/TextSession.h"

#include <QTest>
#include <array>
#include <sstream>

#include <gmock/gmock.h>
#include <unistd.h>

#include "quorl/terminal/TextScreen.h"
#include "quorl/terminal/sheets/PrintedSheet.h"
#include "tests/quorl/SampleMusic.h"
#include "tests/quorl/StoredPreferences.h"

namespace quorl::tests {

namespace {

constexpr int patience = 60'000; // milliseconds

/// The panes in a terminal of the test's own process.
class TextSessionTest : public testing::Test {
  protected:
    TextSessionTest() {
        EXPECT_EQ(pipe(input_.data()), 0);
        session_.emplace(companion_, input_[0], sheet_, LineEntry::Keys{});
        companion_.start();
    }

    ~TextSessionTest() override {
        session_.reset();
        for (const int end : input_) {
            close(end);
        }
    }

    void say(const std::string& line) {
        EXPECT_EQ(write(input_[1], (line + '\n').data(), line.size() + 1),
                  static_cast<ssize_t>(line.size() + 1));
    }

    /// Runs the event loop until `text` was printed since the last call.
    [[nodiscard]] bool waitForText(const std::string& text) {
        const bool isThere = QTest::qWaitFor(
            [&] { return output_.str().find(text) != std::string::npos; }, patience);
        output_.str({});
        return isThere;
    }

    /// Has the library change under the chooser on the screen without anything being drawn.
    [[nodiscard]] bool addPlaylistUndrawn(const std::string& name) {
        const auto& chooser = dynamic_cast<UITableViewController&>(*companion_.navigation().top());
        bool isIdle = false; // the session has done with the last line
        screen_.whenDrawn(screen_, [&isIdle] { isIdle = true; });
        EXPECT_TRUE(QTest::qWaitFor([&isIdle] { return isIdle; }, patience));
        screen_.blockSignals(true);
        music_.addPlaylist(name);
        return QTest::qWaitFor(
            [&chooser] {
                return !chooser.tableView().cellForRowAtIndexPath({0, 0});
            },
            patience);
    }

    void drawAgain() {
        screen_.blockSignals(false);
        screen_.scheduleDrawing();
    }

    SampleMusic music_;
    TextScreen screen_;
    Notices notices_;
    Companion companion_ = Companion(Places{}, screen_, notices_);
    std::array<int, 2> input_{};
    std::ostringstream output_;
    PrintedSheet sheet_ = PrintedSheet(output_, input_[0]);
    std::optional<TextSession> session_;
};

TEST_F(TextSessionTest, numberReachesNoPlaylistThatWasNotPrinted) {
    say("1");
    ASSERT_TRUE(waitForText("  1  Long Run\n"));
    ASSERT_TRUE(addPlaylistUndrawn("Above All"));
    say("1");
    EXPECT_TRUE(waitForText("The rows have just changed. Look again before you choose one.\n"
                            "Synced Playlist\n\n  1  Above All\n"));
    EXPECT_EQ(storedPreference("asset-sync-enabled"), "false");
    drawAgain();
    say("1");
    EXPECT_TRUE(waitForText("  1  ✓ Above All: Sync Pending…\n"));
}

} // namespace

} // namespace quorl::tests
