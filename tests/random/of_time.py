"""What holds of what the panes do in the course of time: when they refresh, and when they end. Each property tells what
breaks it, and looks at a script as long as all is traced."""

from typing import Iterator

from story import Moment, Trial
from world import DELAY, LIMITS, PLAYLISTS, ROOT

POST = ("NSNotificationCenter", "postNotificationName:object:", "LMQuorlSyncStatusDidChangeNotification")


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


PROPERTIES = [
    a_root_pane_refreshes_once_in_the_delay,
    a_post_of_the_status_is_shown_after_the_delay,
    the_chooser_reloads_when_its_timer_is_due,
    a_closed_pane_is_gone_or_waits_for_the_wearable,
    who_is_gone_listens_no_more,
]
