#include <QApplication>
#include <QLineEdit>
#include <QTest>
#include <QTimer>

#include <gmock/gmock.h>

#include "tests/quorl/window/Window.h"

namespace quorl::tests {

namespace {

struct Keys {
    const char* name;
    Qt::Key key;
    Qt::KeyboardModifiers modifiers;
};

void PrintTo(const Keys& keys, std::ostream* output) { *output << keys.name; }

std::string nameOf(const testing::TestParamInfo<Keys>& tried) { return tried.param.name; }

class BackKeys : public testing::TestWithParam<Keys> {};

TEST_P(BackKeys, leaveThePane) {
    Window window;
    window.click(1);
    ASSERT_EQ(window.title(), "Playlist Limit");
    window.pressWithFocus(GetParam().key, GetParam().modifiers);
    EXPECT_EQ(window.title(), "Music");
}

INSTANTIATE_TEST_SUITE_P(Keys, BackKeys,
                         testing::Values(Keys{"Backspace", Qt::Key_Backspace, Qt::NoModifier},
                                         Keys{"AltLeft", Qt::Key_Left, Qt::AltModifier},
                                         Keys{"Escape", Qt::Key_Escape, Qt::NoModifier},
                                         Keys{"Back", Qt::Key_Back, Qt::NoModifier}),
                         nameOf);

class ClosingKeys : public testing::TestWithParam<Keys> {};

TEST_P(ClosingKeys, closeTheWindowAndEndTheApp) {
    Window window;
    QTimer::singleShot(0,
                       [&window] { window.pressWithFocus(GetParam().key, GetParam().modifiers); });
    EXPECT_EQ(QApplication::exec(), 0); // until the last window is closed
    EXPECT_FALSE(window.widget().isVisible());
}

INSTANTIATE_TEST_SUITE_P(Keys, ClosingKeys,
                         testing::Values(Keys{"ControlQ", Qt::Key_Q, Qt::ControlModifier},
                                         Keys{"ControlW", Qt::Key_W, Qt::ControlModifier}),
                         nameOf);

TEST(Keys, backspaceInTheSearchFieldDeletes) {
    Window window;
    window.widget().resize(360, 200);
    window.click(0);
    ASSERT_EQ(window.title(), "Synced Playlist");
    window.view().openSearch();
    auto* field = window.view().findChild<QLineEdit*>();
    ASSERT_TRUE(field->hasFocus());
    QTest::keyClicks(field, QStringLiteral("Ro"));
    window.pressWithFocus(Qt::Key_Backspace);
    EXPECT_EQ(field->text(), "R");
    window.pressWithFocus(Qt::Key_Backspace);
    window.pressWithFocus(Qt::Key_Backspace);
    EXPECT_EQ(field->text(), "");
    EXPECT_EQ(window.title(), "Synced Playlist");
}

TEST(Keys, backButtonOfTheMouseLeavesThePaneFromAnywhereInTheWindow) {
    Window window;
    window.click(1);
    ASSERT_EQ(window.title(), "Playlist Limit");
    QTest::mouseClick(window.view().viewport(), Qt::BackButton);
    QCoreApplication::processEvents();
    EXPECT_EQ(window.title(), "Music");
    QTest::mouseClick(window.widget().findChild<HeaderBar*>(), Qt::BackButton);
    QCoreApplication::processEvents();
    EXPECT_EQ(window.title(), "Velora");
}

} // namespace

} // namespace quorl::tests
