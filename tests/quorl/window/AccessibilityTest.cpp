#include <QAccessible>

#include <gmock/gmock.h>

#include "quorl/pages/FrontPage.h"
#include "quorl/pages/SyncPage.h"
#include "tests/quorl/pages/MadeUpServices.h"
#include "tests/quorl/window/ShownTable.h"
#include "tests/quorl/window/Window.h"

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

TEST(Accessibility, rowsTellWhichOfHowManyTheyAre) {
    Window window;
    window.click(0);
    EXPECT_EQ(lineNamed(window.view(), "Long Run").text(QAccessible::Description), "1 of 3");
    EXPECT_EQ(lineNamed(window.view(), "None").text(QAccessible::Description), "3 of 3");
    window.press(Qt::Key_Escape);
    EXPECT_EQ(lineNamed(window.view(), "Synced Playlist").text(QAccessible::Description),
              "None, 1 of 2");
}

TEST(Accessibility, switchOfTheFrontPageIsOneThatTellsWhetherItIsOn) {
    Window window;
    MadeUpServices services;
    const auto page = FrontPage::over(services, Class::of<SyncPage>(), "Music");
    RowsView view(PaneContent::of(page, window.companion().navigation()), window.screen(), nullptr);
    page->viewDidAppear(false);
    view.draw();
    EXPECT_EQ(lineNamed(view, "Simulated Charger").role(), QAccessible::CheckBox);
    EXPECT_TRUE(lineNamed(view, "Simulated Charger").state().checkable);
}

TEST(Accessibility, onlyWhatIsSeenIsShowing) {
    ShownTable shown(manyNames(200), "nobody");
    EXPECT_FALSE(lineNamed(shown.view(), "Name 1000").state().invisible);
    EXPECT_TRUE(lineNamed(shown.view(), "Name 1150").state().invisible);
    shown.view().setCurrentRow(150);
    EXPECT_TRUE(lineNamed(shown.view(), "Name 1000").state().invisible);
    EXPECT_FALSE(lineNamed(shown.view(), "Name 1150").state().invisible);
    shown.view().hide();
    EXPECT_TRUE(lineNamed(shown.view(), "Name 1150").state().invisible);
}

/// Of which lines of a view assistive technology has been told anything, in that order.
void noteNews(RowsView& view, QStringList& names) {
    QObject::connect(&view, &RowsView::told, &view, [&view, &names](int line) {
        auto* list = QAccessible::queryAccessibleInterface(&view);
        names << list->child(line)->text(QAccessible::Name);
    });
}

TEST(Accessibility, onlyTheRowThatChangesIsTold) {
    ShownTable shown(manyNames(8), "Name 1002");
    QStringList told;
    noteNews(shown.view(), told);
    shown.reloadWith(manyNames(8));
    EXPECT_EQ(told, QStringList());
    shown.table().status = "Synced";
    shown.reloadWith(manyNames(8));
    EXPECT_EQ(told, QStringList{"Name 1002"});
}

/// A list of one group.
class Footed final : public PSListController {
  public:
    [[nodiscard]] NSArray<PSSpecifier> specifiers() override {
        if (!_specifiers) {
            group = PSSpecifier::preferenceSpecifierNamed_target_set_get_detail_cell_edit(
                "Group", nullptr, std::nullopt, std::nullopt, std::nullopt, PSCellType::Group,
                std::nullopt);
            group->setProperty_forKey("Before", PSFooterTextGroupKey);
            _specifiers = std::make_shared<std::vector<std::shared_ptr<PSSpecifier>>>(1, group);
        }
        return _specifiers;
    }

    std::shared_ptr<PSSpecifier> group;
};

TEST(Accessibility, footerThatChangesIsTold) {
    ShownTable host({});
    const auto list = ::create<Footed>();
    const auto navigation = ::create<NavigationController>();
    list->viewDidAppear(false);
    RowsView view(PaneContent::of(list, *navigation), host.screen(), nullptr);
    view.resize(360, 720);
    view.show();
    view.draw();
    QStringList told;
    noteNews(view, told);
    list->group->setProperty_forKey("After", PSFooterTextGroupKey);
    list->reload();
    view.draw();
    EXPECT_EQ(told, QStringList{"After"});
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

TEST(Accessibility, rowWithTheFocusIsToldAfterTheListThatGotIt) {
    Window window;
    window.widget().activateWindow();
    window.view().clearFocus();
    QStringList told;
    noteNews(window.view(), told);
    window.view().setFocus();
    EXPECT_EQ(told, QStringList());
    QCoreApplication::processEvents();
    EXPECT_EQ(told, QStringList{"Synced Playlist"});
}

TEST(Accessibility, windowIsOneByItsRole) {
    Window window;
    EXPECT_EQ(QAccessible::queryAccessibleInterface(&window.widget())->role(), QAccessible::Window);
}

} // namespace

} // namespace quorl::tests
