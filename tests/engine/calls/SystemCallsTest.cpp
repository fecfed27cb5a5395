// What a tracer says of a program's system calls is taken for the steps that they are.

#include "tests/engine/calls/SystemCalls.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace {

using namespace quorl::syncd::testing;
using ::testing::ElementsAre;
using ::testing::FieldsAre;
using ::testing::IsEmpty;

Steps steps(const std::string& line) { return stepsIn({"1795288648.395889000 " + line}, "/w"); }

TEST(SystemCalls, AreTakenForTheStepsOfAVolume) {
    EXPECT_THAT(steps(R"(mkdirat(3</w>, "Music", 0755) = 0)"),
                ElementsAre(FieldsAre("make", "Music/", "")));
    EXPECT_THAT(
        steps(R"(openat(4</w/Music>, "a.TMP", O_WRONLY|O_CREAT|O_EXCL, 0600) = 5</w/Music/a.TMP>)"),
        ElementsAre(FieldsAre("create", "Music/a.TMP", "")));
    EXPECT_THAT(
        steps(
            R"(openat(4</w/.quorl>, "manifest.1", O_WRONLY|O_NOFOLLOW) = 5</w/.quorl/manifest.1>)"),
        ElementsAre(FieldsAre("overwrite", ".quorl/manifest.1", "")));
    EXPECT_THAT(steps(R"(unlinkat(4</w/Music>, "a.TMP", 0) = 0)"),
                ElementsAre(FieldsAre("remove", "Music/a.TMP", "")));
    EXPECT_THAT(steps("fsync(4</w/Music>) = 0"), ElementsAre(FieldsAre("fsync", "Music/", "")));
    EXPECT_THAT(steps("fsync(3</w>) = 0"), ElementsAre(FieldsAre("fsync", "/", "")));
    EXPECT_THAT(steps("syncfs(3</w>) = 0"), ElementsAre(FieldsAre("sync", "", "")));
}

TEST(SystemCalls, AreReadWithWhateverIsInNamesAndContents) {
    EXPECT_THAT(
        steps(R"(write(5</w/Music/a \76 "b", c\).mp3>, "\"x\", {\n\\ \303\244\0001", 9) = 9)"),
        ElementsAre(FieldsAre("write", "Music/a > \"b\", c).mp3",
                              std::string("\"x\", {\n\\ ä\0", 12) + "1")));
    EXPECT_THAT(
        steps(
            R"(renameat2(4</w/Music>, "a.TMP", 4</w/Music>, "b, c (2).mp3", RENAME_NOREPLACE) = 0)"),
        ElementsAre(FieldsAre("rename", "Music/a.TMP", "b, c (2).mp3")));
}

TEST(SystemCalls, ThatNoVolumeMakesKeepTheirNames) {
    EXPECT_THAT(steps(R"(renameat(4</w/Music>, "a", 4</w/Music>, "b") = 0)"),
                ElementsAre(FieldsAre("renameat", "Music/a", "")));
    EXPECT_THAT(steps(R"(openat(4</w/Music>, "a", O_RDWR|O_CREAT, 0600) = 5</w/Music/a>)"),
                ElementsAre(FieldsAre("openat", "Music/a", "O_RDWR|O_CREAT")));
    EXPECT_THAT(steps(R"(unlink("/w/Photos/a") = 0)"),
                ElementsAre(FieldsAre("unlink", "Photos/a", "")));
}

TEST(SystemCalls, ThatFailReadOrAreElsewhereAreNoSteps) {
    EXPECT_THAT(steps("fsync(4</w/Music>) = -1 EIO (Input/output error)"), IsEmpty());
    EXPECT_THAT(steps("fsync(4</w/Music>) = ?"), IsEmpty());
    EXPECT_THAT(steps(R"(openat(3</w>, "Music", O_RDONLY|O_DIRECTORY) = 4</w/Music>)"), IsEmpty());
    EXPECT_THAT(steps("fsync(4</wide>) = 0"), IsEmpty());
    EXPECT_THAT(steps(R"(unlinkat(AT_FDCWD</home>, "a", 0) = 0)"), IsEmpty());
    EXPECT_THAT(steps("--- SIGTERM {si_signo=SIGTERM (15)} ---"), IsEmpty());
}

} // namespace
