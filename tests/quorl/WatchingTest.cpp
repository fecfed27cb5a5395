// When the app says to the engine that a person sees it.

#include <QCoreApplication>

#include <gmock/gmock.h>
#include <unistd.h>

#include "tests/engine/client/WatchedEngine.h"
#include "tests/quorl/QuorlProcess.h"
#include "tests/quorl/window/Window.h"

namespace quorl::tests {

namespace {

using syncd::testing::WatchedEngine;

void activate(QWidget& window) {
    window.show();
    window.activateWindow();
    QCoreApplication::processEvents();
}

TEST(Watching, lastsWhileTheWindowIsTheActiveOne) {
    WatchedEngine engine;
    Window window;
    activate(window.widget());
    EXPECT_EQ(engine.nextCall(), "Watch");

    QWidget other;
    activate(other);
    EXPECT_EQ(engine.nextCall(), "Unwatch");

    activate(window.widget());
    EXPECT_EQ(engine.nextCall(), "Watch");
    window.widget().hide();
    EXPECT_EQ(engine.nextCall(), "Unwatch");
}

TEST(Watching, isNothingThatAProgramDoesThatReadsThePanes) {
    WatchedEngine engine;
    {
        QuorlProcess quorl({"--text"});
        quorl.readUntil("Music");
        EXPECT_EQ(quorl.end(), 0);
    }
    Window window;
    activate(window.widget());
    EXPECT_EQ(engine.nextCall(), "Watch");
    EXPECT_EQ(engine.caller(), getpid());
}

} // namespace

} // namespace quorl::tests
