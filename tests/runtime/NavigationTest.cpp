#include <gmock/gmock.h>

#include "runtime/lists/ListView.h"
#include "runtime/lists/NavigationController.h"
#include "tests/support/TestHost.h"

namespace {

using quorl::NavigationController;
using quorl::tests::TestHost;
using testing::ElementsAre;
using testing::IsEmpty;

std::vector<std::string>& calls() {
    static std::vector<std::string> lines; // panes are made by their class, with nothing to hand in
    return lines;
}

/// A pane that notes what it is told under its name.
class Pane : public PSListController {
  public:
    explicit Pane(std::string name = "pane") : name_(std::move(name)) {}

    ~Pane() override { note("gone"); }

    NSArray<PSSpecifier> specifiers() override {
        note("specifiers");
        return PSListController::specifiers();
    }

    void viewWillAppear(bool animated) override { note("will appear", animated); }

    void viewDidAppear(bool animated) override { note("did appear", animated); }

    void viewWillDisappear(bool animated) override { note("will disappear", animated); }

    void viewDidDisappear(bool animated) override { note("did disappear", animated); }

    void setParentController(PSController* controller) override {
        note("parent");
        PSListController::setParentController(controller);
    }

    void setRootController(PSRootController* controller) override {
        note("root");
        PSListController::setRootController(controller);
    }

    void setSpecifier(std::shared_ptr<PSSpecifier> specifier) override {
        note("specifier");
        PSListController::setSpecifier(std::move(specifier));
    }

    void handleURL(const std::string& url) override { note("url " + url); }

  private:
    void note(const std::string& event) { calls().push_back(name_ + " " + event); }

    void note(const std::string& event, bool animated) {
        note(event + (animated ? " animated" : ""));
    }

    std::string name_;
};

class Detail : public Pane {
  public:
    Detail() : Pane("detail") {}
};

class RefusingDetail : public Pane {
  public:
    RefusingDetail() : Pane("refusing") {}

    [[nodiscard]] bool init() override { return false; }
};

class Navigation : public testing::Test {
  protected:
    Navigation() {
        root_->setRootController(navigation_.get());
        calls().clear();
    }

    static std::shared_ptr<Pane> makePane(const std::string& name) {
        auto pane = std::make_shared<Pane>(name);
        EXPECT_TRUE(pane->init());
        return pane;
    }

    static std::shared_ptr<PSSpecifier> rowOpening(std::optional<Class> detail) {
        return PSSpecifier::preferenceSpecifierNamed_target_set_get_detail_cell_edit(
            "Row", nullptr, std::nullopt, std::nullopt, detail, PSCellType::LinkList, std::nullopt);
    }

    void openRoot() {
        navigation_->setRootPane(root_);
        navigation_->appear(false);
        calls().clear();
    }

    std::shared_ptr<TestHost> host_ = TestHost::installed();
    std::shared_ptr<NavigationController> navigation_ = create<NavigationController>();
    std::shared_ptr<Pane> root_ = makePane("root");
};

TEST_F(Navigation, IsEmptyAtFirst) {
    EXPECT_EQ(navigation_->top(), nullptr);
    EXPECT_FALSE(navigation_->openURL("quorl:x"));
    navigation_->appear(true);
    navigation_->disappear(true);
    navigation_->pop(true);
    EXPECT_THAT(calls(), IsEmpty());
}

TEST_F(Navigation, TakesTheRootPane) {
    navigation_->setRootPane(root_);

    EXPECT_THAT(calls(), ElementsAre("root root"));
    EXPECT_EQ(root_->rootController(), navigation_.get());
    EXPECT_THAT(navigation_->stack(), ElementsAre(root_));
}

TEST_F(Navigation, TellsTheTopPaneThatTheStackComesAndGoes) {
    openRoot();

    navigation_->disappear(true);
    navigation_->appear(false);

    EXPECT_THAT(calls(), ElementsAre("root will disappear animated", "root did disappear animated",
                                     "root will appear", "root did appear"));
}

TEST_F(Navigation, OpensADetailPaneThatKnowsWhereItBelongs) {
    openRoot();
    const auto row = rowOpening(Class::of<Detail>());

    EXPECT_TRUE(navigation_->open(row));

    EXPECT_THAT(calls(),
                ElementsAre("detail parent", "detail root", "detail specifier", "detail specifiers",
                            "root will disappear animated", "detail will appear animated",
                            "root did disappear animated", "detail did appear animated"));
    const auto detail = std::dynamic_pointer_cast<Pane>(navigation_->top());
    ASSERT_NE(detail, nullptr);
    EXPECT_EQ(detail->parentController(), root_.get());
    EXPECT_EQ(detail->rootController(), navigation_.get());
    EXPECT_EQ(detail->specifier(), row);
}

TEST_F(Navigation, OpensNothingForARowWithoutADetailPane) {
    openRoot();

    EXPECT_FALSE(navigation_->open(rowOpening(std::nullopt)));
    EXPECT_FALSE(navigation_->open(rowOpening(Class::of<NSObject>()))) << "no pane";
    EXPECT_THAT(navigation_->stack(), ElementsAre(root_));
    EXPECT_THAT(calls(), IsEmpty());
}

TEST_F(Navigation, OpensNothingWhereThePaneCouldNotBeMade) {
    openRoot();

    EXPECT_FALSE(navigation_->open(rowOpening(Class::of<RefusingDetail>())));

    EXPECT_THAT(navigation_->stack(), ElementsAre(root_));
    EXPECT_THAT(calls(), ElementsAre("refusing gone"));
}

TEST_F(Navigation, LeavesTheTopPaneAndLetsGoOfIt) {
    openRoot();
    (void)navigation_->open(rowOpening(Class::of<Detail>()));
    calls().clear();

    navigation_->pop(false);

    EXPECT_THAT(calls(), ElementsAre("detail will disappear", "root will appear",
                                     "detail did disappear", "root did appear", "detail gone"));
    EXPECT_EQ(navigation_->top(), root_);
}

TEST_F(Navigation, KeepsTheRootPane) {
    openRoot();

    navigation_->pop(true);

    EXPECT_EQ(navigation_->top(), root_);
    EXPECT_THAT(calls(), IsEmpty());
}

TEST_F(Navigation, TellsARootPaneThatStaysOnTheScreenNothingOfThoseAboveIt) {
    openRoot();
    navigation_->setRootPlace(NavigationController::RootPlace::Beside);

    (void)navigation_->open(rowOpening(Class::of<Detail>()));
    calls().erase(calls().begin(), calls().begin() + 4); // how it is made
    navigation_->pop(false);

    EXPECT_THAT(calls(),
                ElementsAre("detail will appear animated", "detail did appear animated",
                            "detail will disappear", "detail did disappear", "detail gone"));
}

TEST_F(Navigation, TellsTheRootPaneThatItComesAndGoesByItsPlace) {
    openRoot();
    (void)navigation_->open(rowOpening(Class::of<Detail>()));
    calls().clear();

    navigation_->setRootPlace(NavigationController::RootPlace::Beside);
    navigation_->setRootPlace(NavigationController::RootPlace::Beside);
    navigation_->setRootPlace(NavigationController::RootPlace::Below);

    EXPECT_THAT(calls(), ElementsAre("root will appear", "root did appear", "root will disappear",
                                     "root did disappear"));
}

TEST_F(Navigation, TellsTheRootPaneNothingOfItsPlaceWhileTheStackIsOffTheScreen) {
    openRoot();
    (void)navigation_->open(rowOpening(Class::of<Detail>()));
    navigation_->disappear(false);
    calls().clear();

    navigation_->setRootPlace(NavigationController::RootPlace::Beside);

    EXPECT_THAT(calls(), IsEmpty());
    navigation_->appear(false);
    EXPECT_THAT(calls(), ElementsAre("root will appear", "root did appear", "detail will appear",
                                     "detail did appear"));
}

TEST_F(Navigation, TellsAllPanesThatAreSeenThatTheStackComesAndGoes) {
    openRoot();
    (void)navigation_->open(rowOpening(Class::of<Detail>()));
    navigation_->setRootPlace(NavigationController::RootPlace::Beside);
    calls().clear();

    navigation_->disappear(false);

    EXPECT_THAT(calls(), ElementsAre("root will disappear", "root did disappear",
                                     "detail will disappear", "detail did disappear"));
    EXPECT_THAT(navigation_->onScreen(), ElementsAre(root_, navigation_->top()));
}

TEST_F(Navigation, ReturnsToAPane) {
    openRoot();
    (void)navigation_->open(rowOpening(Class::of<Detail>()));
    (void)navigation_->open(rowOpening(Class::of<Detail>()));
    EXPECT_EQ(navigation_->above(*navigation_->stack()[1]), navigation_->top());
    EXPECT_EQ(navigation_->above(*navigation_->top()), nullptr);

    navigation_->returnTo(*root_);

    EXPECT_THAT(navigation_->stack(), ElementsAre(root_));
    EXPECT_EQ(navigation_->above(*root_), nullptr);
}

TEST_F(Navigation, LetsGoOfEveryPaneTheTopOneFirst) {
    openRoot();
    (void)navigation_->open(rowOpening(Class::of<Detail>()));
    root_.reset();
    calls().clear();

    navigation_->clear();

    EXPECT_THAT(calls(), ElementsAre("detail gone", "root gone"));
    EXPECT_EQ(navigation_->top(), nullptr);
}

TEST_F(Navigation, HandsAUrlToTheTopPane) {
    openRoot();

    EXPECT_TRUE(navigation_->openURL("quorl:limit"));

    EXPECT_THAT(calls(), ElementsAre("root url quorl:limit"));
}

TEST_F(Navigation, ShowsAPaneThatAListAsksFor) {
    openRoot();
    const auto other = makePane("other");

    root_->showController(other);
    EXPECT_EQ(navigation_->top(), other);
    EXPECT_EQ(other->parentController(), root_.get());
    EXPECT_EQ(other->rootController(), navigation_.get());
    EXPECT_EQ(calls().back(), "other did appear animated");

    const auto third = makePane("third");
    root_->showController_animate(third, false);
    EXPECT_EQ(calls().back(), "third did appear");
    EXPECT_THAT(host_->journal.lines({"show"}), ElementsAre("show", "show at once"));
}

TEST_F(Navigation, ShowsNothingForAListOutsideIt) {
    const auto alone = makePane("alone");

    alone->showController(root_);
    alone->showController(nullptr);

    EXPECT_EQ(navigation_->top(), nullptr);
    EXPECT_THAT(host_->journal.lines({"show"}), ElementsAre("show", "show"));
}

class CountingList : public PSListController {
  public:
    NSArray<PSSpecifier> specifiers() override {
        ++drawn;
        return nullptr;
    }

    int drawn = 0;
};

TEST_F(Navigation, HasItsPanesDrawnWhenTheyAreMarked) {
    const auto list = create<CountingList>();
    list->viewDidAppear(false);

    quorl::draw(*list);
    quorl::draw(*list);
    EXPECT_EQ(list->drawn, 1);

    list->reload();
    quorl::draw(*list);
    EXPECT_EQ(list->drawn, 2);
}

} // namespace
