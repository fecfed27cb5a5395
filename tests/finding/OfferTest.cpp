// What is offered as a wearable, by which name and in which order.

#include "services/finding/Offer.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "tests/base/TemporaryDirectory.h"
#include "tests/finding/Surroundings.h"

namespace quorl::finding::test {

namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using tests::TemporaryDirectory;

using Finds = std::map<std::filesystem::path, Find>;

std::vector<std::string> namesOf(const std::vector<Offer>& offers) {
    std::vector<std::string> names;
    for (const auto& offer : offers) {
        names.push_back(offer.name);
    }
    return names;
}

std::vector<Offer> offered(const Surroundings& surroundings, const Finds& finds = {}) {
    return offersIn(surroundings, placesIn(surroundings, {}), finds);
}

TEST(Offers, AreDrivesByTheirNamesAndTheEmbeddedWearableAtTheEnd) {
    const Surroundings now{{mountOf("8:33", "/media/b"), mountOf("8:17", "/media/a")},
                           {stick("8:17", "A", "Walkman"), stick("8:33", "B")}};

    const auto offers =
        offered(now, {{"/media/a", {Space{1000, 400}, {}}}, {"/media/b", {Space{10, 4}, {}}}});

    EXPECT_THAT(namesOf(offers), ElementsAre("Walkman", "b", embeddedName));
    EXPECT_EQ(offers[0], (Offer{.name = "Walkman",
                                .directory = "/media/a",
                                .space = Space{1000, 400},
                                .hasManifest = false,
                                .identity = Identity{"A", "/media/a"},
                                .removal = Removal{"/block/A", "/drive/A", Removal::Way::Eject}}));
    EXPECT_TRUE(offers[2].isEmbedded());
}

TEST(Offers, BeginWithThoseThatHaveMusicOfOurs) {
    const Surroundings now{{mountOf("8:17", "/media/a"), mountOf("8:33", "/media/b")},
                           {stick("8:17", "A"), stick("8:33", "B")}};

    const auto offers = offered(now, {{"/media/b", {Space{10, 4}, {"/media/b"}}}});

    EXPECT_THAT(namesOf(offers), ElementsAre("b", "a", embeddedName));
    EXPECT_TRUE(offers[0].hasManifest);
    EXPECT_FALSE(offers[1].space) << "it did not answer";
}

TEST(Offers, AreDirectoriesOfADriveTooWhereTheyHaveMusicOfOurs) {
    const Surroundings now{{mountOf("8:17", "/media/a")}, {stick("8:17", "A", "Walkman")}};

    const auto offers = offered(now, {{"/media/a", {Space{10, 4}, {"/media/a/Velora"}}}});

    EXPECT_THAT(namesOf(offers), ElementsAre("Velora", "Walkman", embeddedName));
    EXPECT_EQ(offers[0].identity, (Identity{"A", "/media/a"}));
}

class OffersOfSystem : public ::testing::TestWithParam<base::Mount> {};

TEST_P(OffersOfSystem, AreNoneUnlessTheyHaveMusicOfOurs) {
    const Surroundings now{{GetParam()}, {stick("8:17", "A")}};
    const auto& directory = GetParam().directory;

    EXPECT_THAT(namesOf(offered(now, {{directory, {Space{10, 4}, {}}}})),
                ElementsAre(embeddedName));
    const auto offers = offered(now, {{directory, {Space{10, 4}, {directory}}}});
    ASSERT_EQ(offers.size(), 2U);
    EXPECT_EQ(offers[0].directory, directory);
}

INSTANTIATE_TEST_SUITE_P(Each, OffersOfSystem,
                         ::testing::Values(mountOf("8:17", "/"), mountOf("8:17", "/boot/efi"),
                                           mountOf("8:17", "/home"),
                                           mountOf("8:17", "/var/lib/music"),
                                           mountOf("254:0", "/data", "ext4"),
                                           mountOf("0:40", "/run/user/1000", "tmpfs"),
                                           mountOf("0:41", "/net/music", "nfs4"),
                                           mountOf("0:42", "/media/share", "cifs")));

TEST(Offers, AreWhatADesktopHasMountedAlsoWhereNobodyKnowsTheDrive) {
    EXPECT_THAT(namesOf(offered({{mountOf("8:17", "/run/media/me/STICK")}, {}})),
                ElementsAre("STICK", embeddedName));
}

TEST(Offers, AreEachDriveOnce) {
    auto part = mountOf("8:17", "/media/part");
    part.root = "/part";

    EXPECT_THAT(namesOf(offered({{part, mountOf("8:17", "/media/a"), mountOf("8:17", "/media/b")},
                                 {stick("8:17", "A")}})),
                ElementsAre("a", embeddedName));
}

TEST(Places, AreNeitherTheKernelsNorReadOnlyNorImagesNorHidden) {
    auto readOnly = mountOf("8:17", "/media/a");
    readOnly.isReadOnly = true;
    const Surroundings now{{mountOf("0:21", "/proc", "proc"), mountOf("0:50", "/misc", "autofs"),
                            readOnly, mountOf("0:60", "/x", "tmpfs"),
                            mountOf("8:33", "/x", "vfat")},
                           {stick("8:17", "A"), stick("8:33", "B")}};

    EXPECT_THAT(placesIn(now, {}), ElementsAre(Place{"/x", true, true}));
}

TEST(Places, HaveTheHomeDirectoryForWearablesInIt) {
    EXPECT_THAT(placesIn({}, "/home/me"), ElementsAre(Place{"/home/me", false, true}));
}

TEST(LookAt, FindsOurManifestInThePlaceAndInItsDirectories) {
    const TemporaryDirectory drive;
    drive.write(".quorl/manifest.1", "anything");
    drive.write("Velora/.quorl/manifest.json", "anything");
    drive.write("deeper/down/.quorl/manifest.1", "anything");
    drive.makeDirectory("empty/.quorl");

    const auto found = lookAt({drive.path(), true, true});

    EXPECT_THAT(found.wearables, ElementsAre(drive.path(), drive / "Velora"));
    ASSERT_TRUE(found.space);
    EXPECT_GT(found.space->capacity, 0U);
    EXPECT_THAT(lookAt({drive.path(), false, false}).wearables, ElementsAre(drive.path()));
}

TEST(LookAt, FollowsNoLinkOutOfTheDrive) {
    const TemporaryDirectory drive;
    const TemporaryDirectory elsewhere;
    elsewhere.write(".quorl/manifest.1", "anything");
    drive.link("link", elsewhere.path());
    drive.link(".quorl", elsewhere / ".quorl");

    EXPECT_THAT(lookAt({drive.path(), true, true}).wearables, IsEmpty());
}

TEST(LookAt, TellsNothingOfWhatIsNotThere) {
    EXPECT_EQ(lookAt({"/nonexistent", true, true}), Find());
}

TEST(ChosenOf, IsTheOfferThatTheChosenDriveIs) {
    const Surroundings now{{mountOf("8:17", "/media/a1")}, {stick("8:17", "A")}};
    const auto offers = offered(now);

    const auto* const found = chosenOf(offers, {"/media/a", Identity{"A", "/media/a"}}, now);
    ASSERT_NE(found, nullptr);
    EXPECT_EQ(found->directory, "/media/a1");
    EXPECT_EQ(chosenOf(offers, {"/media/a1", Identity{"B", "/media/a1"}}, now), nullptr);
    EXPECT_TRUE(chosenOf(offers, {}, now)->isEmbedded());
}

} // namespace

} // namespace quorl::finding::test
