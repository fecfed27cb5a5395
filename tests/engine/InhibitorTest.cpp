// The machine stays awake while the engine copies, and may sleep afterwards.

#include <csignal>

#include <fcntl.h>
#include <sdbus-c++/sdbus-c++.h>
#include <unistd.h>

#include "tests/engine/EngineFixture.h"

namespace {

using namespace quorl;
using namespace quorl::syncd::testing;
using Kind = Event::Kind;

/// A login manager on a bus of its own, which hands out one end of a pipe as the lock.
class LoginManager {
  public:
    LoginManager()
        : connection_{sdbus::createSessionBusConnectionWithAddress(bus_.address())},
          object_{sdbus::createObject(*connection_, "/org/freedesktop/login1")} {
        int ends[2] = {};
        if (pipe2(ends, O_CLOEXEC) != 0) {
            throw std::runtime_error{"pipe"};
        }
        reading_ = base::FileDescriptor{ends[0]};
        writing_ = base::FileDescriptor{ends[1]};
        object_->registerMethod("Inhibit")
            .onInterface("org.freedesktop.login1.Manager")
            .implementedAs([this](const std::string& what, const std::string&, const std::string&,
                                  const std::string& mode) {
                asked_.set_value(what + " " + mode);
                return sdbus::UnixFd{writing_.get()};
            });
        object_->finishRegistration();
        connection_->requestName("org.freedesktop.login1");
        connection_->enterEventLoopAsync();
    }

    [[nodiscard]] const std::string& address() const { return bus_.address(); }

    /// Waits until the lock is asked for.
    [[nodiscard]] std::string asked() { return asked_.get_future().get(); }

    /// Waits until nobody holds the lock any more.
    void awaitRelease() {
        writing_ = base::FileDescriptor{};
        char byte = 0;
        while (read(reading_.get(), &byte, 1) > 0) {
        }
    }

  private:
    SecondBus bus_;
    std::unique_ptr<sdbus::IConnection> connection_;
    std::unique_ptr<sdbus::IObject> object_;
    base::FileDescriptor reading_;
    base::FileDescriptor writing_;
    std::promise<std::string> asked_;
};

class Inhibitor : public EngineTest {
  protected:
    void startSlowly() {
        setenv("DBUS_SYSTEM_BUS_ADDRESS", login_.address().c_str(), 1);
        listLargeSongs();
        start({"--rate-limit", "2000000"});
        choose();
        EXPECT_EQ(login_.asked(), "sleep block");
        nextOfAssets(Kind::TaskDidUpdate);
    }

    LoginManager login_;
};

TEST_F(Inhibitor, IsReleasedWhenEverythingWasSent) {
    startSlowly();
    sessionEnd();
    login_.awaitRelease();
}

TEST_F(Inhibitor, IsReleasedWhenTheSyncIsCancelled) {
    startSlowly();
    EXPECT_EQ(recorder_.ask(&engine::Client::cancel), "");
    login_.awaitRelease();
}

TEST_F(Inhibitor, IsReleasedWhenTheEngineIsKilled) {
    startSlowly();
    end(SIGKILL);
    login_.awaitRelease();
}

} // namespace
