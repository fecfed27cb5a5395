#include "quorl/window/desktop/WindowMemory.h"

#include <QFile>

#include <gmock/gmock.h>

#include "tests/base/TemporaryDirectory.h"
#include "tests/quorl/window/Window.h"

namespace quorl::tests {

namespace {

using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::Optional;

const QSize room(1920, 1080);

class WindowMemoryFile : public testing::Test {
  protected:
    void write(const QByteArray& contents) {
        QFile file(path_);
        ASSERT_TRUE(file.open(QFile::WriteOnly));
        file.write(contents);
    }

    TemporaryDirectory folder_;
    const QString path_ = QString::fromStdString((folder_ / "window.ini").string());
    const WindowMemory memory_ = WindowMemory(path_);
};

TEST_F(WindowMemoryFile, nextWindowIsAsTheLastOneWas) {
    EXPECT_THAT(memory_.keep({QSize(800, 600), {"A", "B"}}).toStdString(), IsEmpty());
    const WindowMemory next(path_);
    EXPECT_EQ(next.size(room), QSize(800, 600));
    EXPECT_THAT(next.panes(), Optional(ElementsAre("A", "B")));
}

TEST_F(WindowMemoryFile, frontPageIsKeptToo) {
    EXPECT_THAT(memory_.keep({QSize(800, 600), {}}).toStdString(), IsEmpty());
    EXPECT_THAT(memory_.panes(), Optional(IsEmpty()));
}

TEST_F(WindowMemoryFile, firstWindowHasTheUsualSizeAndNoPaneOfItsOwn) {
    EXPECT_EQ(memory_.size(room), QSize(400, 720));
    EXPECT_EQ(memory_.panes(), std::nullopt);
}

TEST_F(WindowMemoryFile, noWindowIsLargerThanItsScreen) {
    EXPECT_EQ(memory_.size(QSize(360, 640)), QSize(360, 640));
    EXPECT_THAT(memory_.keep({QSize(3000, 2000), {}}).toStdString(), IsEmpty());
    EXPECT_EQ(memory_.size(room), room);
}

TEST_F(WindowMemoryFile, sizeThatMakesNoSenseIsNotTaken) {
    for (const char* contents : {"width=-5\nheight=700\n", "width=wide\nheight=700\n",
                                 "height=700\n", "width=@ByteArray(\\0)\nheight=@Invalid()\n",
                                 "width=1\nheight=1\n", "[[[[", "\xff\xfe\x01=\x02"}) {
        write(contents);
        EXPECT_EQ(memory_.size(room), QSize(400, 720)) << contents;
    }
}

TEST_F(WindowMemoryFile, damagedFileIsWrittenAnew) {
    write("\xff\xfe[[[ \n=\n");
    EXPECT_THAT(memory_.keep({QSize(800, 600), {"A"}}).toStdString(), IsEmpty());
    EXPECT_EQ(memory_.size(room), QSize(800, 600));
    EXPECT_THAT(memory_.panes(), Optional(ElementsAre("A")));
}

TEST_F(WindowMemoryFile, fileThatCannotBeWrittenIsNamed) {
    const WindowMemory memory(QStringLiteral("/proc/quorl/window.ini"));
    EXPECT_THAT(memory.keep({room, {}}).toStdString(), HasSubstr("/proc/quorl/window.ini. Make"));
}

TEST(WindowMemory, ofATrialKeepsNothing) {
    const auto trial = WindowMemory::of(base::Purpose::Trial);
    EXPECT_THAT(trial.keep({QSize(800, 600), {"A"}}).toStdString(), IsEmpty());
    EXPECT_EQ(trial.size(room), QSize(400, 720));
    EXPECT_EQ(trial.panes(), std::nullopt);
    EXPECT_EQ(WindowMemory::of(base::Purpose::Use).size(room), QSize(400, 720));
}

TEST(ReopenedPanes, areThoseThatWereOpen) {
    Window window;
    window.click(1);
    const auto panes = window.companion().openPanes();
    EXPECT_THAT(panes, ElementsAre("LMQuorlSettingsController", "LMQuorlLimitChooser"));
    window.press(Qt::Key_Escape);
    window.press(Qt::Key_Escape);
    ASSERT_EQ(window.title(), "Velora");
    EXPECT_THAT(window.companion().openPanes(), IsEmpty());

    window.companion().reopen(panes);

    QCoreApplication::processEvents();
    EXPECT_EQ(window.title(), "Playlist Limit");
}

TEST(ReopenedPanes, areNoneWhereTheFrontPageWasLeftOpen) {
    Window window;
    window.companion().reopen({});
    QCoreApplication::processEvents();
    EXPECT_EQ(window.title(), "Velora");
}

TEST(ReopenedPanes, endWithTheLastThatThereStillIs) {
    Window window;
    window.companion().reopen({"LMQuorlSettingsController", "NoSuchChooser", "NoSuchEither"});
    QCoreApplication::processEvents();
    EXPECT_EQ(window.title(), "Music");
}

} // namespace

} // namespace quorl::tests
