#pragma once

#include <cstdint>
#include <map>
#include <string>
#include <vector>

#include <sdbus-c++/sdbus-c++.h>

#include "services/engine/Fraction.h"

/// What a sync engine tells about itself, as plain values.
namespace quorl::engine {

/// A piece of a session's work.
struct TaskState {
    /// Tells it from all others for as long as the engine runs.
    std::string path = {};
    /// The path of its session.
    sdbus::ObjectPath session = {};
    std::string groupingKey = {};
    bool isRunning = false;
    /// Songs of the choice; 0 as long as that is not known.
    std::uint64_t totalItemCount = 0;
    std::uint64_t completedItemCount = 0;
    Fraction progress = {};

    bool operator==(const TaskState&) const = default;
};

/// One run of the engine.
struct SessionState {
    /// Tells it from all others for as long as the engine runs.
    std::string path = {};
    std::string typeIdentifier = {};
    bool isFinished = false;
    /// What kind of job it is, for programs that show jobs of any kind.
    std::string operation = {};
    /// The song that is being copied: its path in the music folder; empty for none.
    std::string currentItem = {};
    Fraction progress = {};
    /// False as long as it is not known how much there is to copy.
    bool isProgressValid = false;
    /// Of the choice, on the wearable or not; 0 as long as that is not known.
    std::uint64_t bytes = 0;
    /// Bytes a second that this session has copied, on average; 0 as long as nothing was copied.
    std::uint64_t rate = 0;
    /// Microseconds since 1970.
    std::uint64_t startTime = 0;
    bool isCancelable = false;
    /// In the order in which they were announced.
    std::vector<TaskState> tasks = {};

    bool operator==(const SessionState&) const = default;
};

/// The wearable that the engine syncs to. Byte counts are as last looked at.
struct WearableStatus {
    std::string directory = {};
    std::string name = {};
    bool isEmbedded = false;
    bool isConnected = false;
    bool isOnCharger = false;
    std::uint64_t capacity = 0;
    std::uint64_t available = 0;
    std::uint64_t songs = 0;
    std::uint64_t songCount = 0;

    bool operator==(const WearableStatus&) const = default;
};

/// An entry of a playlist, or the path of a song, and the code of why it is left out.
using LeftOutItem = sdbus::Struct<std::string, std::string>;

/// The engine itself.
struct EngineStatus {
    std::string musicFolder = {};
    /// Bytes a second; 0 for no limit.
    std::uint64_t rateLimit = 0;
    /// A sentence for the user: what the engine does, or what it waits for.
    std::string status = {};
    /// The same as a `Message`; no code where the engine has but the sentence.
    std::string statusCode = {};
    std::vector<std::string> statusArguments = {};
    /// How far the chosen playlist has come, as one of the words of Names.h.
    std::string syncState = {};
    /// The chosen playlist, by the name that is shown; empty for none.
    std::string playlistName = {};
    /// What the engine goes by. 0: sync is switched off, or no playlist is chosen.
    std::uint64_t playlistID = 0;
    std::uint64_t limitType = 0;
    std::uint64_t limit = 0;
    /// What became of the last session with this wearable; no text before the first.
    bool lastSuccess = false;
    std::string lastMessage = {};
    /// The same as a `Message`; no code where the engine has but the sentence.
    std::string lastCode = {};
    std::vector<std::string> lastArguments = {};
    /// Microseconds since 1970.
    std::uint64_t lastTime = 0;
    /// Of the last session with this wearable that got everything done; 0 for none.
    std::uint64_t lastComplete = 0;
    /// What the chosen playlist names and is not on its way to the wearable: some of it, and how
    /// much there is.
    std::vector<LeftOutItem> leftOut = {};
    std::uint64_t leftOutCount = 0;
    /// Songs of the chosen playlist that the limit leaves out.
    std::uint64_t beyondLimit = 0;

    bool operator==(const EngineStatus&) const = default;
};

/// Everything, at one moment.
struct EngineState {
    /// False: there is no engine, and everything below is empty.
    bool isThere = false;
    EngineStatus engine = {};
    WearableStatus wearable = {};
    /// In the order in which they began.
    std::vector<SessionState> sessions = {};

    bool operator==(const EngineState&) const = default;
};

using Properties = std::map<std::string, sdbus::Variant>;

} // namespace quorl::engine
