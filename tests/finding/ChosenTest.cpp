// Which wearable was chosen, and where it is now.

#include "services/finding/Chosen.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "services/engine/Message.h"
#include "services/wearable/Unseen.h"
#include "tests/finding/Surroundings.h"

namespace quorl::finding::test {

namespace {

using ::testing::HasSubstr;

const Drive mine = stick("8:17", "1234-ABCD", "MINE");
const Drive other = stick("8:33", "99FF-0000", "OTHER");
const base::Mount systemMount = mountOf("254:0", "/", "ext4");

/// The wearable in a directory of my stick.
const Chosen chosen{"/media/me/MINE/Velora", Identity{"1234-ABCD", "/media/me/MINE"}};

TEST(Chosen, OnADriveIsRememberedByTheDriveAndElsewhereByItsPath) {
    const Surroundings now{{systemMount, mountOf("8:17", "/media/me/MINE")}, {mine}};

    EXPECT_EQ(chosenAt("/media/me/MINE/Velora", now), chosen);
    EXPECT_EQ(chosenAt("/home/me/Velora", now), (Chosen{"/home/me/Velora", {}}));
    EXPECT_EQ(chosenAt("", now), Chosen());
}

TEST(Chosen, OnADriveThatIsAlwaysThereIsRememberedByItsPath) {
    auto builtIn = mine;
    builtIn.isPluggable = false;

    EXPECT_EQ(chosenAt("/data/Velora", {{mountOf("8:17", "/data")}, {builtIn}}),
              (Chosen{"/data/Velora", {}}));
}

TEST(Chosen, IsReadBackFromTheSettings) {
    EXPECT_EQ(toText(chosen.identity), "1234-ABCD:/media/me/MINE");
    EXPECT_EQ(chosenIn("/media/me/MINE/Velora/", toText(chosen.identity)), chosen);
    EXPECT_EQ(toText({}), "");
}

TEST(Chosen, TakesATextThatIsNoIdentityForNone) {
    for (const auto* text : {"", "1234-ABCD", ":/media", "1234-ABCD:media"}) {
        EXPECT_FALSE(parseIdentity(text)) << text;
    }
}

TEST(Chosen, GoesByThePathWhereSomebodyHasWrittenAnotherOne) {
    EXPECT_FALSE(chosenIn("/media/me/OTHER", toText(chosen.identity)).identity);
    EXPECT_FALSE(chosenIn("/media/me/MINE2", toText(chosen.identity)).identity);
    EXPECT_FALSE(chosenIn("", toText(chosen.identity)).identity);
}

TEST(Whereabouts, FollowTheDriveToAnotherPath) {
    const Surroundings now{{systemMount, mountOf("8:49", "/run/media/me/MINE1")},
                           {stick("8:49", "1234-ABCD")}};

    EXPECT_EQ(whereaboutsOf(chosen, now), Whereabouts{"/run/media/me/MINE1/Velora"});
    EXPECT_EQ(whereaboutsOf(chosenIn("/media/me/MINE", toText(chosen.identity)), now),
              Whereabouts{"/run/media/me/MINE1"});
}

TEST(Whereabouts, StayWhereTheDriveIsMountedTwice) {
    const Surroundings now{{mountOf("8:17", "/elsewhere"), mountOf("8:17", "/media/me/MINE")},
                           {mine}};

    EXPECT_EQ(whereaboutsOf(chosen, now), Whereabouts{chosen.directory});
}

TEST(Whereabouts, PreferTheWholeDriveToAPartOfIt) {
    auto part = mountOf("8:17", "/part");
    part.root = "/Velora";

    EXPECT_EQ(whereaboutsOf(chosen, {{part, mountOf("8:17", "/whole")}, {mine}}).directory,
              "/whole/Velora");
}

TEST(Whereabouts, DoNotTakeAnotherDriveForTheOneThatWasChosen) {
    const auto found =
        whereaboutsOf(chosen, {{systemMount, mountOf("8:33", "/media/me/MINE")}, {other}});

    EXPECT_EQ(found.directory, chosen.directory);
    EXPECT_THAT(engine::sentence(found.problem), HasSubstr("not connected"));
    EXPECT_THAT(engine::sentence(found.problem), HasSubstr("“OTHER”"));
}

TEST(Whereabouts, DoNotTakeWhatIsNoDeviceForTheDriveThatWasChosen) {
    const auto found =
        whereaboutsOf(chosen, {{systemMount, mountOf("0:44", "/media/me/MINE", "tmpfs")}, {}});

    EXPECT_THAT(engine::sentence(found.problem), HasSubstr("Another drive is at /media/me/MINE"));
}

TEST(Whereabouts, SayThatTheDriveIsNotPluggedIn) {
    EXPECT_EQ(whereaboutsOf(chosen, {{systemMount}, {}}).problem.code,
              wearable::unseen::notPluggedIn);
    EXPECT_EQ(whereaboutsOf(chosen, {}).problem.code, wearable::unseen::notPluggedIn);
}

TEST(Whereabouts, TrustThePathWhereNobodyKnowsWhichDriveIsThere) {
    EXPECT_EQ(whereaboutsOf(chosen, {{systemMount, mountOf("8:33", "/media/me/MINE")}, {}}),
              Whereabouts{chosen.directory});
}

TEST(Whereabouts, OfAPathThatAloneCountsAreThatPath) {
    EXPECT_EQ(whereaboutsOf({"/media/me/MINE", {}},
                            {{systemMount, mountOf("8:33", "/media/me/MINE")}, {other}}),
              Whereabouts{"/media/me/MINE"});
}

} // namespace

} // namespace quorl::finding::test
