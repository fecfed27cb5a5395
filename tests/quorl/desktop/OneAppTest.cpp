#include "quorl/window/desktop/OneApp.h"

#include <QTest>

#include <gmock/gmock.h>

#include "tests/quorl/QuorlProcess.h"
#include "tests/quorl/StoredPreferences.h"
#include "tests/quorl/desktop/OtherConnection.h"
#include "tests/quorl/window/Window.h"

namespace quorl::tests {

namespace {

using testing::HasSubstr;

constexpr int patience = 60'000; // milliseconds
const QString usedName = QStringLiteral("org.quorl.Velora");
const QString trialName = QStringLiteral("org.quorl.Velora.Trial");

Environment windowed() { return {{"QT_QPA_PLATFORM", "offscreen"}}; }

TEST(OneApp, secondStartHandsItsTokenToTheFirstAndEnds) {
    OneApp first(QDBusConnection::sessionBus(), base::Purpose::Use);
    ASSERT_EQ(first.handOver({}), std::nullopt);
    std::vector<Start> taken;
    first.setTake([&taken](const Start& start) {
        taken.push_back(start);
        return QString();
    });

    auto environment = windowed();
    environment["XDG_ACTIVATION_TOKEN"] = "wayland-7";
    QuorlProcess second({"--plugins", "/tmp"}, environment);

    ASSERT_TRUE(QTest::qWaitFor([&taken] { return !taken.empty(); }, patience));
    EXPECT_EQ(second.end(), 0);
    EXPECT_EQ(taken.front().token, "wayland-7");
    EXPECT_EQ(taken.front().places.plugins, "/tmp");
}

TEST(OneApp, startupNotificationOfX11IsHandedOverToo) {
    OneApp first(QDBusConnection::sessionBus(), base::Purpose::Use);
    ASSERT_EQ(first.handOver({}), std::nullopt);
    QByteArray token;
    first.setTake([&token](const Start& start) {
        token = start.token;
        return QString();
    });
    auto environment = windowed();
    environment["DESKTOP_STARTUP_ID"] = "launcher_TIME42";
    QuorlProcess second({}, environment);
    ASSERT_TRUE(QTest::qWaitFor([&token] { return !token.isEmpty(); }, patience));
    EXPECT_EQ(second.end(), 0);
    EXPECT_EQ(token, "launcher_TIME42");
}

TEST(OneApp, desktopActivatesItByTheUsualCalls) {
    OneApp app(QDBusConnection::sessionBus(), base::Purpose::Use);
    ASSERT_EQ(app.handOver({}), std::nullopt);
    QList<QByteArray> tokens;
    app.setTake([&tokens](const Start& start) {
        EXPECT_EQ(start.places.purpose(), base::Purpose::Use);
        tokens << start.token;
        return QString();
    });
    const QVariantMap platform{{QStringLiteral("desktop-startup-id"), QStringLiteral("a")}};

    const OtherConnection desktop("desktop");
    const auto activate = desktop.callApplication(usedName, "Activate", {platform});
    const auto open = desktop.callApplication(
        usedName, "Open", {QStringList{QStringLiteral("file:///tmp")}, platform});
    const auto wrong = desktop.callApplication(usedName, "Activate", {QStringLiteral("no map")});
    const auto unknown = desktop.callApplication(
        usedName, "ActivateAction", {QStringLiteral("unknown"), QVariantList(), platform});

    EXPECT_EQ(activate.type(), QDBusMessage::ReplyMessage);
    EXPECT_EQ(open.type(), QDBusMessage::ReplyMessage);
    EXPECT_EQ(wrong.type(), QDBusMessage::ErrorMessage);
    EXPECT_EQ(unknown.type(), QDBusMessage::ErrorMessage);
    EXPECT_EQ(tokens, (QList<QByteArray>{"a", "a"}));
}

TEST(OneApp, reasonOfTheFirstForNotTakingAStartIsToldByTheSecond) {
    QuorlProcess first({}, windowed());
    waitForWindow(usedName);
    QuorlProcess second({"--plugins", "/tmp"}, windowed());
    EXPECT_EQ(second.end(), 1);
    EXPECT_THAT(second.errors(), HasSubstr("running already, with other plug-ins. Close"));
    first.kill();
}

TEST(OneApp, firstThatHangsIsTold) {
    const OtherConnection other("other");
    OneApp first(other.bus(), base::Purpose::Use);
    ASSERT_EQ(first.handOver({}), std::nullopt);
    OneApp second(QDBusConnection::sessionBus(), base::Purpose::Use, std::chrono::milliseconds(50));
    const auto problem = second.handOver({}); // keeps this thread, on which the first would answer
    ASSERT_TRUE(problem);
    EXPECT_THAT(problem->toStdString(), HasSubstr("does not answer. End it, then"));
}

TEST(OneApp, startWithoutABusIsTheFirst) {
    OneApp app(QDBusConnection(QStringLiteral("none")), base::Purpose::Use);
    EXPECT_EQ(app.handOver({}), std::nullopt);
}

TEST(OneApp, nextStartIsTheFirstWhenTheFirstHasEnded) {
    {
        OneApp first(QDBusConnection::sessionBus(), base::Purpose::Use);
        ASSERT_EQ(first.handOver({}), std::nullopt);
    }
    const OtherConnection other("other");
    OneApp second(other.bus(), base::Purpose::Use);
    EXPECT_EQ(second.handOver({}), std::nullopt);
}

TEST(OneApp, trialIsAnotherOneAndGoesOnWithTheFolderOfItsSecondStart) {
    const SampleMusic chosen;
    const SampleMusic other;
    OneApp used(QDBusConnection::sessionBus(), base::Purpose::Use);
    ASSERT_EQ(used.handOver({}), std::nullopt);
    QuorlProcess trial({"--music", chosen.path()}, windowed());
    waitForWindow(trialName);

    QuorlProcess second({"--music", other.path()}, windowed());

    EXPECT_EQ(second.end(), 0) << second.errors();
    EXPECT_EQ(storedPreference("music-folder", base::Purpose::Trial), "'" + other.path() + "'");
    trial.kill();
    waitForOwner(trialName, false);
}

TEST(OneApp, minimisedWindowComesForward) {
    Window window;
    window.widget().showMinimized();
    window.widget().comeForward("token");
    EXPECT_FALSE(window.widget().isMinimized());
    EXPECT_TRUE(window.widget().isVisible());
}

} // namespace

} // namespace quorl::tests
