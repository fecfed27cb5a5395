#include <QAccessible>
#include <QTest>

#include <gmock/gmock.h>

#include "quorl/window/NoticeBar.h"
#include "quorl/window/NoticeRow.h"
#include "quorl/window/look/FlatButton.h"

namespace quorl::tests {

namespace {

using testing::ElementsAre;
using testing::IsEmpty;
using Topic = Notices::Topic;

class NoticesOfAWindow : public testing::Test {
  protected:
    NoticesOfAWindow() : bar_(notices_, screen_, &window_) {
        window_.resize(400, 300);
        bar_.setGeometry(window_.rect());
        window_.show();
    }

    [[nodiscard]] std::vector<NoticeRow*> rows() {
        QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
        std::vector<NoticeRow*> shown;
        for (auto* row : bar_.findChildren<NoticeRow*>()) {
            if (!row->isHidden()) {
                shown.push_back(row);
            }
        }
        return shown;
    }

    [[nodiscard]] std::vector<std::string> texts() {
        std::vector<std::string> texts;
        for (const auto* row : rows()) {
            texts.push_back(row->accessibleName().toStdString());
        }
        return texts;
    }

    static FlatButton& button(NoticeRow& row, const QString& name) {
        for (auto* button : row.findChildren<FlatButton*>()) {
            if (button->text() == name) {
                return *button;
            }
        }
        throw std::runtime_error("no button is called " + name.toStdString());
    }

    WindowScreen screen_;
    Notices notices_;
    QWidget window_;
    NoticeBar bar_;
};

TEST_F(NoticesOfAWindow, areShownUntilTheyAreVoid) {
    notices_.set(Topic::Engine, "full");
    notices_.set(Topic::Watching, "unwatched");
    EXPECT_THAT(texts(), ElementsAre("full", "unwatched"));
    notices_.set(Topic::Engine, "");
    EXPECT_THAT(texts(), ElementsAre("unwatched"));
    notices_.set(Topic::Watching, "");
    EXPECT_TRUE(bar_.isHidden());
}

TEST_F(NoticesOfAWindow, standInTheOrderOfTheirTopics) {
    notices_.set(Topic::Watching, "last");
    notices_.set(Topic::Engine, "second");
    notices_.set(Topic::Pane, "first");
    auto* column = bar_.layout();
    ASSERT_EQ(column->count(), 3);
    for (const auto& [place, text] : {std::pair(0, "first"), {1, "second"}, {2, "last"}}) {
        EXPECT_EQ(column->itemAt(place)->widget()->accessibleName(), text);
    }
}

TEST_F(NoticesOfAWindow, haveAButtonForWhatCanBeDone) {
    int done = 0;
    notices_.set(Topic::Engine, {"full", "Try Again", [&done] { ++done; }});
    QTest::mouseClick(&button(*rows().front(), "Try Again"), Qt::LeftButton);
    EXPECT_EQ(done, 1);
}

TEST_F(NoticesOfAWindow, thatArePutAwayComeBackOnlyWithAnotherText) {
    notices_.set(Topic::Engine, "full");
    QTest::mouseClick(&button(*rows().front(), QStringLiteral("✕")), Qt::LeftButton);
    EXPECT_THAT(texts(), IsEmpty());
    EXPECT_TRUE(bar_.isHidden());
    notices_.set(Topic::Watching, "unwatched");
    EXPECT_THAT(texts(), ElementsAre("unwatched"));
    notices_.set(Topic::Engine, "write-protected");
    EXPECT_EQ(texts().size(), 2);
    notices_.set(Topic::Engine, "full");
    EXPECT_EQ(texts().size(), 2) << "it is news again";
}

TEST_F(NoticesOfAWindow, stayAsTheyAreWhereAnotherComes) {
    notices_.set(Topic::Engine, "full");
    auto* before = rows().front();
    notices_.set(Topic::Watching, "unwatched");
    EXPECT_EQ(rows().front(), before);
}

/// How far a button begins below the middle of the text beside or above it.
int stepDown(const NoticeRow& row, const FlatButton& button) {
    return button.geometry().top() - row.findChild<QLabel*>()->geometry().center().y();
}

TEST_F(NoticesOfAWindow, haveTheirButtonBelowATextThatFillsTheLine) {
    notices_.set(Topic::Engine, {"full", "Try Again", [] {}});
    notices_.set(Topic::Watching,
                 {"There is no music folder in a place that is far away. Create it.",
                  "Choose Another Folder For Music…", [] {}});
    QTest::qWait(0);
    EXPECT_LT(stepDown(*rows().front(), button(*rows().front(), "Try Again")), 0);

    auto& action = button(*rows().back(), QStringLiteral("Choose Another Folder For Music…"));
    EXPECT_GT(stepDown(*rows().back(), action), 0);
    EXPECT_GE(action.width(), action.sizeHint().width()) << "it is cut";
    window_.resize(1200, 300);
    bar_.setGeometry(window_.rect());
    QTest::qWait(0);
    EXPECT_LT(stepDown(*rows().back(), action), 0);
}

TEST_F(NoticesOfAWindow, areNotificationsToAScreenReader) {
    notices_.set(Topic::Engine, "full");
    auto* notification = QAccessible::queryAccessibleInterface(rows().front());
    EXPECT_EQ(notification->role(), QAccessible::Notification);
    EXPECT_EQ(notification->text(QAccessible::Name), "full");
}

} // namespace

} // namespace quorl::tests
