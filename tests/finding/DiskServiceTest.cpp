// What the disk service tells of drives, and how they are ejected.

#include "services/finding/DiskService.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/sysmacros.h>

#include "tests/finding/DiskServiceDouble.h"
#include "tests/finding/Told.h"

namespace quorl::finding::test {

namespace {

using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::IsEmpty;

class DiskService : public ::testing::Test {
  protected:
    [[nodiscard]] Surroundings now() const { return survey(sources()); }

    [[nodiscard]] Sources sources() const { return {"/nonexistent", service_.connect()}; }

    DiskServiceDouble service_;
};

TEST_F(DiskService, TellsWhatADriveIsCalledAndHowItIsEjected) {
    service_.plugIn("ABCD", "Walkman", makedev(8, 17));

    EXPECT_THAT(now().drives,
                ElementsAre(Drive{.device = "8:17",
                                  .node = "/dev/ABCD",
                                  .uuid = "ABCD",
                                  .label = "Walkman",
                                  .isPluggable = true,
                                  .removal = Removal{"/org/freedesktop/UDisks2/block_devices/ABCD",
                                                     "/org/freedesktop/UDisks2/drives/ABCD",
                                                     Removal::Way::Eject}}));
}

TEST_F(DiskService, TellsWhenADriveComesAndGoes) {
    Told<Surroundings> told;
    const SurroundingsWatch watch(told.tell(), sources());
    const auto has = [](std::size_t count) {
        return [count](const Surroundings& now) { return now.drives.size() == count; };
    };
    told.waitFor(has(0));

    service_.plugIn("ABCD", "Walkman", makedev(8, 17));
    told.waitFor(has(1));

    service_.pullOut("ABCD");
    told.waitFor(has(0));
}

TEST_F(DiskService, UnmountsADriveBeforeItEjectsIt) {
    service_.plugIn("ABCD", "Walkman", makedev(8, 17));

    EXPECT_EQ(remove(*now().drives.at(0).removal, "Walkman", service_.connect()), "");

    EXPECT_THAT(service_.asked(), ElementsAre("Unmount ABCD", "Eject ABCD"));
}

TEST_F(DiskService, SaysWhatIsInTheWayOfEjecting) {
    service_.plugIn("ABCD", "Walkman", makedev(8, 17));
    const auto problemOf = [this](const std::string& error) {
        service_.failWith(error);
        return remove(*now().drives.at(0).removal, "Walkman", service_.connect());
    };

    EXPECT_THAT(problemOf("DeviceBusy"), HasSubstr("“Walkman” is still in use."));
    EXPECT_THAT(problemOf("NotAuthorizedDismissed"), HasSubstr("not allowed"));
    EXPECT_THAT(problemOf("Failed"), HasSubstr("It says Failed."));
    EXPECT_THAT(service_.asked(), IsEmpty());
}

TEST(WithoutDiskService, AllWorksWithoutIt) {
    const Sources sources{"/nonexistent", []() -> std::unique_ptr<sdbus::IConnection> {
                              throw sdbus::Error("org.freedesktop.DBus.Error.NoServer", "none");
                          }};
    Told<Surroundings> told;

    EXPECT_EQ(survey(sources), Surroundings());
    const SurroundingsWatch watch(told.tell(), sources);
    told.waitFor([](const Surroundings& now) { return now == Surroundings(); });
}

} // namespace

} // namespace quorl::finding::test
