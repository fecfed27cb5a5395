#include <QAccessible>

#include <gmock/gmock.h>

#include "tests/quorl/Window.h"

namespace quorl::tests {

namespace {

QAccessibleInterface& lineNamed(RowsView& view, const QString& name) {
    auto* list = QAccessible::queryAccessibleInterface(&view);
    for (int index = 0; index < list->childCount(); ++index) {
        if (list->child(index)->text(QAccessible::Name) == name) {
            return *list->child(index);
        }
    }
    throw std::runtime_error("no line is called " + name.toStdString());
}

TEST(Accessibility, linesAreReadFromTopToBottom) {
    Window window;
    auto* list = QAccessible::queryAccessibleInterface(&window.view());
    ASSERT_EQ(list->childCount(), 6);
    EXPECT_EQ(list->role(), QAccessible::List);
    EXPECT_EQ(list->child(0)->text(QAccessible::Name), "Music Syncing");
    EXPECT_EQ(list->child(0)->role(), QAccessible::Heading);
    EXPECT_EQ(list->child(1)->text(QAccessible::Name), "Synced Playlist");
    EXPECT_EQ(list->child(1)->text(QAccessible::Value), "None");
    EXPECT_EQ(list->child(1)->role(), QAccessible::Button);
    EXPECT_TRUE(list->child(2)->text(QAccessible::Name).startsWith("This playlist syncs"));
    EXPECT_EQ(list->child(6), nullptr);
}

TEST(Accessibility, rowsOfAChooserTellWhetherTheyAreChecked) {
    Window window;
    window.click(1);
    EXPECT_TRUE(lineNamed(window.view(), "500 MB").state().checked);
    EXPECT_FALSE(lineNamed(window.view(), "1 GB").state().checked);
    EXPECT_TRUE(lineNamed(window.view(), "1 GB").state().checkable);
    EXPECT_EQ(lineNamed(window.view(), "1 GB").role(), QAccessible::ListItem);
}

TEST(Accessibility, pressActionDoesWhatAFingerDoes) {
    Window window;
    window.click(1);
    lineNamed(window.view(), "1 GB")
        .actionInterface()
        ->doAction(QAccessibleActionInterface::pressAction());
    EXPECT_TRUE(window.waitForRow("✓ 1 GB"));
}

TEST(Accessibility, lineIsWhereItIsPainted) {
    Window window;
    auto& line = lineNamed(window.view(), "Playlist Limit");
    auto* list = QAccessible::queryAccessibleInterface(&window.view());
    EXPECT_EQ(list->childAt(line.rect().center().x(), line.rect().center().y()), &line);
    EXPECT_GE(line.rect().height(), 44);
}

TEST(Accessibility, focusFollowsTheKeys) {
    Window window;
    window.widget().activateWindow();
    window.view().setFocus();
    window.press(Qt::Key_End);
    auto* list = QAccessible::queryAccessibleInterface(&window.view());
    ASSERT_TRUE(list->focusChild());
    EXPECT_EQ(list->focusChild()->text(QAccessible::Name), "Playlist Limit");
}

} // namespace

} // namespace quorl::tests
