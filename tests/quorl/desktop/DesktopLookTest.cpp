#include "quorl/window/desktop/DesktopLook.h"

#include <QApplication>
#include <QDBusConnectionInterface>
#include <QTest>
#include <optional>

#include <gmock/gmock.h>

#include "tests/quorl/desktop/Portal.h"
#include "tests/quorl/window/Window.h"

namespace quorl::tests {

namespace {

constexpr int patience = 60'000; // milliseconds

/// The window in a session with a portal, which it follows from `follow` on.
class FollowedDesktop : public testing::Test {
  protected:
    FollowedDesktop() {
        Look moving;
        moving.motion = Motion::Full;
        window_.screen().setLook(moving);
    }

    void follow() { look_.emplace(QDBusConnection::sessionBus(), window_.screen()); }

    template <class Condition>
    [[nodiscard]] static bool waitUntil(Condition condition) {
        return QTest::qWaitFor(condition, patience);
    }

    /// How bright the page is on the screen, from 0 to 255.
    int brightness() { return qGray(window_.view().viewport()->grab().toImage().pixel(2, 2)); }

    [[nodiscard]] const Look& look() { return window_.screen().look(); }

    Window window_;
    std::optional<DesktopLook> look_;
};

TEST_F(FollowedDesktop, becomesDarkAndLightAgainWhileTheWindowIsOpen) {
    Portal portal;
    follow();
    ASSERT_GT(brightness(), 200);
    portal.set(Portal::appearance, "color-scheme", 1U);
    EXPECT_TRUE(waitUntil([this] { return brightness() < 60; }));
    portal.set(Portal::appearance, "color-scheme", 2U);
    EXPECT_TRUE(waitUntil([this] { return brightness() > 200; }));
}

TEST_F(FollowedDesktop, isAskedAtTheStart) {
    Portal portal;
    portal.set(Portal::appearance, "color-scheme", 1U);
    portal.set(Portal::appearance, "accent-color", Portal::color(1, 0, 0));
    follow();
    EXPECT_TRUE(waitUntil([this] { return brightness() < 60; }));
    EXPECT_EQ(look().accent, QColor(255, 0, 0));
}

TEST_F(FollowedDesktop, isAskedWhenItComesLater) {
    follow();
    Portal portal;
    portal.set(Portal::appearance, "contrast", 1U);
    EXPECT_TRUE(waitUntil([this] { return look().contrast == Contrast::High; }));
}

TEST_F(FollowedDesktop, accentIsTheTintAndCanBeReadHoweverPaleItIs) {
    Portal portal;
    follow();
    portal.set(Portal::appearance, "accent-color", Portal::color(1, 0.9, 0.2));
    ASSERT_TRUE(waitUntil([this] { return look().accent != Look().accent; }));
    const auto colors = PaneColors::of(window_.widget().palette(), look());
    EXPECT_GE(PaneColors::contrast(colors.tint, colors.card), 4.5);
    EXPECT_NE(colors.tint, PaneColors::of(window_.widget().palette(), Look()).tint);
    portal.set(Portal::appearance, "accent-color", Portal::color(-1, -1, -1));
    EXPECT_TRUE(waitUntil([this] { return look().accent == Look().accent; }));
}

TEST_F(FollowedDesktop, motionIsReducedByEitherSetting) {
    Portal portal;
    follow();
    const auto moves = [this] { return look().motion == Motion::Full; };
    const auto rests = [this] { return look().motion == Motion::Reduced; };
    portal.set(Portal::interface, "enable-animations", false);
    EXPECT_TRUE(waitUntil(rests));
    portal.set(Portal::interface, "enable-animations", true);
    EXPECT_TRUE(waitUntil(moves));
    portal.set(Portal::appearance, "reduced-motion", 1U);
    EXPECT_TRUE(waitUntil(rests));
}

TEST_F(FollowedDesktop, windowHasTheButtonsThatItSays) {
    Portal portal;
    follow();
    portal.set(Portal::windows, "button-layout", QStringLiteral("close:"));
    EXPECT_TRUE(waitUntil([this] { return look().windowButtons == QStringLiteral("close:"); }));
    portal.set(Portal::windows, "button-layout", 7);
    EXPECT_TRUE(waitUntil([this] { return look().windowButtons == Look().windowButtons; }));
}

TEST_F(FollowedDesktop, rowsGrowWithTheFont) {
    Portal portal;
    follow();
    const auto height = [this] { return window_.view().layout().rowHeight(); };
    const auto before = height();
    portal.set(Portal::interface, "font-name", QStringLiteral("DejaVu Sans 30"));
    ASSERT_TRUE(waitUntil([&] { return height() > before; }));
    EXPECT_EQ(window_.screen().font().pointSizeF(), 30);
    const auto large = height();
    portal.set(Portal::interface, "text-scaling-factor", 1.5);
    EXPECT_TRUE(waitUntil([&] { return height() > large; }));
    portal.set(Portal::interface, "text-scaling-factor", 1.0);
    portal.set(Portal::interface, "font-name", QString());
    EXPECT_TRUE(waitUntil([&] { return height() == before; }));
}

TEST_F(FollowedDesktop, withoutAPortalIsAsTheToolkitHasIt) {
    const QImage before = window_.view().viewport()->grab().toImage();
    const Look usual = look();
    follow();
    // Answered after all that was asked before on this connection.
    auto ask = QDBusMessage::createMethodCall(
        QStringLiteral("org.freedesktop.DBus"), QStringLiteral("/org/freedesktop/DBus"),
        QStringLiteral("org.freedesktop.DBus"), QStringLiteral("GetId"));
    const auto answer = QDBusConnection::sessionBus().asyncCall(ask);
    ASSERT_TRUE(waitUntil([&answer] { return answer.isFinished(); }));
    EXPECT_EQ(look(), usual);
    EXPECT_EQ(window_.view().viewport()->grab().toImage(), before);
}

TEST_F(FollowedDesktop, thatDoesNotAnswerKeepsNothingWaiting) {
    const Portal portal(Portal::Manner::Silent);
    follow();
    window_.click(1);
    EXPECT_EQ(window_.title(), "Playlist Limit");
}

/// What nobody here can make sense of is as if it were not said.
TEST(Appearance, leavesOutWhatMakesNoSense) {
    const QFont font = QApplication::font();
    const Look usual;
    const auto takes = [&](const char* group, const char* key, const QVariant& value) {
        Appearance appearance;
        appearance.take(QString::fromLatin1(group), QString::fromLatin1(key), value);
        return appearance.look(usual) != usual || appearance.font(font) != font ||
               appearance.palette(QPalette()) != QPalette();
    };
    EXPECT_FALSE(takes(Portal::appearance, "color-scheme", 7U));
    EXPECT_FALSE(takes(Portal::appearance, "color-scheme", QStringLiteral("dark")));
    EXPECT_FALSE(takes(Portal::appearance, "accent-color", QStringLiteral("red")));
    EXPECT_FALSE(takes(Portal::appearance, "contrast", 5U));
    EXPECT_FALSE(takes(Portal::appearance, "unknown", 1U));
    EXPECT_FALSE(takes(Portal::interface, "color-scheme", 1U));
    EXPECT_FALSE(takes(Portal::interface, "enable-animations", QStringLiteral("no")));
    EXPECT_FALSE(takes(Portal::interface, "font-name", QStringLiteral("Sans")));
    EXPECT_FALSE(takes(Portal::interface, "font-name", QStringLiteral("Sans 5000")));
    EXPECT_FALSE(takes(Portal::interface, "text-scaling-factor", 0.0));
    EXPECT_FALSE(takes(Portal::interface, "text-scaling-factor", 1e9));
}

} // namespace

} // namespace quorl::tests
