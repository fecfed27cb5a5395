#pragma once

#include <functional>
#include <memory>
#include <set>
#include <string>
#include <string_view>
#include <type_traits>

#include "services/base/Purpose.h"
#include "services/preferences/Preference.h"

namespace quorl::preferences {

/// Keys of preferences, as in `keys.contains(assetSyncLimit.key)`. The texts live as long as the
/// process.
using KeySet = std::set<std::string_view>;

/// What became of a write.
struct [[nodiscard]] WriteResult {
    /// Whether the write made a difference: false where the value was the same already (nothing was
    /// sent to the store then) and where the write failed.
    bool changed = false;

    /// Empty unless the write failed; then a sentence for the user that says why and what to do.
    /// The store still has the old value.
    std::string problem;
};

/// The preferences that the app and the sync engine share. They live in GSettings (dconf), so every
/// program of the user that opens them for the same purpose sees the same values.
///
/// All methods may be called on any thread, also within the `Changed` call.
class SharedPreferences {
  public:
    /// Is told which values have got another value from elsewhere: from another process, or from
    /// another object of this class. Never told of what was written through this object.
    ///
    /// Called once for each change that the store announces, on a thread that this object owns; so
    /// a host needs no GLib loop. What is read within the call, or after it on any thread, is at
    /// least as new as the change. When changes follow each other fast, the first call of several
    /// may already read the last value.
    ///
    /// Where the session bus itself was replaced by another one while the program ran, changes are
    /// read as ever but no longer told.
    ///
    /// It may come before `open` has returned, so the object is handed over. Keep it short, as the
    /// next change waits for it. It must not throw and must not destroy the object.
    using Changed = std::function<void(SharedPreferences& preferences, const KeySet& keys)>;

    struct [[nodiscard]] Opened {
        /// Null when there is no usable schema.
        std::unique_ptr<SharedPreferences> preferences;

        /// Empty when all is well. Otherwise a sentence for the user that says what is wrong and
        /// what to do about it. Where `preferences` is not null, they work, but only within this
        /// process and until it ends.
        std::string problem;
    };

    /// Opens the store. Takes a few milliseconds, more when it is the first of the session to speak
    /// to the session bus.
    ///
    /// The schema is looked for beside the running program (`../share/glib-2.0/schemas`), then
    /// where GSettings looks. From here on the loss of the session bus no longer ends the process,
    /// which is what GIO does by default with the bus connection that a process has in common.
    ///
    /// @param changed may be empty.
    static Opened open(Changed changed, base::Purpose purpose = base::Purpose::Use);

    SharedPreferences(const SharedPreferences&) = delete;
    SharedPreferences& operator=(const SharedPreferences&) = delete;

    /// Waits for a `Changed` call that is under way; none comes afterwards.
    ~SharedPreferences();

    /// The value of this moment, also where the change to it has not been told yet. Takes about a
    /// microsecond, never waits for another process, and also works without a session bus.
    template <class T>
    [[nodiscard]] T get(const Preference<T>& preference) const;

    /// Writes the value and waits until the store has it: when this returns, other processes read
    /// it, and it outlives this process, however that ends. Each write is announced to other
    /// processes on its own, in the order of the calls.
    ///
    /// Takes some milliseconds, in which the store writes its file; up to a minute, and then fails,
    /// where its service hangs.
    template <class T>
    WriteResult set(const Preference<T>& preference, const std::type_identity_t<T>& value);

  private:
    class Store;

    explicit SharedPreferences(std::unique_ptr<Store> store);

    const std::unique_ptr<Store> store_;
};

} // namespace quorl::preferences
