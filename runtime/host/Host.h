#pragma once

#include "platform/HostApp.h"
#include "platform/MediaLibrary.h"
#include "platform/SyncPreferences.h"
#include "platform/SyncSessions.h"
#include "platform/WearableSettings.h"

namespace quorl {

class AnnouncingLibrary;
class Screen;
class StringTable;
class WearableConnection;

/// What a host supplies to the runtime: the services of the device and what surrounds the process.
/// One per process, installed before the first pane is made. Main thread only.
class Host {
  public:
    Host() = default;
    Host(const Host&) = delete;
    Host& operator=(const Host&) = delete;
    virtual ~Host() = default;

    /// Makes `host` the one of this process. It lives until another one, or null, takes its place.
    static void install(std::shared_ptr<Host> host);

    /// The installed host, or null.
    [[nodiscard]] static Host* current();

    /// The installed host. Without one the process ends with a message: nothing of the platform
    /// works.
    [[nodiscard]] static Host& required();

    /// The services. They live as long as the host.
    [[nodiscard]] virtual LMSyncDefaults& syncDefaults() = 0;
    [[nodiscard]] virtual AnnouncingLibrary& mediaLibrary() = 0;

    /// The sessions of a type that exist now, never null.
    [[nodiscard]] virtual NSArray<DVSession> sessions(const std::string& type) = 0;

    /// A connection to the wearable for a client whose replies run on `queue`; never null.
    [[nodiscard]] virtual std::shared_ptr<WearableConnection>
    connectToWearable(dispatch_queue_t queue) = 0;

    /// The toolkit's half of the host.
    [[nodiscard]] virtual Screen& screen() = 0;

    /// The row for the glance of the app with this identifier, or null. Unless overridden: null.
    [[nodiscard]] virtual std::shared_ptr<PSSpecifier>
    glanceSpecifier(const std::string& identifier);

    /// Unless overridden: the runtime's own centre, which every process has.
    [[nodiscard]] virtual NSNotificationCenter& notificationCenter();

    /// The wall clock, in seconds since the start of 1970, UTC. Unless overridden: the machine's.
    [[nodiscard]] virtual double secondsSince1970();

    /// The user's languages, the preferred one first ("de_AT", "de", "en"); never empty. Unless
    /// overridden: those of the environment.
    [[nodiscard]] virtual std::vector<std::string> languages();

    /// The text for `key` of a bundle's table in the user's languages, or null. `value` is what the
    /// caller shows in that case.
    [[nodiscard]] virtual std::optional<std::string>
    textForKey(const StringTable& table, const std::string& key,
               const std::optional<std::string>& value);

    /// A byte count as a text for a person, in the user's language.
    [[nodiscard]] virtual std::string sizeText(float bytes);
};

} // namespace quorl
