#include <QApplication>
#include <QTest>
#include <QToolButton>

#include <gmock/gmock.h>

#include "quorl/window/frame/FrameEdge.h"
#include "quorl/window/frame/WindowFrame.h"
#include "tests/quorl/window/Window.h"

namespace quorl::tests {

namespace {

using testing::ElementsAre;
using enum WindowButton;

class Frame : public testing::Test {
  protected:
    Frame() {
        window_.widget().hide();
        window_.widget().takeFrame();
        setButtons("menu:minimize,maximize,close");
        window_.widget().resize(360, 640);
        window_.widget().show();
        QCoreApplication::processEvents();
    }

    ~Frame() override { QApplication::setLayoutDirection(Qt::LeftToRight); }

    void setButtons(const char* layout) {
        Look look = window_.screen().look();
        look.windowButtons = QString::fromLatin1(layout);
        window_.screen().setLook(look);
        QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
    }

    [[nodiscard]] HeaderBar& header() { return *window_.widget().findChild<HeaderBar*>(); }

    [[nodiscard]] FrameEdge& edge() { return *window_.widget().findChild<FrameEdge*>(); }

    /// What the buttons of the header are called, as they stand from left to right.
    [[nodiscard]] std::vector<QString> buttons() {
        std::map<int, QString> names;
        for (const auto* button : header().findChildren<QToolButton*>()) {
            if (!button->isHidden()) {
                names.emplace(button->x(), button->accessibleName());
            }
        }
        std::vector<QString> sorted;
        for (const auto& [x, name] : names) {
            sorted.push_back(name);
        }
        return sorted;
    }

    void click(const QString& name) {
        for (auto* button : header().findChildren<QToolButton*>()) {
            if (button->accessibleName() == name) {
                return QTest::mouseClick(button, Qt::LeftButton);
            }
        }
        FAIL() << "There is no " << name.toStdString();
    }

    Window window_;
};

TEST(FrameOfApps, isThereWhereTheDesktopLeavesItToThem) {
    for (const auto* desktops : {"GNOME", "ubuntu:GNOME", "Phosh:GNOME", "Pantheon"}) {
        EXPECT_TRUE(isFrameLeftToApps("wayland", desktops)) << desktops;
        EXPECT_TRUE(isFrameLeftToApps("xcb", desktops)) << desktops;
        EXPECT_FALSE(isFrameLeftToApps("offscreen", desktops)) << desktops;
    }
    for (const auto* desktops : {"KDE", "XFCE", "sway", "GNOME-Classic-like", ""}) {
        EXPECT_FALSE(isFrameLeftToApps("wayland", desktops)) << desktops;
    }
}

TEST(ButtonsOfWindows, areReadAsDesktopsWriteThem) {
    EXPECT_EQ(windowButtonsIn(u"appmenu:minimize,maximize,close"),
              (WindowButtons{{}, {Minimize, Maximize, Close}}));
    EXPECT_EQ(windowButtonsIn(u"close,minimize:icon"), (WindowButtons{{Close, Minimize}, {}}));
    EXPECT_EQ(windowButtonsIn(u"close"), (WindowButtons{{Close}, {}}));
    EXPECT_EQ(windowButtonsIn(u"appmenu:"), WindowButtons());
    EXPECT_EQ(windowButtonsIn(u""), WindowButtons());
    EXPECT_EQ(windowButtonsIn(u"a:b:close,,"), (WindowButtons{{}, {}}));
}

TEST_F(Frame, isNotThatOfTheSystem) {
    EXPECT_TRUE(window_.widget().windowFlags().testFlag(Qt::FramelessWindowHint));
}

TEST_F(Frame, hasTheButtonsThatTheDesktopWants) {
    EXPECT_THAT(buttons(),
                ElementsAre("Back to Velora", "Minimize", "Maximize or Restore", "Close"));
    setButtons("close:minimize");
    EXPECT_THAT(buttons(), ElementsAre("Close", "Back to Velora", "Minimize"));
    setButtons("appmenu:");
    EXPECT_THAT(buttons(), ElementsAre("Back to Velora"));
}

TEST_F(Frame, isMirroredForLanguagesThatAreReadFromTheRight) {
    QApplication::setLayoutDirection(Qt::RightToLeft);
    QCoreApplication::processEvents();
    EXPECT_THAT(buttons(),
                ElementsAre("Close", "Maximize or Restore", "Minimize", "Back to Velora"));
}

TEST_F(Frame, buttonsStandBesideTheTitle) {
    for (const auto* layout : {"menu:minimize,maximize,close", "close,maximize,minimize:"}) {
        setButtons(layout);
        const auto* title = header().findChild<QLabel*>();
        for (const auto* button : header().findChildren<QToolButton*>()) {
            EXPECT_TRUE(button->isHidden() || !button->geometry().intersects(title->geometry()))
                << layout << button->accessibleName().toStdString();
        }
        EXPECT_EQ(title->text(), "Music") << "is whole in the width of a phone";
    }
}

TEST_F(Frame, buttonsDoWhatTheySay) {
    auto& window = window_.widget();
    click("Maximize or Restore");
    EXPECT_TRUE(window.isMaximized());
    click("Maximize or Restore");
    EXPECT_FALSE(window.isMaximized());
    click("Minimize");
    EXPECT_TRUE(window.isMinimized());
    window.showNormal();
    click("Close");
    EXPECT_TRUE(window.isHidden());
}

TEST_F(Frame, doubleClickOnTheHeaderGivesTheWindowAllTheScreen) {
    QTest::mouseDClick(&header(), Qt::LeftButton);
    EXPECT_TRUE(window_.widget().isMaximized());
    EXPECT_TRUE(edge().isHidden());
    QTest::mouseDClick(&header(), Qt::LeftButton);
    EXPECT_FALSE(window_.widget().isMaximized());
    EXPECT_FALSE(edge().isHidden());
}

TEST_F(Frame, headerIsDraggedOnceThePointerHasMovedSomeWay) {
    int drags = 0;
    QObject::connect(&header(), &HeaderBar::dragged, [&drags] { ++drags; });
    const QPoint place(header().width() / 2, 10);
    QTest::mousePress(&header(), Qt::LeftButton, Qt::NoModifier, place);
    QTest::mouseMove(&header(), place + QPoint(1, 0));
    EXPECT_EQ(drags, 0);
    for (const int way : {40, 80}) {
        QTest::mouseMove(&header(), place + QPoint(way, 0));
        EXPECT_EQ(drags, 1);
    }
    QTest::mouseRelease(&header(), Qt::LeftButton, Qt::NoModifier, place);
    QTest::mouseMove(&header(), place + QPoint(200, 0));
    EXPECT_EQ(drags, 1);
}

TEST_F(Frame, isTakenHoldOfAtItsEdgesAndCornersAlone) {
    const int right = window_.widget().width() - 1;
    const int bottom = window_.widget().height() - 1;
    EXPECT_EQ(edge().edgesAt({0, 100}), Qt::LeftEdge);
    EXPECT_EQ(edge().edgesAt({right, 100}), Qt::RightEdge);
    EXPECT_EQ(edge().edgesAt({100, 0}), Qt::TopEdge);
    EXPECT_EQ(edge().edgesAt({100, bottom}), Qt::BottomEdge);
    EXPECT_EQ(edge().edgesAt({10, 1}), Qt::TopEdge | Qt::LeftEdge);
    EXPECT_EQ(edge().edgesAt({right, 10}), Qt::TopEdge | Qt::RightEdge);
    EXPECT_EQ(edge().edgesAt({2, bottom - 10}), Qt::BottomEdge | Qt::LeftEdge);
    EXPECT_EQ(edge().edgesAt({right - 10, bottom}), Qt::BottomEdge | Qt::RightEdge);
    EXPECT_EQ(edge().edgesAt({10, 10}), Qt::Edges());
    EXPECT_NE(window_.widget().childAt(100, 100), &edge());
    EXPECT_EQ(window_.widget().childAt(0, 100), &edge());
}

TEST_F(Frame, edgeFollowsTheWindow) {
    window_.widget().resize(500, 700);
    QCoreApplication::processEvents();
    EXPECT_EQ(edge().geometry(), window_.widget().rect());
    EXPECT_EQ(window_.widget().childAt(499, 100), &edge());
}

} // namespace

} // namespace quorl::tests
