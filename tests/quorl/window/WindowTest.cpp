#include "tests/quorl/window/Window.h"

#include <QScrollBar>
#include <QTest>
#include <QToolButton>
#include <filesystem>
#include <fstream>

#include <gmock/gmock.h>

#include "quorl/content/SwitchCell.h"
#include "quorl/pages/SyncPage.h"
#include "tests/engine/client/WatchedEngine.h"
#include "tests/quorl/StoredPreferences.h"

namespace quorl::tests {

namespace {

using testing::Contains;
using testing::HasSubstr;

constexpr int patience = 60'000; // milliseconds

TEST(Window, rootPaneShowsPlaylistAndLimit) {
    Window window;
    EXPECT_TRUE(window.waitForRow("Synced Playlist: None"));
    EXPECT_TRUE(window.waitForRow("Playlist Limit: 500 MB"));
    EXPECT_EQ(window.title(), "Music");
    EXPECT_EQ(window.widget().windowTitle(), "Velora");
}

TEST(Window, clickOnAPlaylistChecksItAndStoresIt) {
    Window window;
    window.click(0);
    ASSERT_EQ(window.title(), "Synced Playlist");
    ASSERT_TRUE(window.waitForRow("✓ None"));
    window.click(1);
    EXPECT_TRUE(window.waitForRow("✓ Road Trip: Sync Pending…"));
    EXPECT_TRUE(window.waitForRow("None"));
    EXPECT_EQ(storedPreference("asset-sync-enabled"), "true");
}

/// The settings of this session can be read, but not written any more.
void breakSettings() {
    const auto settings = std::filesystem::path(qgetenv("XDG_CONFIG_HOME").constData()) / "dconf";
    std::filesystem::remove_all(settings);
    std::ofstream(settings) << "in the way";
}

TEST(Window, playlistThatCouldNotBeStoredIsNotShownAsChosen) {
    Window window;
    window.click(0);
    ASSERT_TRUE(window.waitForRow("✓ None"));
    breakSettings();
    window.click(1);
    EXPECT_TRUE(window.waitForRow("✓ None"));
    EXPECT_THAT(window.rows(), Contains("Road Trip"));
    EXPECT_THAT(window.companion().notices().texts(), Contains(HasSubstr("was not changed")));
}

TEST(Window, limitThatCouldNotBeStoredIsNotShownAsChosen) {
    Window window;
    window.press(Qt::Key_End);
    window.press(Qt::Key_Return);
    ASSERT_TRUE(window.waitForRow("✓ 500 MB"));
    breakSettings();
    window.press(Qt::Key_End);
    window.press(Qt::Key_Space);
    EXPECT_TRUE(window.waitForRow("✓ 500 MB"));
    EXPECT_THAT(window.rows(), Contains("2 GB"));
}

TEST(Window, keysAloneChooseALimit) {
    Window window;
    window.press(Qt::Key_End);
    window.press(Qt::Key_Return);
    ASSERT_EQ(window.title(), "Playlist Limit");
    window.press(Qt::Key_End);
    window.press(Qt::Key_Space);
    EXPECT_TRUE(window.waitForRow("✓ 2 GB"));
    window.press(Qt::Key_Escape);
    EXPECT_EQ(window.title(), "Music");
    EXPECT_TRUE(window.waitForRow("Playlist Limit: 2 GB"));
}

TEST(Window, backButtonIsNamedAfterThePaneBelow) {
    Window window;
    auto* back = window.widget().findChild<QToolButton*>(QStringLiteral("back"));
    ASSERT_TRUE(back);
    EXPECT_EQ(back->text(), "Velora");
    window.click(1);
    EXPECT_TRUE(back->isVisible());
    EXPECT_EQ(back->text(), "Music");
    back->click();
    QCoreApplication::processEvents();
    EXPECT_EQ(window.title(), "Music");
    back->click();
    QCoreApplication::processEvents();
    EXPECT_EQ(window.title(), "Velora");
    EXPECT_FALSE(back->isVisible());
}

TEST(Window, fingerThatMovesOffARowTapsNothing) {
    Window window;
    auto* viewport = window.view().viewport();
    const auto row = window.view().onViewport(window.view().layout().rowRect(0));
    QTest::mousePress(viewport, Qt::LeftButton, Qt::NoModifier, row.center().toPoint());
    QTest::mouseMove(viewport, row.center().toPoint() + QPoint(0, 200));
    QTest::mouseRelease(viewport, Qt::LeftButton, Qt::NoModifier,
                        row.center().toPoint() + QPoint(0, 200));
    QCoreApplication::processEvents();
    EXPECT_EQ(window.title(), "Music");
}

TEST(Window, fingerReachesNoPlaylistThatTheUserHasNotSeen) {
    Window window;
    window.click(0);
    ASSERT_EQ(window.rows().front(), "Long Run");
    const auto& table = dynamic_cast<UITableViewController&>(window.view().content().pane());
    {
        const QSignalBlocker undrawn(window.screen());
        window.music().addPlaylist("Above All");
        ASSERT_TRUE(QTest::qWaitFor(
            [&table] {
                return !table.tableView().cellForRowAtIndexPath({0, 0});
            },
            patience));
        window.click(0);
        window.press(Qt::Key_Home);
        window.press(Qt::Key_Return);
    }
    EXPECT_EQ(storedPreference("asset-sync-enabled"), "false");
    window.screen().scheduleDrawing();
    ASSERT_TRUE(window.waitForRow("Above All"));
    EXPECT_THAT(window.rows(), Contains("✓ None"));
    window.click(0);
    EXPECT_TRUE(window.waitForRow("✓ Above All: Sync Pending…"));
}

TEST(Window, phoneSizedWindowScrollsOnlyUpAndDown) {
    Window window;
    window.widget().resize(360, 300);
    QCoreApplication::processEvents();
    EXPECT_EQ(window.view().horizontalScrollBar()->maximum(), 0);
    EXPECT_GT(window.view().verticalScrollBar()->maximum(), 0);
    for (const auto& section : window.view().layout().sections()) {
        EXPECT_LE(section.footer.right(), window.view().viewport()->width());
    }
}

TEST(Window, playlistThatArrivesOnDiskIsListedInTheOpenChooser) {
    Window window;
    window.click(0);
    window.music().addPlaylist("Quiet Evening");
    EXPECT_TRUE(window.waitForRow("Quiet Evening"));
}

TEST(Window, switchOfTheNoticesFollowsOtherPrograms) {
    const syncd::testing::WatchedEngine engine;
    Window window;
    ASSERT_TRUE(QTest::qWaitFor(
        [&window] {
            window.companion().reopen({Class::of<SyncPage>().name()});
            return window.title() == "Sync";
        },
        patience));
    const auto isOn = [&window] {
        const auto& content = window.view().content();
        for (NSInteger row = 0; row < content.rowCount(); ++row) {
            const auto cell = content.cell(row);
            if (cell && cell->textLabel().text() == "Notifications") {
                return std::dynamic_pointer_cast<SwitchCell>(cell)->isOn();
            }
        }
        throw std::logic_error("There is no such switch.");
    };
    EXPECT_TRUE(isOn());

    storePreference("desktop-notices", "false");
    EXPECT_TRUE(QTest::qWaitFor([&isOn] { return !isOn(); }, patience));
    storePreference("desktop-notices", "true");
    EXPECT_TRUE(QTest::qWaitFor(isOn, patience));
}

TEST(Window, closedInTheMidstOfEverythingEndsCleanly) {
    Window window;
    window.click(0);
    window.click(1);
    window.press(Qt::Key_Escape);
    window.click(1);
}

} // namespace

} // namespace quorl::tests
