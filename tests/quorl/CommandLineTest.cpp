#include <gmock/gmock.h>

#include "tests/quorl/QuorlProcess.h"

namespace quorl::tests {

namespace {

using testing::HasSubstr;
using testing::IsEmpty;

TEST(CommandLine, helpTellsOptionsAndExitCodes) {
    QuorlProcess quorl({"--help"});
    EXPECT_EQ(quorl.end(), 0);
    EXPECT_THAT(quorl.output(), HasSubstr("--screenshot FILE"));
    EXPECT_THAT(quorl.output(), HasSubstr("Exit codes:"));
    EXPECT_THAT(quorl.errors(), IsEmpty());
}

TEST(CommandLine, versionIsOneLineWithTheName) {
    QuorlProcess quorl({"--version"});
    EXPECT_EQ(quorl.end(), 0);
    EXPECT_THAT(quorl.output(), testing::StartsWith("quorl "));
}

class Mistake : public testing::TestWithParam<std::vector<std::string>> {};

TEST_P(Mistake, endsWithTwoAndSaysWhatToDo) {
    QuorlProcess quorl(GetParam());
    EXPECT_EQ(quorl.end(), 2);
    EXPECT_THAT(quorl.errors(), HasSubstr("quorl --help"));
    EXPECT_THAT(quorl.output(), IsEmpty());
}

INSTANTIATE_TEST_SUITE_P(
    CommandLine, Mistake,
    testing::Values(std::vector<std::string>{"--unknown"}, std::vector<std::string>{"extra"},
                    std::vector<std::string>{"--text", "--library"},
                    std::vector<std::string>{"--json"},
                    std::vector<std::string>{"--choose", "x", "--text"},
                    std::vector<std::string>{"--sync", "--cancel"},
                    std::vector<std::string>{"--limit", "1 song", "--music", "/tmp"},
                    std::vector<std::string>{"--dark"}, std::vector<std::string>{"--screenshot"},
                    std::vector<std::string>{"--screenshot", "a.png", "--size", "360"},
                    std::vector<std::string>{"--screenshot", "a.png", "--size", "360x720x2"},
                    std::vector<std::string>{"--screenshot", "a.png", "--size", "0x99999"},
                    std::vector<std::string>{"--screenshot", "a.png", "--scale", "0"},
                    std::vector<std::string>{"--screenshot", "a.png", "--pane", "other"},
                    std::vector<std::string>{"--plugins", "/nonexistent"}));

TEST(CommandLine, trialOfAFolderWhoseNameIsNoTextSaysWhatToDo) {
    QProcess shell;
    shell.start(QStringLiteral("sh"),
                {QStringLiteral("-c"),
                 QStringLiteral("exec \"$0\" --text --music \"$(printf '/tmp/m\\377sic')\""),
                 QStringLiteral(QUORL_PROGRAM)});
    ASSERT_TRUE(shell.waitForFinished(60'000));
    EXPECT_EQ(shell.exitCode(), 2);
    EXPECT_THAT(shell.readAllStandardError().toStdString(),
                testing::AllOf(HasSubstr("/tmp/m\uFFFDsic"), HasSubstr("UTF-8, rename it")));
}

TEST(CommandLine, windowWithoutADisplaySaysWhatToUseInstead) {
    QuorlProcess quorl({}, {{"DISPLAY", ""}, {"WAYLAND_DISPLAY", ""}});
    EXPECT_EQ(quorl.end(), 1);
    EXPECT_THAT(quorl.errors(), HasSubstr("--text"));
}

} // namespace

} // namespace quorl::tests
