// Notices as the desktop's notification service gets them, over a real bus.

#include "quorl-syncd/bus/DesktopNotices.h"

#include <future>
#include <thread>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "services/engine/BusLoop.h"
#include "services/engine/Codes.h"
#include "tests/engine/notices/NotificationService.h"

namespace {

using namespace quorl;
using namespace quorl::syncd;
using namespace quorl::syncd::testing;
using Kind = DesktopNotice::Kind;
using Manner = NotificationService::Manner;
using ::testing::ElementsAre;
using ::testing::IsEmpty;

namespace code = engine::code;

const DesktopNotice done{Kind::Done, {code::synced, {"12"}}};
const DesktopNotice full{Kind::Failed, {code::wearableFull, {}}};

/// A board on a loop of its own, as the engine has it.
class Board {
  public:
    ~Board() {
        loop_.stop();
        thread_.join();
    }

    void show(const DesktopNotice& notice) {
        loop_.post([this, notice] { notices_->show(notice); });
    }

    void withdraw() {
        loop_.post([this] { notices_->withdraw(); });
    }

    /// Waits until the loop has served what was handed to it before.
    void settle() {
        std::promise<void> served;
        loop_.post([&] { served.set_value(); });
        served.get_future().get();
    }

    [[nodiscard]] const std::string& name() const { return name_; }

    /// Takes the board away.
    void remove() {
        loop_.post([this] { notices_.reset(); });
        settle();
    }

  private:
    engine::BusLoop loop_{sdbus::createSessionBusConnection()};
    std::unique_ptr<DesktopNotices> notices_ = std::make_unique<DesktopNotices>(loop_.bus());
    const std::string name_ = loop_.bus().getUniqueName();
    std::thread thread_{[this] { static_cast<void>(loop_.run()); }};
};

/// The app as the bus has it, which notes by which token it was opened.
class App {
  public:
    App()
        : connection_(sdbus::createSessionBusConnection()),
          object_(sdbus::createObject(*connection_, "/org/quorl/Velora")) {
        object_->registerMethod("Activate")
            .onInterface("org.freedesktop.Application")
            .implementedAs([this](const std::map<std::string, sdbus::Variant>& platform) {
                const auto token = platform.find("activation-token");
                token_.set_value(token == platform.end() ? "" : token->second.get<std::string>());
            });
        object_->finishRegistration();
        connection_->requestName("org.quorl.Velora");
        connection_->enterEventLoopAsync();
    }

    /// Waits until it is opened.
    [[nodiscard]] std::string token() { return token_.get_future().get(); }

  private:
    std::promise<std::string> token_;
    std::unique_ptr<sdbus::IConnection> connection_;
    std::unique_ptr<sdbus::IObject> object_;
};

const sdbus::Variant byPerson{std::uint32_t{2}};
const sdbus::Variant onNotice{std::string("default")};

TEST(DesktopNotices, HasAllThatADesktopWantsToKnow) {
    NotificationService service;
    Board board;
    board.show(done);
    service.awaitCall("show 1");

    const auto shown = service.shown();
    EXPECT_EQ(shown.app, "Velora");
    EXPECT_EQ(shown.icon, "org.quorl.Velora");
    EXPECT_EQ(shown.title, "Music synced");
    EXPECT_EQ(shown.body, "12 songs synced to Velora.");
    EXPECT_THAT(shown.actions, ElementsAre("default", "Open"));
    EXPECT_EQ(shown.hints.at("desktop-entry").get<std::string>(), "org.quorl.Velora");
    EXPECT_EQ(shown.hints.at("category").get<std::string>(), "transfer.complete");
    EXPECT_EQ(shown.hints.at("urgency").get<std::uint8_t>(), 0);
}

TEST(DesktopNotices, OfAFailureIsMoreUrgentAndTakesThePlaceOfTheOneBefore) {
    NotificationService service;
    Board board;
    board.show(done);
    service.awaitCall("show 1");
    board.show(full);
    EXPECT_THAT(service.awaitCalls(4), ElementsAre("ask", "show 1", "ask", "show 2 for 1"));

    const auto shown = service.shown();
    EXPECT_EQ(shown.title, "Music not synced");
    EXPECT_EQ(shown.body, "The Velora is full. Remove something from it, or choose a lower limit.");
    EXPECT_EQ(shown.hints.at("category").get<std::string>(), "transfer.error");
    EXPECT_EQ(shown.hints.at("urgency").get<std::uint8_t>(), 1);
}

TEST(DesktopNotices, IsEscapedForAServiceThatReadsMarkup) {
    const DesktopNotice notice{Kind::Failed, {code::songGone, {"<b>R&B</b>.mp3"}}};
    {
        NotificationService plain(std::vector<std::string>{});
        Board board;
        board.show(notice);
        plain.awaitCall("show 1");
        EXPECT_EQ(plain.shown().body, "“<b>R&B</b>.mp3” is no longer in the music folder.");
        EXPECT_THAT(plain.shown().actions, IsEmpty());
    }
    NotificationService rich({"body-markup"});
    Board board;
    board.show(notice);
    rich.awaitCall("show 1");
    EXPECT_EQ(rich.shown().body,
              "“&lt;b&gt;R&amp;B&lt;/b&gt;.mp3” is no longer in the music folder.");
}

TEST(DesktopNotices, IsWithdrawnOnce) {
    NotificationService service;
    Board board;
    board.withdraw();
    board.show(full);
    service.awaitCall("show 1");
    service.awaitHeard(board.name());
    board.withdraw();
    board.withdraw();
    board.show(done);
    EXPECT_THAT(service.awaitCalls(5), ElementsAre("ask", "show 1", "close 1", "ask", "show 2"));
}

TEST(DesktopNotices, IsWithdrawnAtTheEnd) {
    NotificationService service;
    Board board;
    board.show(full);
    service.awaitCall("show 1");
    service.awaitHeard(board.name());
    board.remove();
    service.awaitCall("close 1");
}

TEST(DesktopNotices, ThatAPersonHasClosedIsNotReplaced) {
    NotificationService service;
    Board board;
    board.show(full);
    service.awaitCall("show 1");
    service.tell("NotificationClosed", 7, byPerson);
    board.show(full);
    service.awaitCall("show 2 for 1");
    service.tell("NotificationClosed", 2, byPerson);
    service.awaitHeard(board.name());
    board.show(done);
    service.awaitCall("show 3");
}

TEST(DesktopNotices, OfAServiceThatHasEndedIsNotReplaced) {
    auto first = std::make_unique<NotificationService>();
    Board board;
    board.show(full);
    first->awaitCall("show 1");
    first.reset();
    NotificationService second;
    board.show(done);
    EXPECT_THAT(second.awaitCalls(2), ElementsAre("ask", "show 1"));
}

TEST(DesktopNotices, OpensTheAppWhenAPersonPicksIt) {
    App app;
    NotificationService service;
    Board board;
    board.show(full);
    service.awaitCall("show 1");
    service.awaitHeard(board.name());
    service.tell("ActionInvoked", 7, onNotice);
    service.tell("ActivationToken", 1, sdbus::Variant(std::string("wayland-7")));
    service.tell("ActionInvoked", 1, onNotice);
    EXPECT_EQ(app.token(), "wayland-7");
}

TEST(DesktopNotices, IsShownByTheNextServiceWhereThereWasNone) {
    ::testing::internal::CaptureStderr();
    Board board;
    for (int tries = 0; tries < 3; ++tries) {
        board.show(full);
        board.withdraw();
        board.settle();
    }
    NotificationService service;
    board.show(done);
    service.awaitCall("show 1");
    const auto said = ::testing::internal::GetCapturedStderr();
    EXPECT_EQ(std::ranges::count(said, '\n'), 1) << said;
}

TEST(DesktopNotices, GoesOnWithAServiceThatHasFailed) {
    NotificationService service;
    service.behave(Manner::Fails);
    ::testing::internal::CaptureStderr();
    Board board;
    board.show(full);
    service.awaitCall("ask");
    service.awaitHeard(board.name());
    service.behave(Manner::Answers);
    board.show(done);
    service.awaitCall("show 1");
    board.withdraw();
    service.awaitCall("close 1");
    EXPECT_THAT(::testing::internal::GetCapturedStderr(),
                ::testing::HasSubstr("on the desktop (It does not work.)"));
}

TEST(DesktopNotices, WaitsForNoServiceThatIsSilent) {
    NotificationService service;
    service.behave(Manner::KeepsSilent);
    Board board;
    board.show(full);
    service.awaitCall("ask");
    board.show(done);
    board.withdraw();
    board.show(full);
    board.settle();
    EXPECT_THAT(service.calls(), ElementsAre("ask"));

    service.behave(Manner::Answers);

    EXPECT_THAT(service.awaitCalls(2), ElementsAre("ask", "show 1"));
}

TEST(DesktopNotices, ThatIsNoLongerWantedIsClosedOnceItIsThere) {
    NotificationService service;
    Board board;
    board.show(done);
    service.awaitCall("show 1");
    service.behave(Manner::KeepsSilent);
    board.show(full);
    static_cast<void>(service.awaitCalls(3));
    board.withdraw();
    board.settle();

    service.behave(Manner::Answers);

    EXPECT_THAT(service.awaitCalls(4), ElementsAre("ask", "show 1", "ask", "close 1"));
}

} // namespace
