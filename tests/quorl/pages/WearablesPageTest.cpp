// The page on which a wearable is chosen.

#include "quorl/pages/WearablesPage.h"

#include <gmock/gmock.h>

#include "quorl/content/PaneContent.h"
#include "quorl/terminal/PaneText.h"
#include "runtime/lists/NavigationController.h"
#include "tests/quorl/pages/MadeUpServices.h"
#include "tests/quorl/window/Window.h"

namespace quorl::tests {

namespace {

using testing::AllOf;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::Not;

class Wearables : public testing::Test {
  protected:
    Wearables() {
        services_.shelf = {
            true,
            {{.name = "Walkman",
              .directory = "/media/a",
              .space = finding::Space{std::uint64_t{2} << 30U, std::uint64_t{1} << 30U},
              .identity = finding::Identity{"ABCD", "/media/a"},
              .removal = finding::Removal()},
             {.name = "Silent", .directory = "/media/b"},
             {.name = finding::embeddedName}},
            0,
            {},
            {}};
        page_->setServices(services_);
        navigation_->setRootPane(page_);
        navigation_->appear(false);
        content_ = PaneContent::of(page_, *navigation_);
    }

    /// What the page shows, as the terminal prints it.
    std::string text() {
        page_->refresh();
        content_->draw(0, 100);
        return textOf(*content_, 80);
    }

    void tap(const std::string& title) {
        static_cast<void>(text());
        for (NSInteger row = 0; row < content_->rowCount(); ++row) {
            if (content_->cell(row)->textLabel().text() == title) {
                ASSERT_TRUE(content_->tap(row));
                return;
            }
        }
        FAIL() << "no row " << title;
    }

    Window window_;
    MadeUpServices services_;
    std::shared_ptr<NavigationController> navigation_ = ::create<NavigationController>();
    std::shared_ptr<WearablesPage> page_ = ::create<WearablesPage>();
    std::unique_ptr<PaneContent> content_;
};

TEST_F(Wearables, areListedWithTheChosenOneChecked) {
    EXPECT_THAT(text(), AllOf(HasSubstr("✓ Walkman: 1 GB of 2 GB free\n"),
                              HasSubstr("  Silent: Does not answer\n"),
                              HasSubstr("  On this device (for trying out)\n")));
    EXPECT_THAT(text(), Not(HasSubstr("✓ Silent")));
}

TEST_F(Wearables, areLookedForAsLongAsThePageIsShown) {
    EXPECT_TRUE(services_.isFinding);
    services_.shelf = {};
    EXPECT_THAT(text(), HasSubstr("Looking for wearables…"));

    navigation_->disappear(false);
    EXPECT_FALSE(services_.isFinding);
}

TEST_F(Wearables, areChosenByATap) {
    tap("Silent");
    tap("On this device (for trying out)");
    tap("Other Directory…");

    EXPECT_THAT(services_.asked, ElementsAre("choose /media/b", "choose ", "choose another"));
}

TEST_F(Wearables, thatAreChosenButAwayAreShownAsThat) {
    services_.shelf.chosen = {};
    services_.shelf.missing = "away";
    services_.state.wearable.isConnected = false;

    EXPECT_THAT(text(), HasSubstr("✓ away: Not connected\n"));
    tap("away");
    EXPECT_THAT(services_.asked, IsEmpty());
}

TEST_F(Wearables, areEjectedUnlessASyncIsUnderWay) {
    tap("Eject “Walkman”");
    EXPECT_THAT(services_.asked, ElementsAre("eject /media/a"));
    EXPECT_THAT(text(), Not(HasSubstr("Eject “Silent”"))) << "nobody can eject it";

    services_.state.sessions.emplace_back();
    EXPECT_THAT(text(), Not(HasSubstr("Eject")));
}

TEST_F(Wearables, thatWereEjectedAreSafeToRemove) {
    services_.shelf.safeToRemove = {"Walkman"};

    EXPECT_THAT(text(), HasSubstr("Walkman: Safe to remove\n"));
}

} // namespace

} // namespace quorl::tests
