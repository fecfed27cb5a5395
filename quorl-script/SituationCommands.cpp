// The commands that set what the pane finds: library, preferences, sessions, wearable, clock.

#include <algorithm>
#include <thread>
#include <unordered_map>

#include "quorl-script/Commands.h"

namespace quorl {

namespace {

constexpr NSUInteger otherMediaType = 1U << 1U;

NSUInteger mediaTypeOf(const Field& field) {
    static const std::unordered_map<std::string, NSUInteger> types{
        {"music", MPMediaTypeMusic},
        {"musicVideo", MPMediaTypeMusicVideo},
        {"other", otherMediaType}};
    const auto found = types.find(field.text());
    if (found == types.end()) {
        field.refuse("\"music\", \"musicVideo\" or \"other\"");
    }
    return found->second;
}

std::optional<std::uint64_t> figureOrNull(const Field& field) {
    return field.isGiven() ? std::optional(field.figure()) : std::nullopt;
}

std::optional<std::uint64_t> countOrNull(const Field& field) {
    return field.isGiven() ? std::optional(field.count()) : std::nullopt;
}

PlaylistDescription playlistOf(const Field& field) {
    PlaylistDescription playlist;
    playlist.id = field["id"].id();
    playlist.name = field["name"].textOrNull();
    playlist.revision = figureOrNull(field["revision"]);
    playlist.isFolder = field["folder"].booleanOr(false);
    playlist.isAugurMix = field["augurMix"].booleanOr(false);
    playlist.isAugurPlaylist = field["augurPlaylist"].booleanOr(false);
    playlist.isFresh = field["fresh"].booleanOr(false);
    if (const Field items = field["items"]; items.isGiven()) {
        for (const Field& size : items.elements()) {
            playlist.songSizes.push_back(countOrNull(size));
        }
    }
    return playlist;
}

JsonObject library(Stage& stage, const Field& command) {
    std::vector<PlaylistDescription> playlists;
    for (const Field& playlist : command["playlists"].elements()) {
        playlists.push_back(playlistOf(playlist));
    }
    NSUInteger mediaTypes = 0;
    for (const Field& type : command["media"].elements()) {
        mediaTypes |= mediaTypeOf(type);
    }
    const bool isAnnounced = command["notify"].booleanOr(false);

    LibraryDouble& library = stage.host.mediaLibrary();
    library.replace(playlists);
    library.setMediaTypes(mediaTypes);
    if (isAnnounced) {
        library.contentsDidChange();
    }
    return {};
}

using PreferenceReader = std::uint64_t (*)(const Field&);

/// A script gives an id as a text, as JSON's numbers are not long enough; a revision either way.
PreferenceReader readerOf(const SyncPreferenceDeclaration& declaration) {
    if (declaration.type == "b") {
        return [](const Field& it) { return std::uint64_t{it.boolean()}; };
    }
    if (declaration.name.ends_with("ID")) {
        return [](const Field& it) { return it.id(); };
    }
    if (declaration.name.ends_with("Version")) {
        return [](const Field& it) { return it.figure(); };
    }
    return [](const Field& it) { return it.count(std::numeric_limits<NSUInteger>::max()); };
}

const SyncPreferenceDeclaration& preferenceOf(const Field& field, std::string_view name) {
    const auto* const found =
        std::find_if(syncPreferences.begin(), syncPreferences.end(),
                     [name](const auto& declaration) { return declaration.name == name; });
    if (found == syncPreferences.end()) {
        throw CommandError("\"" + field.name() + "\" is no preference");
    }
    return *found;
}

JsonObject prefs(Stage& stage, const Field& command) {
    const Field set = command["set"];
    std::vector<std::pair<SyncPreference, std::optional<std::uint64_t>>> values;
    for (const Field& field : set.members()) {
        const auto& declaration = preferenceOf(field, field.name().substr(set.name().size() + 1));
        values.emplace_back(declaration.preference,
                            field.isGiven() ? std::optional(readerOf(declaration)(field))
                                            : std::nullopt);
    }
    const bool isAnnounced = command["notify"].booleanOr(true);

    bool hasChanged = false;
    PreferencesDouble& preferences = stage.host.preferences;
    for (const auto& [preference, value] : values) {
        const auto before = preferences.value(preference);
        (void)preferences.setValue(preference, value); // memory takes everything
        hasChanged = hasChanged || preferences.value(preference) != before;
    }
    if (hasChanged && isAnnounced) {
        SyncDefaults::announceChange();
    }
    return {};
}

TaskDescription taskOf(const Field& field) {
    constexpr auto largest = std::numeric_limits<NSUInteger>::max();
    TaskDescription task;
    task.id = field["id"].text();
    const std::string& group = field["group"].text();
    task.group = group == "asset" ? DVDeviceSyncSessionAssetTaskGroupingKey : group;
    task.figures.isRunning = field["running"].booleanOr(false);
    task.figures.total = static_cast<NSUInteger>(field["total"].countOr(0, largest));
    task.figures.completed = static_cast<NSUInteger>(field["completed"].countOr(0, largest));
    task.figures.progress = field["progress"].numberOr(0);
    return task;
}

SessionDescription sessionOf(const Field& field) {
    SessionDescription session;
    session.id = field["id"].text();
    session.isFinished = field["finished"].booleanOr(false);
    if (const Field tasks = field["tasks"]; tasks.isGiven()) {
        for (const Field& task : tasks.elements()) {
            session.tasks.push_back(taskOf(task));
        }
    }
    return session;
}

JsonObject sessions(Stage& stage, const Field& command) {
    std::vector<SessionDescription> descriptions;
    for (const Field& session : command["list"].elements()) {
        descriptions.push_back(sessionOf(session));
    }
    const bool isAnnounced = command["notify"].booleanOr(true);

    stage.host.sessionService.replace(descriptions);
    if (isAnnounced) {
        NSNotificationCenter::defaultCenter().postNotificationName_object(
            DVSessionsDidChangeNotification, nullptr);
    }
    return {};
}

/// How an observer is told of an event; `task` is null for the events of the session itself.
struct SessionEvent {
    bool isOfTask;
    void (*tell)(DVSessionObserver& observer, DVSession& session, DVSessionTask* task);
};

template <auto Method>
constexpr SessionEvent sessionEvent{false,
                                    [](DVSessionObserver& observer, DVSession& session,
                                       DVSessionTask* /*task*/) { (observer.*Method)(session); }};

template <auto Method>
constexpr SessionEvent taskEvent{true,
                                 [](DVSessionObserver& observer, DVSession& session,
                                    DVSessionTask* task) { (observer.*Method)(session, *task); }};

const SessionEvent& eventOf(const Field& field) {
    using Observer = DVSessionObserver;
    static const std::unordered_map<std::string, SessionEvent> events{
        {"sessionWillBegin:", sessionEvent<&Observer::sessionWillBegin>},
        {"sessionDidFinish:", sessionEvent<&Observer::sessionDidFinish>},
        {"session:willBeginSessionTask:", taskEvent<&Observer::session_willBeginSessionTask>},
        {"session:didBeginSessionTask:", taskEvent<&Observer::session_didBeginSessionTask>},
        {"session:didUpdateSessionTask:", taskEvent<&Observer::session_didUpdateSessionTask>},
        {"session:didFinishSessionTask:", taskEvent<&Observer::session_didFinishSessionTask>}};
    const auto found = events.find(field.text());
    if (found == events.end()) {
        field.refuse("the selector of a session observer's method");
    }
    return found->second;
}

bool isOnOtherThread(const Field& field) {
    const std::string thread = field.textOrNull().value_or("main");
    if (thread != "main" && thread != "other") {
        field.refuse("\"main\" or \"other\"");
    }
    return thread == "other";
}

std::shared_ptr<TaskDouble> taskOf(const SessionDouble& session, const Field& field) {
    auto task = session.task(field.text());
    if (!task) {
        field.refuse("the id of a task of the session");
    }
    return task;
}

JsonObject session(Stage& stage, const Field& command) {
    constexpr std::uint64_t mostTimes = 100'000;
    const auto session = stage.host.sessionService.find(command["id"].text());
    if (!session) {
        command["id"].refuse("the id of a session");
    }
    const SessionEvent& event = eventOf(command["event"]);
    const auto task = event.isOfTask ? taskOf(*session, command["task"]) : nullptr;
    const bool isElsewhere = isOnOtherThread(command["thread"]);
    const std::uint64_t times = command["times"].countOr(1, mostTimes);

    const auto tell = [&] {
        for (std::uint64_t time = 0; time < times; ++time) {
            session->tellObservers(
                [&](DVSessionObserver& observer) { event.tell(observer, *session, task.get()); });
        }
    };
    if (isElsewhere) {
        std::thread(tell).join();
    } else {
        tell();
    }
    return {};
}

UsageAnswer answerOf(const Field& reply) {
    UsageAnswer answer;
    if (!reply.isGiven()) {
        return answer;
    }
    if (reply.isText()) {
        answer.isHeld = reply.text() == "hold";
        if (!answer.isHeld) {
            reply.refuse("figures, null or \"hold\"");
        }
        return answer;
    }
    const auto figure = [&reply](const char* name) {
        const Field field = reply[name];
        return field.isGiven() ? std::optional(field.number()) : std::nullopt;
    };
    answer.figures = UsageFigures{figure("available"), figure("songs")};
    return answer;
}

VirtualTime::Nanoseconds durationOf(const Field& field) {
    const std::int64_t nanoseconds = field.seconds();
    if (nanoseconds < 0) {
        field.refuse("a number of seconds from 0 on");
    }
    return static_cast<VirtualTime::Nanoseconds>(nanoseconds);
}

JsonObject usage(Stage& stage, const Field& command) {
    UsageAnswer answer = answerOf(command["reply"]);
    const Field after = command["after"];
    answer.delay = after.isGiven() ? durationOf(after) : 0;

    stage.host.wearable.setAnswer(answer);
    return {};
}

std::shared_ptr<PSSpecifier> glanceRow(const std::string& title) {
    return PSSpecifier::preferenceSpecifierNamed_target_set_get_detail_cell_edit(
        title, nullptr, std::nullopt, std::nullopt, std::nullopt, PSCellType::LinkList,
        std::nullopt);
}

JsonObject glance(Stage& stage, const Field& command) {
    const auto title = command["row"].textOrNull();

    stage.host.glance = title ? glanceRow(*title) : nullptr;
    return {};
}

JsonObject strings(Stage& stage, const Field& command) {
    HostDouble::Texts texts;
    const Field table = command["table"];
    for (const Field& text : table.members()) {
        if (text.isGiven()) {
            texts.emplace(text.name().substr(table.name().size() + 1), text.text());
        }
    }
    stage.host.texts = std::move(texts);
    return {};
}

JsonObject language(Stage& stage, const Field& command) {
    const Field tag = command["tag"];
    if (tag.text().empty()) {
        tag.refuse("a language's tag, for instance \"de\"");
    }
    stage.host.setLanguages({tag.text()});
    return {};
}

/// What it says is enough: the field may have any name.
JsonObject sizes(Stage& stage, const Field& command) {
    std::string sizes = "raw";
    for (const Field& field : command.members()) {
        if (field.name() == "do" || !field.isGiven()) {
            continue;
        }
        sizes = field.text();
        if (sizes != "raw" && sizes != "platform") {
            field.refuse("\"raw\" or \"platform\"");
        }
    }
    stage.host.sizeTexts =
        sizes == "raw" ? HostDouble::SizeTexts::Raw : HostDouble::SizeTexts::Platform;
    return {};
}

CGFloat scaleOf(const Field& field) {
    const auto scale = static_cast<CGFloat>(field.number());
    if (!(scale > 0)) {
        field.refuse("a number above 0");
    }
    return scale;
}

JsonObject screen(Stage& stage, const Field& command) {
    constexpr std::uint64_t mostRows = 1'000'000;
    Looks looks = stage.host.screen().looks;
    looks.rows = static_cast<NSInteger>(
        command["rows"].countOr(static_cast<std::uint64_t>(looks.rows), mostRows));
    if (const Field scale = command["scale"]; scale.isGiven()) {
        looks.scale = scaleOf(scale);
    }
    if (const Field color = command["textColor"]; color.isPresent()) {
        looks.textColor = color.textOrNull();
    }
    looks.tintColor = command["tintColor"].textOrNull().value_or(looks.tintColor);

    stage.host.screen().looks = std::move(looks);
    return {};
}

JsonObject clock(Stage& stage, const Field& command) {
    const Field by = command["by"];
    const Field tick = command["tick"];
    const std::chrono::nanoseconds shift(by.isGiven() ? by.seconds() : 0);
    const std::chrono::nanoseconds everyReading(tick.isGiven() ? tick.seconds() : 0);

    stage.host.clock.moveBy(shift);
    if (tick.isGiven()) {
        stage.host.clock.setTick(everyReading);
    }
    return {};
}

JsonObject advance(Stage& /*stage*/, const Field& command) {
    const VirtualTime::Nanoseconds duration = durationOf(command["seconds"]);
    if (duration > VirtualTime::end - VirtualTime::shared().now()) {
        command["seconds"].refuse("no more than what 292 years of virtual time have left");
    }
    VirtualTime::shared().advance(duration);
    return {};
}

JsonObject application(Stage& /*stage*/, const Field& command) {
    const Field state = command["state"];
    if (state.text() != "background" && state.text() != "foreground") {
        state.refuse("\"background\" or \"foreground\"");
    }
    NSNotificationCenter::defaultCenter().postNotificationName_object(
        state.text() == "background" ? UIApplicationDidEnterBackgroundNotification
                                     : UIApplicationWillEnterForegroundNotification,
        nullptr);
    return {};
}

} // namespace

Command situationCommand(std::string_view name) {
    static const std::unordered_map<std::string_view, Command> commands{
        {"advance", advance},   {"application", application},
        {"clock", clock},       {"glance", glance},
        {"language", language}, {"library", library},
        {"prefs", prefs},       {"screen", screen},
        {"session", session},   {"sessions", sessions},
        {"sizes", sizes},       {"strings", strings},
        {"usage", usage}};
    const auto found = commands.find(name);
    return found == commands.end() ? nullptr : found->second;
}

} // namespace quorl
