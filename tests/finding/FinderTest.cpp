// Wearables are found while they are mounted and unmounted. Runs in namespaces of its own, which
// CMakeLists.txt sees to.

#include "services/finding/Finder.h"

#include <algorithm>
#include <cerrno>
#include <system_error>

#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/mount.h>
#include <sys/stat.h>

#include "services/wearable/Generations.h"
#include "tests/base/TemporaryDirectory.h"
#include "tests/finding/DiskServiceDouble.h"
#include "tests/finding/Told.h"

namespace quorl::finding::test {

namespace {

using tests::TemporaryDirectory;

void mountAt(const std::filesystem::path& place) {
    if (mount("none", place.c_str(), "tmpfs", 0, "size=1m") != 0) {
        throw std::system_error(errno, std::generic_category(), "mount");
    }
}

std::uint64_t deviceAt(const std::filesystem::path& place) {
    struct stat status {};

    if (stat(place.c_str(), &status) != 0) {
        throw std::system_error(errno, std::generic_category(), "stat");
    }
    return status.st_dev;
}

/// Condition: something is offered in this directory, and is as `isIt` has it.
template <class IsIt>
auto offers(std::filesystem::path directory, IsIt isIt) {
    return [directory = std::move(directory), isIt](const Found& found) {
        return std::ranges::any_of(found.offers, [&](const Offer& offer) {
            return offer.directory == directory && isIt(offer);
        });
    };
}

class FinderTest : public ::testing::Test {
  protected:
    ~FinderTest() override {
        for (const auto& place : {folder_ / "a", folder_ / "b"}) {
            umount2(place.c_str(), MNT_DETACH);
        }
    }

    DiskServiceDouble service_;
    TemporaryDirectory folder_;
    Told<Found> told_;
};

TEST_F(FinderTest, ADriveIsOfferedFromWhenItIsMountedUntilItIsUnmounted) {
    folder_.makeDirectory("a");
    const Finder finder(told_.tell(), {}, {"/", service_.connect()});
    told_.waitFor([](const Found& found) { return found.offers.back().isEmbedded(); });

    mountAt(folder_ / "a");
    service_.plugIn("ABCD", "Walkman", deviceAt(folder_ / "a"));
    const auto found = told_.waitFor(
        offers(folder_ / "a", [](const Offer& offer) { return offer.name == "Walkman"; }));
    const auto drive = std::ranges::find(found.offers, folder_ / "a", &Offer::directory);
    EXPECT_EQ(drive->space->capacity, 1U << 20U);
    EXPECT_EQ(drive->identity, (Identity{"ABCD", folder_ / "a"}));

    umount((folder_ / "a").c_str());
    told_.waitFor([this](const Found& now) {
        return !offers(folder_ / "a", [](const Offer&) { return true; })(now);
    });
}

TEST_F(FinderTest, AMountIsOfferedWithoutAnyServiceWhereItHasMusicOfOurs) {
    folder_.makeDirectory("a");
    folder_.makeDirectory("b");
    mountAt(folder_ / "a");
    folder_.write("a/.quorl/manifest.1", wearable::generationText(1, {}));
    const Finder finder(told_.tell(), {}, {"/", connectToSystem});

    told_.waitFor(offers(folder_ / "a", [](const Offer& offer) { return offer.hasManifest; }));

    const auto from = folder_ / "a";
    const auto to = folder_ / "b";
    ASSERT_EQ(mount(from.c_str(), to.c_str(), nullptr, MS_MOVE, nullptr), 0);
    told_.waitFor(offers(to, [](const Offer& offer) { return offer.hasManifest; }));
}

TEST_F(FinderTest, ADirectoryOfTheHomeIsOfferedWhereItHasMusicOfOurs) {
    folder_.write("Velora/.quorl/manifest.2", wearable::generationText(2, {}));

    const auto found = findNow(folder_.path(), {"/", connectToSystem});

    EXPECT_TRUE(offers(folder_ / "Velora", [](const Offer& offer) {
        return offer.hasManifest && !offer.identity && !offer.removal;
    })(found));
}

} // namespace

} // namespace quorl::finding::test
