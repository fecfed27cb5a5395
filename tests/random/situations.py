"""Draws situations at random: scripts whose lines are commands of the whole contract, wrong ones among them."""

import json
import random
from typing import Any, Callable

Command = dict[str, Any]

LARGEST = 2**64 - 1
MEGABYTE = 1 << 20

IDS = ["0", "1", "7", "8", "9", str(2**63), str(LARGEST - 1), str(LARGEST)]
NAMES = ["Quiet", "Loud", "Morning", "Späti – Ωmega 🎵", "None", "Synced", "", None]
REVISIONS = [1, 2, 3, str(LARGEST), None]
SIZES = [0, 1, 40, 1000, 4_000_000, 50 * MEGABYTE, 100 * MEGABYTE, 100 * MEGABYTE + 1, 2**32, 2**63, LARGEST, None]
LIMITS = [0, 1, 2, 15, 50, 100, 125, 250, 300, 500, 1024, 2048, 2**44 - 1, 2**44, LARGEST, None]
PROGRESSES = [-1, 0, 0.25, 0.505, 0.999, 1, 1.5]
FIGURES = [-10, 0, 500, 1000.75, 1e9, 1e30]
SECONDS = [0, 0.1, 0.5, 1, 1.4, 1.5, 1.5, 1.6, 3, 10, 480, 481]
STATUS_EVENTS = ["session:willBeginSessionTask:", "session:didBeginSessionTask:",
                 "session:didUpdateSessionTask:", "session:didFinishSessionTask:",
                 "sessionWillBegin:", "sessionDidFinish:"]
MESSAGES = ["canBeShownFromSuspendedState", "didLock", "didUnlock", "didWake", "parentController",
            "readPreferenceValue:", "rootController", "setPreferenceValue:specifier:", "specifier",
            "statusBarWillAnimateByHeight:", "suspend", "willBecomeActive", "willResignActive", "willUnlock"]
STRINGS = [{}, {}, {"SYNC_SETTINGS_PLAYLIST_CELL_VALUE_TEXT_SYNCING": ""},
           {"SYNC_SETTINGS_FOOTER_SYNCED_MB_N_SONGS": "%2$@ of %1$tu (%3$@) %%"},
           {"SYNC_SETTINGS_PLAYLIST_SYNC_STATUS_SYNCING": "%tu"}]

#: Lines that are wrong in themselves, and what the refusal names.
WRONG = {
    "": "JSON", "{": "JSON", "nonsense": "JSON", '{"do":"advance","seconds":1e999}': "JSON", "[]": "object",
    "{}": "do", '{"do":7}': "do", '{"do":"dance"}': "do",
    '{"do":"advance"}': "seconds", '{"do":"advance","seconds":-1}': "seconds",
    '{"do":"library","playlists":[{"id":7}],"media":[]}': "playlists[0].id",
    '{"do":"library","playlists":[],"media":["films"]}': "media[0]",
    '{"do":"library","playlists":[{"id":"7","items":[1.5]}],"media":[],"notify":true}': "playlists[0].items[0]",
    '{"do":"prefs","set":{"assetSyncEnabled":false,"assetSyncLimit":-1}}': "set.assetSyncLimit",
    '{"do":"prefs","set":{"volume":1}}': "set.volume",
    '{"do":"sessions","list":[{"id":"s","tasks":[{"id":"t"}]}]}': "list[0].tasks[0].group",
    '{"do":"session","id":"nobody","event":"sessionWillBegin:"}': "id",
    '{"do":"usage","reply":"later"}': "reply", '{"do":"usage","reply":null,"after":-1}': "after",
    '{"do":"clock","by":"1"}': "by", '{"do":"screen","rows":-1}': "rows", '{"do":"tap"}': "specifier",
    '{"do":"application","state":"asleep"}': "state", '{"do":"batch"}': "steps",
    '{"do":"trace","classes":"all"}': "classes",
    '{"do":"layout","title":[1,2,3],"detail":[1,2,3,4],"fits":1}': "title",
}


def script(source: random.Random, situations: int) -> list[str]:
    """The lines of a script of so many situations, one after the other on one host."""
    return [line for _ in range(situations) for line in Situation(source).lines()]


class Situation:
    """A world, and what happens in it. What it draws fits what it drew before, as a rule."""

    def __init__(self, source: random.Random) -> None:
        self._source = source
        self._any = source.choice
        self._playlists: list[Command] = []
        self._sessions: list[Command] = []

    def lines(self) -> list[str]:
        commands = [self._library(), self._preferences(), self._chosen(), self._usage(), self._sessions_list()]
        self._source.shuffle(commands)
        commands = commands[: self._source.randint(3, 5)] + [{"do": "open"}]
        for _ in range(self._source.randint(3, 9)):
            commands += self._event()
        if self._chance(0.5):
            commands.append({"do": self._any(["release", "back"])})
        return [line for command in commands for line in self._written(command)]

    def _written(self, command: Command) -> list[str]:
        """The command as a line, at times after one that is wrong."""
        line = json.dumps(command, ensure_ascii=self._chance(0.5), separators=(",", ":"))
        return [self._any(list(WRONG)), line] if self._chance(0.03) else [line]

    def _event(self) -> list[Command]:
        """Something that happens, and often a look at what came of it."""
        happening = self._source.choices(*self._happenings())[0]()
        commands = happening if isinstance(happening, list) else [happening]
        return commands + (self._look() if self._chance(0.6) else [])

    def _happenings(self) -> tuple[list[Callable[[], Any]], list[int]]:
        weights = {
            self._advance: 16, self._tap_row: 12, self._preferences: 10, self._open_chooser: 9, self._session: 8,
            self._library: 7, self._back: 7, self._sessions_list: 6, self._sync_runs: 5, self._usage: 5,
            self._choose: 5, self._is_sent: 4, self._application: 3, self._clock: 3, self._batch: 3,
            self._coming_and_going: 3, self._send: 3, self._look_of_the_host: 2, self._scroll: 2, self._question: 2,
            self._trace: 1,
        }
        return list(weights), list(weights.values())

    def _chance(self, probability: float) -> bool:
        return self._source.random() < probability

    def _look(self) -> list[Command]:
        """A look at what is there, often drawn anew before it."""
        fresh = [{"do": "send", "selector": "willBecomeActive"}] if self._chance(0.6) else []
        return [*fresh, {"do": "snapshot"}, {"do": "query"}]

    def _library(self) -> Command:
        media = self._any([["music"], ["music", "other"], ["musicVideo"], ["music"], ["other"], []])
        self._playlists = [self._playlist() for _ in range(self._source.randint(0, 5))]
        return {"do": "library", "media": media, "playlists": self._playlists, "notify": self._chance(0.7)}

    def _playlist(self) -> Command:
        playlist = {"id": self._any(IDS), "name": self._any(NAMES), "revision": self._any(REVISIONS),
                    "items": self._source.choices(SIZES, k=self._source.randint(0, 6))}
        for flag in ("folder", "augurMix", "augurPlaylist", "fresh"):
            if self._chance(0.08):
                playlist[flag] = True
        return playlist

    def _id(self) -> str | None:
        known = [playlist["id"] for playlist in self._playlists]
        return self._any(known) if known and self._chance(0.85) else self._any([*IDS, None])

    def _preferences(self) -> Command:
        values = {
            "assetSyncEnabled": self._any([True, True, True, False, None]),
            "assetSyncPlaylistPersistentID": self._id(),
            "assetSyncLimitType": self._any([0, 0, 1, 1, 2, LARGEST]),
            "assetSyncLimit": self._any(LIMITS),
            "lastFullySentAssetSyncPlaylistPersistentID": self._id(),
            "lastFullySentAssetSyncPlaylistVersion": self._any(REVISIONS),
        }
        names = self._source.sample(list(values), self._source.randint(1, len(values)))
        return {"do": "prefs", "set": {name: values[name] for name in names}, "notify": self._chance(0.8)}

    def _chosen(self) -> Command:
        return {"do": "prefs", "set": {"assetSyncEnabled": True, "assetSyncPlaylistPersistentID": self._id()}}

    def _is_sent(self) -> Command:
        """The engine has sent a playlist of the library in full."""
        sent = self._any(self._playlists) if self._playlists else {"id": "7", "revision": 1}
        return {"do": "prefs", "set": {"assetSyncEnabled": True, "assetSyncPlaylistPersistentID": sent["id"],
                                       "lastFullySentAssetSyncPlaylistPersistentID": sent["id"],
                                       "lastFullySentAssetSyncPlaylistVersion": sent["revision"]}}

    def _sync_runs(self) -> list[Command]:
        return [self._chosen(), self._sessions_list(), self._advance(), *self._look()]

    def _sessions_list(self) -> Command:
        ids = self._source.sample(["s", "u", "ü"], self._source.choices([0, 1, 2, 3], [5, 5, 2, 1])[0])
        self._sessions = [{"id": id_, "finished": self._chance(0.3), "tasks": self._tasks()} for id_ in ids]
        return {"do": "sessions", "list": self._sessions, "notify": self._chance(0.8)}

    def _tasks(self) -> list[Command]:
        return [{"id": id_, "group": self._any(["asset", "asset", "other"]), "running": self._chance(0.5),
                 "total": self._any([0, 1, 5, 2**63, LARGEST]), "completed": self._any([0, 1, LARGEST]),
                 "progress": self._any(PROGRESSES)}
                for id_ in self._source.sample(["a", "b", "c"], self._source.randint(0, 3))]

    def _session(self) -> Command:
        session = self._any(self._sessions) if self._sessions else {"id": "s", "tasks": []}
        tasks = [task["id"] for task in session["tasks"]] or ["a"]
        return {"do": "session", "id": session["id"], "event": self._any(STATUS_EVENTS), "task": self._any(tasks),
                "thread": self._any(["main", "other"]), "times": self._any([0, 1, 1, 3, 10])}

    def _usage(self) -> Command:
        figures = {name: self._any(FIGURES) for name in ("available", "songs") if self._chance(0.85)}
        reply = self._any([figures, figures, figures, None, "hold"])
        return {"do": "usage", "reply": reply, "after": self._any([0, 0, 0.5, 1.5, 5])}

    def _advance(self) -> Command:
        return {"do": "advance", "seconds": self._any(SECONDS)}

    def _clock(self) -> Command:
        tick = {"tick": self._any([0, 0, 1, 240])} if self._chance(0.3) else {}
        return {"do": "clock", "by": self._any([-1000, -481, -480, -1, 0, 1, 480, 481]), **tick}

    def _application(self) -> Command:
        return {"do": "application", "state": self._any(["background", "foreground"])}

    def _tap_specifier(self) -> Command:
        return {"do": "tap", "specifier": self._any(["Synced Playlist"] * 5 + ["Playlist Limit"] * 4 + ["Velora"])}

    def _open_chooser(self) -> list[Command]:
        return [self._tap_specifier(), *(self._look() if self._chance(0.5) else [])]

    def _tap_row(self) -> Command:
        return {"do": "tap", "path": [self._any([0, 0, 0, 1, 1]), self._any([0, 0, 0, 1, 1, 2, 3, 4])]}

    def _choose(self) -> list[Command]:
        return [self._tap_specifier(), self._tap_row(), {"do": "snapshot"}, {"do": "back"}]

    def _back(self) -> Command:
        return {"do": "back"}

    def _coming_and_going(self) -> list[Command]:
        return self._any([[{"do": "disappear"}], [{"do": "appear", "animated": True}], [{"do": "open"}],
                          [{"do": "disappear"}, {"do": "release"}], [{"do": "release"}, {"do": "open"}],
                          [{"do": "create"}], [{"do": "specifiers"}], [{"do": "disappear"}, {"do": "open"}]])

    def _send(self) -> Command:
        return self._any([{"do": "send", "selector": self._any(MESSAGES)}] * 3 + [
            {"do": "send", "selector": "handleURL:", "url": "pane:music"},
            {"do": "send", "selector": "showController:", "controller": self._any(["Guest", None])},
            {"do": "send", "selector": "showController:animate:", "controller": "Guest", "animate": True},
            {"do": "send", "selector": "setParentController:", "controller": None},
            {"do": "send", "selector": "setRootController:", "controller": self._any(["Root", None])},
            {"do": "send", "selector": "setSpecifier:"}])

    def _look_of_the_host(self) -> Command:
        return self._any([
            {"do": "glance", "row": self._any(["Velora", "", None])},
            {"do": "screen", "rows": self._any([0, 1, 2, 3, 12])},
            {"do": "screen", "scale": 3, "textColor": self._any(["red", None]), "tintColor": "blue"},
            {"do": "strings", "table": self._any(STRINGS)},
            {"do": "language", "tag": self._any(["de", "ar", "en", "en"])},
            {"do": "sizes", "text": self._any(["platform", "raw"])}])

    def _scroll(self) -> Command:
        return {"do": "scroll", "to": self._source.randint(0, 6)}

    def _question(self) -> Command:
        frames = {name: [self._any([0, 15.25, 80, 200.5]), 0, self._any([0, 60, 99.5]), 20]
                  for name in ("title", "detail")}
        return self._any([{"do": "rows", "section": self._any([-1, 0, 1, 2])},
                          {"do": "layout", **frames, "fits": self._any([0, 60, 150])}, {"do": "query"}])

    def _trace(self) -> Command:
        return {"do": "trace", "classes": self._any([None, None, None, [], ["UITableView", "life"], ["dispatch"]])}

    def _batch(self) -> Command:
        steps = [step for _ in range(self._source.randint(1, 3)) for step in self._event()]
        return {"do": "batch", "steps": steps}
