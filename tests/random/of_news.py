"""What holds of what panes and services tell one another. Each property tells what breaks it, and looks at a script as
long as all is traced."""

from typing import Iterator

from story import Moment, Trial
from world import PLAYLISTS, ROOT, Json

BEGIN = ("MPMediaLibrary", "beginGeneratingLibraryChangeNotifications")
END = ("MPMediaLibrary", "endGeneratingLibraryChangeNotifications")
POST = ("NSNotificationCenter", "postNotificationName:object:")


def a_change_of_preferences_is_told_once(trial: Trial) -> Iterator[str]:
    for moment in trial.traced:
        if moment.is_step or moment.did("batch"):
            continue  # a batch tells at its end what its steps have changed
        told = len(moment.entries(*POST, "LMSyncPreferencesDidChangeNotification"))
        changes = _changes(moment)
        if told != changes:
            yield f"{moment.command}: told {told} times, not {changes}"


def _changes(moment: Moment) -> int:
    """How often it has to be told that preferences have another value: for all that another process set, and for each
    that a pane did."""
    old, new = moment.before.stored(), moment.after.stored()
    changed = sum(old[name] != new[name] for name in old)
    if moment.did("prefs"):
        return int(changed > 0 and moment.command.get("notify", True))
    return changed


def who_is_seen_wants_to_hear_of_library_changes(trial: Trial) -> Iterator[str]:
    for moment in trial.traced:
        told = (len(moment.entries(*BEGIN)), len(moment.entries(*END)))
        wanted = _beginnings_and_ends(moment)
        if told != wanted:
            yield f"{moment.command}: {told} beginnings and ends, not {wanted}"


def _beginnings_and_ends(moment: Moment) -> tuple[int, int]:
    """How often panes that come begin, and panes that leave end, to want such notifications."""
    old, new = moment.before.stack, moment.after.stack
    listeners = (ROOT, PLAYLISTS)
    if moment.did("open"):
        return 1, 0
    if moment.did("appear", "disappear"):
        count = int(moment.after.top in listeners)
        return (count, 0) if moment.did("appear") else (0, count)
    if moment.did("tap", "send", "back") and len(old) != len(new):
        return int(new[-1] in listeners), int(old[-1] in listeners)
    return 0, 0


def a_library_change_is_told_while_anybody_wants_to_hear_of_it(trial: Trial) -> Iterator[str]:
    for moment in trial.traced:
        told = len(moment.entries(*POST, "MPMediaLibraryDidChangeNotification"))
        wanted = int(moment.did("library") and moment.command.get("notify", False) and moment.before.listeners > 0)
        if told != wanted:
            yield f"{moment.command}: told {told} times, with {moment.before.listeners} who want to hear"


def a_library_change_is_shown_at_once(trial: Trial) -> Iterator[str]:
    for moment in trial.traced:
        if moment.entries(*POST, "MPMediaLibraryDidChangeNotification"):
            refreshes = len(moment.entries("PSListController", "reloadSpecifier:")) / 2
            reloads = len(moment.entries("UITableView", "reloadData"))
            alive = moment.after.alive
            if (refreshes, reloads) != (alive[ROOT], alive[PLAYLISTS]):
                yield f"{moment.command}: {refreshes} refreshes and {reloads} reloads of {alive}"


def listed_sessions_are_joined_and_former_ones_left(trial: Trial) -> Iterator[str]:
    for moment in trial.traced:
        calls = [entry[1:] for entry in moment.entries("DVSession")]
        if not any(call[0] == "sessionsWithSessionTypeIdentifier:" for call in calls):
            continue
        left = [["removeObserver:", id_] for id_ in moment.before.joined]
        joined = [["addObserver:", id_] for id_ in moment.after.joined]
        wanted = [*left, ["sessionsWithSessionTypeIdentifier:", "DVSessionTypeDeviceSync"], *joined]
        if calls != wanted:
            yield f"{moment.command}: {calls}"


def a_report_of_a_session_is_one_post_or_none(trial: Trial) -> Iterator[str]:
    for moment in trial.traced:
        if moment.did("session") and not moment.is_step:
            times = 0 if moment.command["event"] == "session:didBeginSessionTask:" else moment.command["times"]
            posts = len(moment.entries(*POST, "LMQuorlSyncStatusDidChangeNotification"))
            if posts not in (0, times):
                yield f"{moment.command}: {posts} posts"


def the_stage_follows_the_running_tasks(trial: Trial) -> Iterator[str]:
    for moment in trial.traced:
        if moment.did("query") and moment.after.observed is not None:
            running = [task for session in moment.after.observed for task in session["tasks"] if task["running"]]
            stage, right = moment.reply["stage"], _stages(moment, running)
            if stage not in right:
                yield f"stage {stage}, not {right}"


def _stages(moment: Moment, running: list[Json]) -> list[int]:
    if running:
        assets = sum(task["total"] for task in running if task["group"] == "asset")
        return [3 if assets % 2**64 else 2]
    if moment.reply["assetSyncPlaylist"] is None:
        return [0]
    preferences = moment.after.preferences
    sent = preferences.get("lastFullySentAssetSyncPlaylistPersistentID")
    is_sent = sent == preferences.get("assetSyncPlaylistPersistentID")
    return [0, 1] if is_sent and preferences.get("lastFullySentAssetSyncPlaylistVersion") is not None else [1]


PROPERTIES = [
    a_change_of_preferences_is_told_once,
    who_is_seen_wants_to_hear_of_library_changes,
    a_library_change_is_told_while_anybody_wants_to_hear_of_it,
    a_library_change_is_shown_at_once,
    listed_sessions_are_joined_and_former_ones_left,
    a_report_of_a_session_is_one_post_or_none,
    the_stage_follows_the_running_tasks,
]
