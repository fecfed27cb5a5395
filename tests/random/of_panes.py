"""What holds of what a person sees, whatever has happened. Each property tells what breaks it, and looks at a script as
long as all is traced."""

import re
from typing import Iterator

from story import Moment, Trial
from texts import size_text, songs_that_fit, status_beside
from world import LIMITS, PLAYLISTS, ROOT, Json

CHECKMARK = 3
FOOTER = ["PSSpecifier", "setProperty:forKey:", "Music Storage"]
SONGS = [15, 50, 125, 250]
MEGABYTES = [100, 500, 1024, 2048]

COUNTED = re.compile(r"(?:\b([\d,]+) songs? .*)?tak(?:e|ing) up (\d+ B)")
REMAINING = re.compile(r"with (.+) remaining\.$")


def the_checked_row_is_the_synced_playlist(trial: Trial) -> Iterator[str]:
    for shown, asked in _fresh_choosers(trial):
        synced, is_on = asked.reply["assetSyncPlaylist"], asked.after.is_on
        for section, row, cell in _cells(shown, PLAYLISTS):
            is_chosen = not is_on if section == 1 else _id_of(shown, row) == synced
            if (cell["accessory"] == CHECKMARK) != is_chosen:
                yield f"{cell}, while {synced} is synced"


def the_rows_of_the_chooser_are_the_ordinary_playlists(trial: Trial) -> Iterator[str]:
    for shown, _ in _fresh_choosers(trial):
        names = [playlist["name"] for playlist in shown.after.ordinary_playlists()]
        cells = [(row, cell) for section, row, cell in _cells(shown, PLAYLISTS) if section == 0]
        if any(row >= len(names) or cell["title"] != names[row] for row, cell in cells):
            yield f"{cells}, while the playlists are {names}"


def the_status_beside_a_playlist_is_that_of_the_sync(trial: Trial) -> Iterator[str]:
    for shown, asked in _fresh_choosers(trial):
        if not shown.after.is_plain:
            return
        right = status_beside(asked.reply["stage"], asked.reply["progress"])
        for section, _, cell in _cells(shown, PLAYLISTS):
            allowed = [right, "Sync Pending…"] if cell["accessory"] == CHECKMARK and section == 0 else [None]
            if cell["detail"] not in allowed:
                yield f"{cell}, while it is {right}"


def a_tapped_row_alone_is_checked(trial: Trial) -> Iterator[str]:
    for tapped, shown in zip(trial.traced, trial.traced[1:]):
        if not _is_plain_tap(tapped) or not shown.did("snapshot") or shown.is_step:
            continue
        section, row = tapped.command["path"]
        pane = tapped.before.top
        checked = [(s, r) for s, r, cell in _cells(shown, pane) if cell["accessory"] == CHECKMARK]
        if pane == LIMITS:
            checked = [place for place in checked if place[0] == section]
        if checked != [(section, row)]:
            yield f"{tapped.command}: {checked} are checked"


def the_playlist_row_says_how_it_stands(trial: Trial) -> Iterator[str]:
    for moment, shown, asked in zip(trial.traced, trial.traced[1:], trial.traced[2:]):
        if not _is_refresh(moment, shown) or not asked.did("query") or not shown.after.is_plain:
            continue
        synced, stage = asked.reply["assetSyncPlaylist"], asked.reply["stage"]
        names = [playlist["name"] for playlist in shown.after.described if playlist["id"] == synced]
        if not shown.after.has_music or synced is None:
            names = ["None"]
        elif stage:
            names = ["Sync Pending…" if stage == 1 else "Syncing…"]
        for row in _rows(shown)[-3:-2]:
            if row["value"] not in names:
                yield f"{row}, not {names}"


def the_limit_row_says_the_limit(trial: Trial) -> Iterator[str]:
    for moment, shown in zip(trial.traced, trial.traced[1:]):
        if not _is_refresh(moment, shown) or not shown.after.is_plain:
            continue
        limit, is_songs = shown.after.limit, shown.after.limit_type == 1
        right = f"{limit:,} Songs" if is_songs else size_text((limit << 20) % 2**64)
        for row in _rows(shown)[-1:]:
            if row["value"] != right:
                yield f"{row}, not {right}"


def the_footer_counts_the_first_songs_that_fit(trial: Trial) -> Iterator[str]:
    for moment, text in _footers(trial):
        counted = COUNTED.search(text)
        world = moment.after
        playlists = [it for it in world.described if it["id"] == world.preferences.get("assetSyncPlaylistPersistentID")]
        right = [songs_that_fit(it["items"], world.limit_type, world.limit) for it in playlists]
        if counted and not any(counted[1] in (None, f"{songs:,}") and counted[2] == size for songs, size in right):
            yield f"{text}, not {right}"


def the_wearable_has_told_what_remains(trial: Trial) -> Iterator[str]:
    for moment, text in _footers(trial):
        remaining = REMAINING.search(text)
        sums = [(it.get("available") or 0.0) + (it.get("songs") or 0.0) for it in moment.after.figures]
        told = ["?", *(size_text(min(int(max(sum_, 0)), 2**64 - 1)) for sum_ in sums)]
        if remaining and remaining[1] not in told[0 if sums else 1 :]:
            yield f"{text}, but the wearable told {told}"


def the_root_pane_keeps_its_rows(trial: Trial) -> Iterator[str]:
    for moment in trial.traced:
        kinds = [row["cell"] for row in _rows(moment)]
        if kinds not in ([], [0, 2, 0, 2], [2, 0, 2, 0, 2]):
            yield f"{kinds}"


def a_table_shows_what_fits_on_the_screen(trial: Trial) -> Iterator[str]:
    for moment in trial.traced:
        if moment.is_step or not moment.did("snapshot"):
            continue
        for pane in moment.reply["stack"]:
            lengths = [section["rows"] for section in pane.get("sections", ())]
            places = [(s, r) for s, section in enumerate(pane.get("sections", ())) for r in _numbers(section)]
            every = [(section, row) for section, length in enumerate(lengths) for row in range(length)]
            first = every.index(places[0]) if places and places[0] in every else 0
            if len(places) > moment.after.rows or places != every[first : first + len(places)]:
                yield f"{places} of {every} on a screen of {moment.after.rows} rows"


def the_stack_is_as_the_commands_left_it(trial: Trial) -> Iterator[str]:
    for moment in trial.traced:
        if moment.did("snapshot"):
            stack = tuple(pane["class"] for pane in moment.reply["stack"])
            if stack != moment.after.stack:
                yield f"{stack}, not {moment.after.stack}"


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
            right = kind == row if section == 0 else limit == (SONGS if kind == 1 else MEGABYTES)[row]
            return moment.after.top == LIMITS and right
    return False


def who_does_not_know_the_space_asks_for_it(trial: Trial) -> Iterator[str]:
    for moment in trial.traced:
        if moment.after.ticks or not moment.after.is_plain:
            return
        for text, is_asked in _refreshed_footers(moment.entries()):
            if COUNTED.search(text or "") and bool(REMAINING.search(text)) == is_asked:
                yield f"{text} And the wearable was {'' if is_asked else 'not '}asked"


def _refreshed_footers(entries: list[list]) -> Iterator[tuple[str, bool]]:
    """What the footer said after it was cleared, as a refresh begins, and whether the wearable was asked for more."""
    is_cleared = False
    for place, entry in enumerate(entries):
        if entry[:3] != FOOTER:
            continue
        if is_cleared:
            yield entry[3], entries[place + 2 : place + 3] == [["LSSManager", "getUsage:"]]
        is_cleared = entry[3] is None


def _numbers(section: Json) -> list[int]:
    return [cell["row"] for cell in section["cells"]]


def _fresh_choosers(trial: Trial) -> Iterator[tuple[Moment, Moment]]:
    """Looks at a playlist chooser that has just been drawn anew, and at what is synced."""
    for drawn, shown, asked in zip(trial.traced, trial.traced[1:], trial.traced[2:]):
        is_drawn = drawn.did("send") and drawn.command["selector"] == "willBecomeActive" and not drawn.is_step
        if is_drawn and drawn.after.top == PLAYLISTS and shown.did("snapshot") and asked.did("query"):
            yield shown, asked


def _cells(shown: Moment, pane: str) -> list[tuple[int, int, Json]]:
    """The cells on the screen, where this pane is the top one."""
    top = shown.reply["stack"][-1:]
    sections = top[0].get("sections", ()) if top and top[0]["class"] == pane else ()
    return [(number, cell["row"], cell) for number, section in enumerate(sections) for cell in section["cells"]]


def _id_of(shown: Moment, row: int) -> str | None:
    playlists = shown.after.ordinary_playlists()
    return playlists[row]["id"] if row < len(playlists) else None


def _rows(shown: Moment) -> list[Json]:
    """The rows of the root pane, where it is shown."""
    return shown.reply["stack"][0].get("specifiers", []) if shown.did("snapshot") and shown.reply["stack"] else []


def _is_refresh(moment: Moment, shown: Moment) -> bool:
    """Whether the only root pane was refreshed, and is looked at before anything else happens."""
    return (
        shown.did("snapshot") and not shown.is_step and moment.after.alive[ROOT] == 1
        and bool(moment.entries("PSListController", "reloadSpecifier:"))
    )


def _is_plain_tap(moment: Moment) -> bool:
    """Whether a row of a table was tapped, and nothing was loaded anew for another reason."""
    return (
        moment.did("tap") and "path" in moment.command and not moment.is_step
        and not moment.entries("UITableView", "reloadData")
    )


def _footers(trial: Trial) -> Iterator[tuple[Moment, str]]:
    """What the footer was set to, as far as it is in plain English."""
    for moment in trial.traced:
        for entry in moment.entries(*FOOTER):
            if entry[3] is not None and moment.after.is_plain:
                yield moment, entry[3]


PROPERTIES = [
    the_checked_row_is_the_synced_playlist,
    the_rows_of_the_chooser_are_the_ordinary_playlists,
    the_status_beside_a_playlist_is_that_of_the_sync,
    a_tapped_row_alone_is_checked,
    the_playlist_row_says_how_it_stands,
    the_limit_row_says_the_limit,
    the_footer_counts_the_first_songs_that_fit,
    the_wearable_has_told_what_remains,
    the_root_pane_keeps_its_rows,
    a_table_shows_what_fits_on_the_screen,
    the_stack_is_as_the_commands_left_it,
    only_a_tap_writes_preferences,
    who_does_not_know_the_space_asks_for_it,
]
