#pragma once

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "services/preferences/SharedPreferences.h"
#include "tests/engine/Folders.h"
#include "tests/engine/Process.h"
#include "tests/engine/Recorder.h"

namespace quorl::syncd::testing {

/// The engine itself, its wearable, a music folder and the preferences, in the login session that
/// tests/session-run gives each test.
class EngineTest : public ::testing::Test {
  protected:
    EngineTest();

    /// Starts the engine, and waits until the recorder has heard of it.
    void start(const std::vector<std::string>& options = {});

    /// Ends the engine by this signal, and waits until the recorder has heard of it.
    int end(int signal = SIGTERM);

    /// Chooses a playlist of the music folder, as the app does.
    void choose(const std::string& title = "List");

    void limitTo(std::uint64_t amount, std::uint64_t type);

    template <class T>
    void set(const preferences::Preference<T>& preference, std::type_identity_t<T> value) {
        const auto result = preferences_->set(preference, value);
        ASSERT_EQ(result.problem, "");
    }

    template <class T>
    [[nodiscard]] T get(const preferences::Preference<T>& preference) const {
        return preferences_->get(preference);
    }

    [[nodiscard]] std::uint64_t idOf(const std::string& title) const;
    [[nodiscard]] std::uint64_t revisionOf(const std::string& title) const;

    /// Waits for the end of a session, and gives back that event.
    Event sessionEnd() { return recorder_.next(Event::Kind::SessionDidFinish); }

    /// Waits until everything is sent that this limit allows. Whoever writes several preferences
    /// for one choice may be slower than the engine waits, which then begins anew.
    void awaitSyncedWithin(std::uint64_t amount, std::uint64_t type) {
        recorder_.awaitState([=](const engine::EngineState& all) {
            return all.engine.syncState == engine::syncSynced && all.engine.limit == amount &&
                   all.engine.limitType == type;
        });
    }

    /// Waits for the next event of the task that carries the songs.
    Event nextOfAssets(Event::Kind kind);

    /// The files in the music directory of the embedded wearable.
    [[nodiscard]] Contents onWearable() const { return contentsOf(wearable_ / "Music"); }

    /// Songs that take some pieces to copy, in the playlist "List".
    void listLargeSongs();

    Music music_;
    std::filesystem::path wearable_;
    std::unique_ptr<preferences::SharedPreferences> preferences_;
    Recorder recorder_;
    std::unique_ptr<Process> engine_;
};

} // namespace quorl::syncd::testing
