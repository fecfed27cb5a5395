"""Breaks each property on purpose, by replies that are falsified: a property that cannot fail is noticed here."""

import dataclasses
import json
import os
import pathlib
import random
import re
import subprocess
import sys
import tempfile
import unittest
from typing import Any, Callable

import of_news
import of_panes
import of_replies
import of_time
from properties import PROPERTIES, Property, broken_by
from shorten import shorten
from situations import WRONG, script
from story import Trial, attempt

FOLDER = pathlib.Path(__file__).resolve().parent
HOST = FOLDER.parents[1] / "quorl-script"
PROGRAM = os.environ["QUORL_SCRIPT"]

QUIET = '{"id":"7","name":"Quiet","revision":1,"items":[100,200]}'
LOUD = '{"id":"8","name":"Loud","revision":1,"items":[40]}'
TASK = '{"id":"t","group":"asset","running":true,"total":4,"completed":1,"progress":0.25}'

#: Has an occasion for every property.
TALE = """
{"do":"library","media":["music"],"playlists":[QUIET,LOUD]}
{"do":"prefs","set":{"assetSyncEnabled":true,"assetSyncPlaylistPersistentID":"7","assetSyncLimit":100}}
{"do":"prefs","set":{"lastFullySentAssetSyncPlaylistPersistentID":"7","lastFullySentAssetSyncPlaylistVersion":1}}
{"do":"usage","reply":{"available":1000,"songs":500}}
{"do":"open"}
{"do":"snapshot"}
{"do":"query"}
{"do":"advance","seconds":1.5}
{"do":"tap","specifier":"Synced Playlist"}
{"do":"send","selector":"willBecomeActive"}
{"do":"snapshot"}
{"do":"query"}
{"do":"tap","path":[0,1]}
{"do":"snapshot"}
{"do":"library","media":["music"],"playlists":[QUIET,LOUD],"notify":true}
{"do":"sessions","list":[{"id":"s","tasks":[TASK]}]}
{"do":"session","id":"s","event":"sessionDidFinish:","times":2}
{"do":"query"}
{"do":"advance","seconds":1.5}
{"do":"back"}
{"do":"usage","reply":"hold"}
{"do":"clock","by":481}
{"do":"tap","specifier":"Playlist Limit"}
{"do":"tap","path":[1,1]}
{"do":"snapshot"}
{"do":"back"}
{"do":"disappear"}
{"do":"release"}
{"do":"usage","reply":{"available":7,"songs":0}}
nonsense
{"do":"trace","classes":["dispatch"]}
{"do":"open"}
""".strip().replace("QUIET", QUIET).replace("LOUD", LOUD).replace("TASK", TASK).split("\n")

#: A program that carries out whatever it is told.
AGREEABLE = """#!{python}
import sys
for line in sys.stdin:
    print('{{"ok":true,"trace":[]}}', flush=True)
"""

Replies = list[dict[str, Any]]


def falsified(trial: Trial, falsify: Callable[[Replies], None]) -> Trial:
    """The trial as if other replies had come."""
    replies = [json.loads(reply) for reply in trial.whole.replies]
    falsify(replies)
    output = "".join(json.dumps(reply) + "\n" for reply in replies).encode()
    return dataclasses.replace(trial, whole=trial.whole._replace(output=output))


def number_of(line: str, occurrence: int = 0) -> int:
    """Where a line of the tale is whose command begins so."""
    return [number for number, each in enumerate(TALE) if each.startswith('{"do":"' + line)][occurrence]


def entry(replies: Replies, number: int, *beginning: Any) -> list:
    """The first entry of a reply's trace that begins so."""
    return next(each for each in replies[number]["trace"] if each[: len(beginning)] == list(beginning))


def add(line: str, *made_up: list, occurrence: int = 0) -> Callable[[Replies], None]:
    """Adds entries to the trace of a line."""
    return lambda replies: replies[number_of(line, occurrence)]["trace"].extend(map(list, made_up))


def drop(line: str, *beginning: Any, occurrence: int = 0) -> Callable[[Replies], None]:
    """Takes an entry from the trace of a line."""
    number = number_of(line, occurrence)
    return lambda replies: replies[number]["trace"].remove(entry(replies, number, *beginning))


def alter(line: str, beginning: tuple, place: int, value: Any, occurrence: int = 0) -> Callable[[Replies], None]:
    """Puts another value into an entry of a line's trace."""
    number = number_of(line, occurrence)
    return lambda replies: entry(replies, number, *beginning).__setitem__(place, value)


def answer(line: str, value: Any, *path: Any, occurrence: int = 0) -> Callable[[Replies], None]:
    """Puts another value into the reply to a line, at a place that `path` leads to."""

    def falsify(replies: Replies) -> None:
        place: Any = replies[number_of(line, occurrence)]
        for step in path[:-1]:
            place = place[step]
        place[path[-1]] = value

    return falsify


CELL = ("stack", 1, "sections", 0, "cells", 0)
ROW = ("stack", 0, "specifiers")
SAYS = ("PSSpecifier", "setProperty:forKey:", "Music Storage", "2 songs synced to Velora, taking up 300 B.")
LIBRARY = "MPMediaLibrary"
POST = ("NSNotificationCenter", "postNotificationName:object:")

#: What breaks each of the properties that look at one playing of a script.
FALSE_REPLIES: dict[Property, list[Callable[[Replies], None]]] = {
    of_replies.each_line_has_the_reply_that_it_asks_for: [
        lambda replies: replies.pop(),
        lambda replies: replies[number_of("query")].pop("progress"),
        answer("open", "more", "error"),
    ],
    of_replies.a_wrong_line_is_refused_by_the_name_of_its_field: [
        lambda replies: replies[TALE.index("nonsense")].update(error="no"),
        lambda replies: replies[TALE.index("nonsense")].update(ok=True, trace=[]),
    ],
    of_replies.only_what_was_chosen_is_traced: [add("open", ["UITableView", "reloadData"], occurrence=1)],
    of_replies.what_is_not_the_panes_business_calls_nothing: [add("snapshot", ["UITableView", "reloadData"])],
    of_panes.the_checked_row_is_the_synced_playlist: [
        answer("snapshot", 0, *CELL, "accessory", occurrence=1),
        answer("snapshot", 3, "stack", 1, "sections", 1, "cells", 0, "accessory", occurrence=1),
    ],
    of_panes.the_rows_of_the_chooser_are_the_ordinary_playlists: [
        answer("snapshot", "Loud", *CELL, "title", occurrence=1),
    ],
    of_panes.the_status_beside_a_playlist_is_that_of_the_sync: [
        answer("snapshot", "Syncing…", *CELL, "detail", occurrence=1), answer("query", 1, "stage", occurrence=1),
    ],
    of_panes.a_tapped_row_alone_is_checked: [
        answer("snapshot", 3, *CELL, "accessory", occurrence=2),
        answer("snapshot", 3, "stack", 1, "sections", 1, "cells", 0, "accessory", occurrence=3),
    ],
    of_panes.the_playlist_row_says_how_it_stands: [answer("snapshot", "Loud", *ROW, 1, "value")],
    of_panes.the_limit_row_says_the_limit: [answer("snapshot", "100 B", *ROW, 3, "value")],
    of_panes.the_footer_counts_the_first_songs_that_fit: [
        alter("open", SAYS, 3, "3 songs synced to Velora, taking up 300 B."),
        alter("open", SAYS, 3, "2 songs synced to Velora, taking up 301 B."),
    ],
    of_panes.the_wearable_has_told_what_remains: [
        alter("open", SAYS, 3, "2 songs synced to Velora, taking up 300 B with 1 B remaining."),
    ],
    of_panes.the_root_pane_keeps_its_rows: [answer("snapshot", 1, *ROW, 0, "cell")],
    of_panes.a_table_shows_what_fits_on_the_screen: [answer("snapshot", 5, *CELL, "row", occurrence=1)],
    of_panes.the_stack_is_as_the_commands_left_it: [answer("snapshot", "Other", "stack", 0, "class")],
    of_time.a_root_pane_refreshes_once_in_the_delay: [add("open", ["dispatch", "dispatch_after", 1500000000])],
    of_time.a_post_of_the_status_is_shown_after_the_delay: [
        drop("open", "dispatch", "dispatch_after"),
        drop("advance", "PSListController", "reloadSpecifier:", "Playlist Limit"),
        add("advance", *[["PSListController", "reloadSpecifier:", "Playlist Limit"]] * 2),
    ],
    of_time.the_chooser_reloads_when_its_timer_is_due: [
        add("sessions", ["dispatch", "dispatch_source_set_timer", 1500000000, "forever", 150000000]),
        drop("advance", "UITableView", "reloadData", occurrence=1),
        add("advance", ["UITableView", "reloadData"]),
    ],
    of_panes.who_does_not_know_the_space_asks_for_it: [
        drop("open", "LSSManager", "getUsage:"),
        alter("open", SAYS, 3, "2 songs synced to Velora, taking up 300 B with 1500 B remaining."),
    ],
    of_news.a_change_of_preferences_is_told_once: [
        drop("prefs", *POST, "LMSyncPreferencesDidChangeNotification"),
        drop("tap", *POST, "LMSyncPreferencesDidChangeNotification", occurrence=1),
        add("query", [*POST, "LMSyncPreferencesDidChangeNotification", None]),
    ],
    of_news.a_library_change_is_told_while_anybody_wants_to_hear_of_it: [
        drop("library", *POST, "MPMediaLibraryDidChangeNotification", occurrence=1),
        add("query", [*POST, "MPMediaLibraryDidChangeNotification", "MPMediaLibrary"]),
    ],
    of_news.a_library_change_is_shown_at_once: [
        drop("library", "UITableView", "reloadData", occurrence=1),
        drop("library", "PSListController", "reloadSpecifier:", "Playlist Limit", occurrence=1),
    ],
    of_news.who_is_seen_wants_to_hear_of_library_changes: [
        drop("open", LIBRARY, "beginGeneratingLibraryChangeNotifications"),
        drop("back", LIBRARY, "endGeneratingLibraryChangeNotifications"),
        add("query", [LIBRARY, "endGeneratingLibraryChangeNotifications"]),
    ],
    of_time.a_closed_pane_is_gone_or_waits_for_the_wearable: [
        drop("usage", "dealloc", "LMQuorlSettingsController", occurrence=2),
        drop("back", "dealloc", "LMQuorlPlaylistChooser"),
        drop("back", "dealloc", "LMQuorlLimitChooser", occurrence=1),
    ],
    of_time.who_is_gone_listens_no_more: [
        drop("back", "NSNotificationCenter", "removeObserver:", "LMQuorlPlaylistChooser"),
        drop("back", "dispatch", "dispatch_source_cancel"),
    ],
    of_panes.only_a_tap_writes_preferences: [
        add("query", ["LMSyncDefaults", "setAssetSyncEnabled:", False]),
        drop("tap", "LMSyncDefaults", "setAssetSyncEnabled:", occurrence=1),
        alter("tap", ("LMSyncDefaults", "setAssetSyncLimit:"), 2, 1024, occurrence=3),
    ],
    of_news.listed_sessions_are_joined_and_former_ones_left: [drop("sessions", "DVSession", "addObserver:", "s")],
    of_news.a_report_of_a_session_is_one_post_or_none: [
        add('session"', [*POST, "LMQuorlSyncStatusDidChangeNotification", "LMQuorlSyncManager"]),
    ],
    of_news.the_stage_follows_the_running_tasks: [
        answer("query", 2, "stage", occurrence=2), answer("query", 3, "stage"),
    ],
}


def played(name: str, **changes: Any) -> Callable[[Trial], Trial]:
    """Another outcome of one of the playings."""
    return lambda trial: dataclasses.replace(trial, **{name: getattr(trial, name)._replace(**changes)})


def put_out(name: str, old: bytes, new: bytes) -> Callable[[Trial], Trial]:
    """Other words in the output of one of the playings."""
    return lambda trial: played(name, output=getattr(trial, name).output.replace(old, new))(trial)


#: What breaks each of the properties that compare playings.
FALSE_PLAYINGS: dict[Property, list[Callable[[Trial], Trial]]] = {
    of_replies.nothing_is_written_to_standard_error: [played("whole", errors=b"!"), played("lean", errors=b"!")],
    of_replies.the_exit_status_tells_whether_a_command_failed: [
        played("pieces", status=0), played("whole", status=None),
    ],
    of_replies.the_same_script_gives_the_same_bytes: [
        put_out("pieces", b"Quiet", b"Queer"), put_out("pieces", b"}\n", b"}"),
    ],
    of_replies.no_reply_waits_for_what_comes_later: [played("early", output=b""), put_out("early", b"true", b"none")],
    of_replies.what_is_refused_or_only_looks_changes_nothing: [put_out("lean", b"addObserver", b"addWatcher")],
}


class EachProperty(unittest.TestCase):
    @classmethod
    def setUpClass(cls):
        cls.trial = attempt(PROGRAM, TALE)

    def test_holds_in_the_tale(self):
        self.assertIsNone(broken_by(self.trial))

    def test_is_broken_here_on_purpose(self):
        self.assertEqual(set(PROPERTIES), FALSE_REPLIES.keys() | FALSE_PLAYINGS.keys())

    def test_is_broken_by_false_replies(self):
        for each, ways in FALSE_REPLIES.items():
            for number, way in enumerate(ways):
                with self.subTest(each.__name__, way=number):
                    self.assertTrue(list(each(falsified(self.trial, way))))

    def test_is_broken_by_false_playings(self):
        for each, ways in FALSE_PLAYINGS.items():
            for number, way in enumerate(ways):
                with self.subTest(each.__name__, way=number):
                    self.assertTrue(list(each(way(self.trial))))


class Situations(unittest.TestCase):
    def test_hang_on_the_seed_alone(self):
        self.assertEqual(script(random.Random("a"), 3), script(random.Random("a"), 3))
        self.assertNotEqual(script(random.Random("a"), 3), script(random.Random("b"), 3))

    def test_have_every_command_and_every_wrong_line(self):
        lines = script(random.Random("all"), 3000)
        names = {json.loads(line)["do"] for line in lines if line not in WRONG}

        sources = "".join(file.read_text(encoding="utf-8") for file in HOST.glob("*Commands.cpp"))
        known = {name for name, function in re.findall(r'\{"(\w+)", (\w+)\}', sources) if name == function}
        self.assertEqual(names, known | {"batch"})
        self.assertLessEqual(set(WRONG), set(lines))


class Shortening(unittest.TestCase):
    def test_leaves_what_is_needed(self):
        lines = [str(number) for number in range(100)]

        short = shorten(lines, lambda fewer: {"3", "50", "97"} <= set(fewer))

        self.assertEqual(short, ["3", "50", "97"])


class TheWholeTest(unittest.TestCase):
    def test_finds_a_program_that_is_wrong_and_says_by_which_line(self):
        with tempfile.TemporaryDirectory() as folder:
            agrees = pathlib.Path(folder, "agrees")
            agrees.write_text(AGREEABLE.format(python=sys.executable))
            agrees.chmod(0o755)
            result = subprocess.run(
                [sys.executable, FOLDER / "random_test.py", agrees, "--seed", "5", "--count", "40", "--workers", "1"],
                capture_output=True, text=True, check=False)

        self.assertEqual(result.returncode, 1, result.stderr)
        self.assertIn("Broken: each line has the reply that it asks for", result.stdout)
        between = result.stdout.split("shortened from script")[1].split("To see it again")[0]
        self.assertEqual(len(between.strip().split("\n")), 3)


if __name__ == "__main__":
    unittest.main()
