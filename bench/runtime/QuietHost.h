#pragma once

#include "runtime/host/Host.h"
#include "runtime/services/AnnouncingLibrary.h"
#include "tests/support/TestPreferences.h"
#include "tests/support/TestScreen.h"
#include "tests/support/TestWearable.h"

namespace quorl::bench {

/// A song or playlist whose one number is kept as it is handed out.
template <std::derived_from<MPMediaEntity> Base>
class Entity : public Base {
  public:
    /// `value` is what the entity has for `property`, its only one.
    Entity(std::uint64_t persistentID, MPMediaProperty property, std::uint64_t value)
        : persistentID_(persistentID),
          property_(property),
          value_(NSNumber::numberWithUnsignedLongLong(value)) {}

    [[nodiscard]] std::uint64_t persistentID() const override { return persistentID_; }

    [[nodiscard]] std::shared_ptr<NSObject>
    valueForProperty(MPMediaProperty property) const override {
        return property == property_ ? value_ : nullptr;
    }

  private:
    std::uint64_t persistentID_;
    MPMediaProperty property_;
    std::shared_ptr<NSNumber> value_;
};

using Song = Entity<MPMediaItem>;

class Playlist final : public Entity<MPMediaPlaylist> {
  public:
    explicit Playlist(std::uint64_t persistentID)
        : Entity(persistentID, MPMediaPlaylistPropertyPersistentID, persistentID) {}

    void setItems(NSArray<MPMediaItem> items) { items_ = std::move(items); }

    [[nodiscard]] std::optional<std::string> name() const override { return "Playlist"; }

    [[nodiscard]] NSArray<MPMediaItem> items() const override { return items_; }

  private:
    NSArray<MPMediaItem> items_;
};

/// A library of `count` playlists with ids from 1 on.
class Library final : public AnnouncingLibrary {
  public:
    explicit Library(std::uint64_t count);

    [[nodiscard]] Playlist& playlist(std::uint64_t persistentID) {
        return *playlists_.at(persistentID - 1);
    }

    [[nodiscard]] bool hasMediaOfType(NSUInteger /*mask*/) const override { return true; }

    [[nodiscard]] NSArray<MPMediaPlaylist>
    playlistsMatching(const Predicates& predicates) const override;

  private:
    std::vector<std::shared_ptr<Playlist>> playlists_;
};

/// A host that spends no time on taking notes. Sync is on without a limit, and the playlist in the
/// middle of a library of a thousand is chosen.
class QuietHost final : public Host {
  public:
    static constexpr std::uint64_t playlistCount = 1'000;
    static constexpr std::uint64_t chosen = playlistCount / 2;

    QuietHost();

    [[nodiscard]] LMSyncDefaults& syncDefaults() override { return *defaults_; }

    [[nodiscard]] Library& mediaLibrary() override { return *library_; }

    [[nodiscard]] NSArray<DVSession> sessions(const std::string& type) override;
    [[nodiscard]] std::shared_ptr<WearableConnection>
    connectToWearable(dispatch_queue_t queue) override;

    [[nodiscard]] Screen& screen() override { return screen_; }

    [[nodiscard]] tests::TestWearable& wearable() { return wearable_; }

  private:
    tests::Journal journal_;
    tests::TestPreferencesStore preferences_;
    tests::TestWearable wearable_{journal_};
    tests::TestScreen screen_{journal_};
    std::shared_ptr<SyncDefaults> defaults_ = std::make_shared<SyncDefaults>(preferences_);
    std::shared_ptr<Library> library_ = std::make_shared<Library>(playlistCount);
};

} // namespace quorl::bench
