// The page on which a wearable is chosen.

#include "quorl/pages/WearablesPage.h"

#include <gmock/gmock.h>

#include "tests/quorl/pages/ShownPage.h"

namespace quorl::tests {

namespace {

using testing::AllOf;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::Not;

class Wearables : public ShownPage {
  protected:
    Wearables() {
        services_.shelf = {true,
                           {halfFullStick(),
                            {.name = "Silent", .directory = "/media/b"},
                            {.name = finding::embeddedName}},
                           0,
                           {},
                           {}};
        show(::create<WearablesPage>());
    }
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

TEST_F(Wearables, ofOneNameAreNotTakenForEachOther) {
    services_.shelf.offers = {{.name = "NO NAME", .directory = "/media/a"},
                              {.name = "NO NAME", .directory = "/media/b"}};
    static_cast<void>(text());
    std::swap(services_.shelf.offers[0], services_.shelf.offers[1]);
    refresh();
    EXPECT_FALSE(content_->tap(0)) << "another drive than the one that was drawn";

    static_cast<void>(text());
    EXPECT_TRUE(content_->tap(0));
    EXPECT_THAT(services_.asked, ElementsAre("choose /media/b"));
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
