"""What holds of what the panes do in the course of time: refreshes, registrations, ends, and what is written. Each
property tells what breaks it, and looks at a script as long as all is traced."""

from typing import Iterator

from story import Moment, Trial
from world import DELAY, LIMITS, PLAYLISTS, ROOT, Json

BEGIN = ("MPMediaLibrary", "beginGeneratingLibraryChangeNotifications")
END = ("MPMediaLibrary", "endGeneratingLibraryChangeNotifications")
POST = ("NSNotificationCenter", "postNotificationName:object:", "LMQuorlSyncStatusDidChangeNotification")
PRESETS = {1: [15, 50, 125, 250]}
MEGABYTES = [100, 500, 1024, 2048]


def a_root_pane_refreshes_once_in_the_delay(trial: Trial) -> Iterator[str]:
    arms = trial.traced[-1].after.arms if trial.traced else ()
    for first, arm in enumerate(arms):
        together = [other for other in arms[first:] if other.latest - arm.earliest < DELAY]
        panes = arm.alive + together[-1].made - arm.made if together else 1
        if len(together) > panes:
            yield f"{len(together)} refreshes of {panes} panes are armed within the delay from {arm.earliest} ns on"


def a_post_of_the_status_is_shown_after_the_delay(trial: Trial) -> Iterator[str]:
    for moment in trial.traced:
        if moment.is_step or not moment.reply["ok"]:
            continue
        pending = [arm for arm in moment.after.arms if arm.latest + DELAY > moment.after.now]
        if moment.entries(*POST) and not moment.did("advance") and len(pending) < moment.after.alive[ROOT]:
            yield f"{moment.command}: a pane heeds no post"
        if moment.did("advance"):
            yield from _wrong_refreshes(moment)


def _wrong_refreshes(moment: Moment) -> Iterator[str]:
    """Whether just those root panes refreshed in an advance that had promised it for then."""
    began, ended = moment.before.now, moment.after.now
    due = [arm for arm in moment.before.arms if arm.latest + DELAY > began and arm.earliest + DELAY <= ended]
    certain = all(arm.earliest + DELAY > began and arm.latest + DELAY <= ended for arm in due)
    gone = moment.after.roots_made - moment.after.alive[ROOT]
    certain = certain and all(arm.made - arm.alive == gone for arm in due)
    refreshes = len(moment.entries("PSListController", "reloadSpecifier:")) // 2
    if refreshes > len(due) or (certain and refreshes != len(due)):
        yield f"{moment.command}: {refreshes} refreshes, and {len(due)} were due"


def the_chooser_reloads_when_its_timer_is_due(trial: Trial) -> Iterator[str]:
    for moment in trial.traced:
        armed = moment.before.timer
        for entry in moment.entries("dispatch", "dispatch_source_set_timer"):
            if entry[2] != "forever" and armed is not None:
                yield f"{moment.command}: the timer is armed while it is armed"
            armed = None if entry[2] == "forever" else entry[2]
        if moment.did("advance") and not moment.is_step:
            is_due = moment.before.timer is not None and moment.before.timer <= moment.after.now
            if is_due != bool(moment.entries("UITableView", "reloadData")):
                yield f"{moment.command}: the timer is {'' if is_due else 'not '}due"


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


def a_closed_pane_is_gone_or_waits_for_the_wearable(trial: Trial) -> Iterator[str]:
    for moment in trial.traced:
        world = moment.after
        if moment.is_step:
            continue
        for pane in (PLAYLISTS, LIMITS):
            if world.alive[pane] != world.stack.count(pane):
                yield f"{moment.command}: {world.alive[pane]} of {pane} are alive"
        closed = world.alive[ROOT] - world.stack.count(ROOT)
        if not 0 <= closed <= world.pending_answers:
            yield f"{moment.command}: {closed} closed root panes are alive, {world.pending_answers} answers are owed"


def who_is_gone_listens_no_more(trial: Trial) -> Iterator[str]:
    left = {ROOT: 0, PLAYLISTS: 0}
    timers = 0
    for moment in trial.traced:
        for entry in moment.entries():
            match entry:
                case ["NSNotificationCenter", "removeObserver:", pane] if pane in left:
                    left[pane] += 1
                case ["dispatch", "dispatch_source_create"]:
                    timers += 1
                case ["dispatch", "dispatch_source_cancel"]:
                    timers -= 1
                case ["dealloc", pane] if pane in left:
                    left[pane] -= 1
        if any(left.values()):
            yield f"{moment.command}: {left}"
        if timers > moment.after.alive[PLAYLISTS]:
            yield f"{moment.command}: a timer outlives its chooser"


def only_a_tap_writes_preferences(trial: Trial) -> Iterator[str]:
    for moment in trial.traced:
        written = [entry[1:] for entry in moment.entries("LMSyncDefaults")]
        is_choice = moment.did("tap") and "path" in moment.command
        if is_choice != bool(written) or (is_choice and not _is_choice(moment, written)):
            yield f"{moment.command}: {written}"


def _is_choice(moment: Moment, written: list) -> bool:
    section, row = moment.command["path"]
    match written:
        case [["setAssetSyncEnabled:", False]]:
            return moment.after.top == PLAYLISTS and section == 1
        case [["setAssetSyncEnabled:", True], ["setAssetSyncPlaylistPersistentID:", id_]]:
            known = any(playlist["id"] == id_ for playlist in moment.after.described)
            return moment.after.top == PLAYLISTS and section == 0 and known
        case [["setAssetSyncLimit:", limit], ["setAssetSyncLimitType:", kind]]:
            right = kind == row if section == 0 else limit == PRESETS.get(kind, MEGABYTES)[row]
            return moment.after.top == LIMITS and right
    return False


def listed_sessions_are_joined_and_former_ones_left(trial: Trial) -> Iterator[str]:
    for moment in trial.traced:
        calls = [entry[1:] for entry in moment.entries("DVSession")]
        if not any(call[0] == "sessionsWithSessionTypeIdentifier:" for call in calls) or not _is_plain_fetch(moment):
            continue
        left = [["removeObserver:", id_] for id_ in moment.before.joined]
        joined = [["addObserver:", id_] for id_ in moment.after.joined]
        wanted = [*left, ["sessionsWithSessionTypeIdentifier:", "DVSessionTypeDeviceSync"], *joined]
        if calls != wanted:
            yield f"{moment.command}: {calls}"


def _is_plain_fetch(moment: Moment) -> bool:
    return moment.did("sessions", "create", "open", "query")


def a_report_of_a_session_is_one_post_or_none(trial: Trial) -> Iterator[str]:
    for moment in trial.traced:
        if moment.did("session") and not moment.is_step:
            times = 0 if moment.command["event"] == "session:didBeginSessionTask:" else moment.command["times"]
            if len(moment.entries(*POST)) not in (0, times):
                yield f"{moment.command}: {len(moment.entries(*POST))} posts"


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
    a_root_pane_refreshes_once_in_the_delay,
    a_post_of_the_status_is_shown_after_the_delay,
    the_chooser_reloads_when_its_timer_is_due,
    who_is_seen_wants_to_hear_of_library_changes,
    a_closed_pane_is_gone_or_waits_for_the_wearable,
    who_is_gone_listens_no_more,
    only_a_tap_writes_preferences,
    listed_sessions_are_joined_and_former_ones_left,
    a_report_of_a_session_is_one_post_or_none,
    the_stage_follows_the_running_tasks,
]
