#include <QImage>
#include <QTest>
#include <fstream>

#include <gmock/gmock.h>

#include "tests/quorl/SampleMusic.h"
#include "tests/quorl/desktop/DisplayServer.h"
#include "tests/quorl/desktop/OtherConnection.h"

namespace quorl::tests {

namespace {

using testing::ContainsRegex;
using testing::HasSubstr;
using testing::Not;

constexpr int patience = 60'000; // milliseconds
const QString appName = QStringLiteral("org.quorl.Velora");

std::string nameOf(const testing::TestParamInfo<DisplayServer::Kind>& tried) {
    return tried.param == DisplayServer::Kind::X11 ? "X11" : "Wayland";
}

class Display : public testing::TestWithParam<DisplayServer::Kind> {
  protected:
    SampleMusic music_;
    DisplayServer display_ = DisplayServer(GetParam());
};

TEST_P(Display, windowOpensAndPaintsAndEnds) {
    const auto file = (music_.folder() / "shot.png").string();
    QuorlProcess quorl({"--screenshot", file}, display_.environment());
    EXPECT_EQ(quorl.end(), 0) << quorl.errors();
    EXPECT_EQ(QImage(QString::fromStdString(file)).size(), QSize(360, 720));
}

TEST_P(Display, thatGoesEndsTheWindowWithASentence) {
    QuorlProcess quorl({}, display_.environment());
    waitForWindow(appName);
    display_.end();
    EXPECT_EQ(quorl.end(), 1);
    EXPECT_THAT(quorl.errors(), HasSubstr("quorl: The display has gone. Start"));
}

INSTANTIATE_TEST_SUITE_P(Window, Display,
                         testing::Values(DisplayServer::Kind::X11, DisplayServer::Kind::Wayland),
                         nameOf);

TEST(Display, ofWaylandGetsWhatTheWindowHasPainted) {
    const SampleMusic music;
    const DisplayServer display(DisplayServer::Kind::Wayland);
    auto environment = display.environment();
    environment["WAYLAND_DEBUG"] = "client";
    QuorlProcess quorl({}, environment);
    quorl.readErrorsUntil("set_app_id(\"org.quorl.Velora\")");
    quorl.readErrorsUntil("attach(wl_buffer@");
    quorl.readErrorsUntil(".commit()");
    quorl.kill();
}

TEST(Display, thatIsNotThereIsToldWithoutACrash) {
    for (const Environment& environment :
         {Environment{{"DISPLAY", ":987"}, {"WAYLAND_DISPLAY", ""}},
          Environment{{"DISPLAY", ""}, {"WAYLAND_DISPLAY", "nowhere"}},
          Environment{{"QT_QPA_PLATFORM", "unknown"}}}) {
        QuorlProcess quorl({}, environment);
        EXPECT_EQ(quorl.end(), 1);
        EXPECT_THAT(quorl.errors(), HasSubstr("on a display that works, or with --text."));
    }
}

/// What the window of this name says of itself to others on an X11 display.
std::string propertyOf(const DisplayServer& display, const char* property) {
    auto environment = QProcessEnvironment::systemEnvironment();
    environment.insert(QStringLiteral("DISPLAY"),
                       QString::fromStdString(display.environment().at("DISPLAY")));
    QProcess xprop;
    xprop.setProcessEnvironment(environment);
    xprop.start(QStringLiteral("xprop"), {QStringLiteral("-name"), QStringLiteral("Velora"),
                                          QStringLiteral("-notype"), QLatin1String(property)});
    EXPECT_TRUE(xprop.waitForFinished(patience));
    return xprop.readAllStandardOutput().toStdString() + xprop.readAllStandardError().toStdString();
}

TEST(DesktopEntry, namesTheClassOfTheWindowWhichHasAnIcon) {
    const SampleMusic music;
    const DisplayServer display(DisplayServer::Kind::X11);
    QuorlProcess quorl({}, display.environment());
    waitForWindow(appName);
    std::ifstream entry(SOURCE_DIRECTORY "/resources/desktop/org.quorl.Velora.desktop");
    std::string line;
    while (std::getline(entry, line) && !line.starts_with("StartupWMClass=")) {
    }
    EXPECT_THAT(propertyOf(display, "WM_CLASS"),
                HasSubstr("\"" + line.substr(line.find('=') + 1) + "\"\n"));
    EXPECT_THAT(propertyOf(display, "_NET_WM_ICON"), Not(ContainsRegex("not found|no such")));
    quorl.kill();
}

} // namespace

} // namespace quorl::tests
