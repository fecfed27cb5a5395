#include "runtime/host/Host.h"

#include <chrono>
#include <cstdlib>

#include <gmock/gmock.h>

#include "tests/support/TestHost.h"

namespace {

using quorl::Host;
using quorl::tests::TestHost;
using std::chrono::system_clock;
using testing::ElementsAre;

double now() {
    return std::chrono::duration<double>(system_clock::now().time_since_epoch()).count();
}

TEST(Hosts, FollowTheLanguagesOfTheEnvironmentUnlessTheySayOthers) {
    const auto host = TestHost::installed();
    setenv("LANGUAGE", "de_AT:fr", 1);

    EXPECT_THAT(host->Host::languages(), ElementsAre("de_AT", "fr"));
}

TEST(Hosts, HaveTheTimeOfTheSystemUnlessTheySayAnother) {
    const auto host = TestHost::installed();

    const double before = now();
    const double told = host->Host::secondsSince1970();

    EXPECT_GE(told, before);
    EXPECT_LE(told, now());
}

TEST(HostsDeathTest, AreMissedByAPaneWithASentence) {
    Host::install(nullptr);

    // An emulator has something to say of the end as well.
    EXPECT_DEATH((void)Host::required(),
                 "^quorl: a pane was used before a host was installed\n($|qemu: )");
}

} // namespace
