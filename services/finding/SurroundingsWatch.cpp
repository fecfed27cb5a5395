#include "services/finding/SurroundingsWatch.h"

#include <chrono>
#include <iostream>
#include <optional>
#include <system_error>
#include <utility>

#include <poll.h>

#include "services/base/MountWatch.h"
#include "services/engine/BusLoop.h"
#include "services/finding/SystemFiles.h"
#include "services/language/Translated.h"

namespace quorl::finding {

namespace {

/// For a service that hangs when nobody wants to know any more.
constexpr std::chrono::milliseconds patience{100};

/// What is plugged in makes itself known with many words.
constexpr std::chrono::milliseconds quietTime{100};

std::unique_ptr<sdbus::IConnection> connectedOrNull(const Connect& connect) {
    try {
        return connect();
    } catch (const sdbus::Error&) {
        return nullptr; // a machine without a bus has no disk service either
    }
}

std::vector<Drive> toldDrives(sdbus::IConnection& bus) {
    try {
        return drivesOf(bus);
    } catch (const sdbus::Error&) {
        return {}; // the system's files tell enough
    }
}

/// @param bus may be null
Surroundings surveyOver(sdbus::IConnection* bus, const std::filesystem::path& files) {
    auto found = surroundingsIn(files);
    if (bus != nullptr) {
        found.drives = joined(toldDrives(*bus), found.drives);
    }
    return found;
}

/// One thread.
class Watch {
  public:
    /// @param bus may be null
    Watch(std::unique_ptr<sdbus::IConnection> bus, std::filesystem::path files,
          const SurroundingsWatch::Tell& tell)
        : tell_(tell), files_(std::move(files)), bus_(bus.get()), loop_(std::move(bus)) {
        loop_.watch(mounts_.descriptor(), POLLPRI, [this] {
            if (mounts_.take()) {
                lookSoon();
            }
        });
        if (bus_ != nullptr) {
            watchService(*bus_, [this] { lookSoon(); });
        }
        look();
    }

    void run(const std::stop_token& stop) {
        const std::stop_callback end(stop, [this] { loop_.stop(); });
        if (!loop_.run().empty()) {
            bus_ = nullptr;
            look();
            static_cast<void>(loop_.run());
        }
    }

  private:
    void lookSoon() {
        if (!std::exchange(isLookDue_, true)) {
            loop_.callAt(engine::BusLoop::Clock::now() + quietTime, [this] { look(); });
        }
    }

    void look() {
        isLookDue_ = false;
        auto now = surveyOver(bus_, files_);
        if (known_ != now) {
            known_ = std::move(now);
            tell_(*known_);
        }
    }

    const SurroundingsWatch::Tell& tell_;
    const std::filesystem::path files_;
    sdbus::IConnection* bus_; ///< null where it is gone
    engine::BusLoop loop_;
    base::MountWatch mounts_{"/"};
    bool isLookDue_ = false;
    std::optional<Surroundings> known_;
};

void watch(const SurroundingsWatch::Tell& tell, const Sources& sources,
           const std::stop_token& stop) {
    try {
        Watch(connectedOrNull(sources.connect), sources.files, tell).run(stop);
    } catch (const std::system_error& error) {
        std::cerr << language::filled(
                         language::translated("What is plugged in is not noticed: {reason}. Close "
                                              "some programs, then start this one again."),
                         {{"reason", error.code().message()}})
                  << '\n';
    }
}

} // namespace

std::unique_ptr<sdbus::IConnection> connectToSystem() { return sdbus::createSystemBusConnection(); }

Surroundings survey(const Sources& sources) {
    const auto bus = connectedOrNull(sources.connect);
    return surveyOver(bus.get(), sources.files);
}

SurroundingsWatch::SurroundingsWatch(Tell tell, Sources sources)
    : errand_([tell = std::move(tell), sources = std::move(sources)](
                  const std::stop_token& stop) { watch(tell, sources, stop); },
              patience) {}

} // namespace quorl::finding
