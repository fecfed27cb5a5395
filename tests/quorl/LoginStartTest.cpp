#include "quorl/adapters/LoginStart.h"

#include <gmock/gmock.h>

#include "tests/base/TemporaryDirectory.h"

namespace quorl::tests {

namespace {

using testing::HasSubstr;

constexpr auto name = "autostart/org.quorl.Velora.Sync.desktop";

class StartAtLogin : public testing::Test {
  protected:
    [[nodiscard]] bool isFileThere() const {
        return std::filesystem::exists(folder_.path() / name);
    }

    TemporaryDirectory folder_;
    LoginStart start_{folder_.path() / "autostart"};
};

TEST_F(StartAtLogin, isSwitchedOnAndOff) {
    EXPECT_FALSE(start_.isOn());
    EXPECT_EQ(start_.set(true), "");
    EXPECT_TRUE(start_.isOn());
    EXPECT_TRUE(isFileThere());
    EXPECT_EQ(start_.set(true), "");
    EXPECT_EQ(start_.set(false), "");
    EXPECT_FALSE(start_.isOn());
    EXPECT_FALSE(isFileThere());
    EXPECT_EQ(start_.set(false), "");
}

TEST_F(StartAtLogin, leavesAFileOfTheUsersOwnAlone) {
    folder_.write(name, "[Desktop Entry]\nExec=my-own\n");
    EXPECT_TRUE(start_.isOn());
    for (const bool isOn : {true, false}) {
        EXPECT_THAT(start_.set(isOn), HasSubstr("was not written by this app"));
    }
    EXPECT_TRUE(isFileThere());
}

TEST_F(StartAtLogin, isOffWhereTheDesktopHasHiddenIt) {
    folder_.write(name, "[Desktop Entry]\nExec=x\nHidden=true\nX-Quorl-Written=true\n");
    EXPECT_FALSE(start_.isOn());
    EXPECT_EQ(start_.set(true), "");
    EXPECT_TRUE(start_.isOn());
}

TEST_F(StartAtLogin, saysWhyItCannotBeChanged) {
    folder_.write("autostart", "a file is in the way");
    EXPECT_THAT(start_.set(true), HasSubstr("cannot be written: "));
    EXPECT_FALSE(start_.isOn());
}

} // namespace

} // namespace quorl::tests
