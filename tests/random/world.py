"""What a script has settled so far, and what its replies have told: all that properties rest on. It says how things
are around the panes, and follows what the panes do; it never works out what they should."""

from dataclasses import dataclass, field, replace
from typing import Any

ROOT = "LMQuorlSettingsController"
PLAYLISTS = "LMQuorlPlaylistChooser"
LIMITS = "LMQuorlLimitChooser"

SECOND = 10**9
DELAY = 3 * SECOND // 2  #: between a post of the status and what is shown of it

NEVER_NULL = ("assetSyncEnabled", "assetSyncLimitType")
PREFERENCES = (*NEVER_NULL, "assetSyncPlaylistPersistentID", "assetSyncLimit",
               "lastFullySentAssetSyncPlaylistPersistentID", "lastFullySentAssetSyncPlaylistVersion")

Json = dict[str, Any]


@dataclass(frozen=True)
class Arm:
    """A root pane's promise to refresh: when it was given, and how many root panes there were then."""

    earliest: int
    latest: int
    alive: int
    made: int


@dataclass(frozen=True)
class World:
    now: int = 0  #: virtual time in nanoseconds
    playlists: tuple[Json, ...] = ()
    described: tuple[Json, ...] = ()  #: every playlist that the library has had
    has_music: bool = False
    preferences: Json = field(default_factory=dict)
    listed: tuple[Json, ...] = ()  #: sessions
    observed: tuple[Json, ...] | None = ()  #: null where it is not known how they are
    joined: tuple[str, ...] = ()  #: ids of the sessions that were fetched last
    figures: tuple[Json, ...] = ()  #: whatever the wearable has ever been told to answer
    answer: Any = None
    answer_delay: int = 0
    held: int = 0
    due: tuple[int, ...] = ()  #: latest instants at which answers come
    rows: int = 12  #: that fit on the screen
    is_plain: bool = True  #: texts are in English, and sizes raw
    ticks: bool = False  #: the wall clock moves when it is read
    listeners: int = 0  #: how often changes of the library are wanted
    selected: tuple[str, ...] | None = None  #: receivers that are traced
    stack: tuple[str, ...] = ()
    takes_guests: bool = True  #: the root pane pushes what it is to show
    alive: Json = field(default_factory=lambda: {ROOT: 0, PLAYLISTS: 0, LIMITS: 0})
    roots_made: int = 0
    arms: tuple[Arm, ...] = ()
    timer: int | None = None  #: the instant at which the playlist chooser's timer is due

    @property
    def top(self) -> str | None:
        return self.stack[-1] if self.stack else None

    @property
    def pending_answers(self) -> int:
        return self.held + sum(instant > self.now for instant in self.due)

    @property
    def is_on(self) -> bool:
        return bool(self.preferences.get("assetSyncEnabled"))

    @property
    def limit_type(self) -> int:
        return self.preferences.get("assetSyncLimitType") or 0

    @property
    def limit(self) -> int:
        return self.preferences.get("assetSyncLimit") or 0

    def stored(self) -> Json:
        """The preferences as they are kept: what was never set is as what was cleared, and ids are as revisions."""
        values = {name: self.preferences.get(name) for name in PREFERENCES}
        return {name: values[name] or 0 if name in NEVER_NULL else str(values[name]) for name in values}

    def ordinary_playlists(self) -> list[Json]:
        """Those that a person can choose from, in their order."""
        flags = ("folder", "augurMix", "augurPlaylist")
        return [it for it in self.playlists if self.has_music and not any(it.get(flag) for flag in flags)]


def after(world: World, command: Json, reply: Json) -> World:
    """The world after a command with its reply. What was refused changes nothing."""
    if not reply["ok"]:
        return world
    began = world.now
    settle = SETTLERS.get(command["do"])
    world = replace(world, **settle(world, command)) if settle else world
    for entry in reply["trace"]:
        if changes := _told(world, command, entry, began):
            world = replace(world, **changes)
    return world


def _library(world: World, command: Json) -> Json:
    playlists = tuple(command["playlists"])
    return {"playlists": playlists, "described": world.described + playlists,
            "has_music": bool({"music", "musicVideo"} & set(command["media"]))}


def _preferences(world: World, command: Json) -> Json:
    return {"preferences": {**world.preferences, **command["set"]}}


def _sessions(_world: World, command: Json) -> Json:
    return {"listed": tuple(command["list"]), "observed": None}


def _usage(world: World, command: Json) -> Json:
    answer, delay = command["reply"], round(command.get("after", 0) * SECOND)
    figures = world.figures + ((answer,) if isinstance(answer, dict) else ())
    told = {"answer": answer, "answer_delay": delay, "figures": figures}
    return told if answer == "hold" else {**told, "held": 0, "due": world.due + (world.now + delay,) * world.held}


def _advance(world: World, command: Json) -> Json:
    return {"now": world.now + round(command["seconds"] * SECOND)}


def _new_root(world: World, _command: Json) -> Json:
    return {"stack": (ROOT,), "takes_guests": True, "roots_made": world.roots_made + 1,
            "alive": {**world.alive, ROOT: world.alive[ROOT] + 1}}


def _send(world: World, command: Json) -> Json:
    is_to_root = command["selector"] == "setRootController:" and world.top == ROOT
    return {"takes_guests": command.get("controller") is not None} if is_to_root else {}


def _is_foreign(world: World, command: Json) -> Json:
    is_plain = list(command.values())[1:] in (["en"], [{}], ["raw"])
    return {"is_plain": world.is_plain and is_plain}


SETTLERS = {
    "library": _library, "prefs": _preferences, "sessions": _sessions, "usage": _usage, "advance": _advance,
    "create": _new_root, "open": _new_root, "send": _send,
    "language": _is_foreign, "strings": _is_foreign, "sizes": _is_foreign,
    "screen": lambda world, command: {"rows": command.get("rows", world.rows)},
    "clock": lambda world, command: {"ticks": bool(command.get("tick", world.ticks))},
    "back": lambda world, _: {"stack": world.stack[:-1]},
    "release": lambda _world, _: {"stack": ()},
    "trace": lambda _world, command: {"selected": command.get("classes")},
}

SETTERS = {
    "setAssetSyncEnabled:": "assetSyncEnabled",
    "setAssetSyncPlaylistPersistentID:": "assetSyncPlaylistPersistentID",
    "setAssetSyncLimitType:": "assetSyncLimitType",
    "setAssetSyncLimit:": "assetSyncLimit",
}


def _told(world: World, command: Json, entry: list, began: int) -> Json:
    """What one entry of a trace changes."""
    match entry:
        case ["LMSyncDefaults", setter, value]:
            return {"preferences": {**world.preferences, SETTERS[setter]: value}}
        case ["DVSession", "sessionsWithSessionTypeIdentifier:", *_]:
            return {"observed": world.listed, "joined": tuple(session["id"] for session in world.listed)}
        case ["MPMediaLibrary", "beginGeneratingLibraryChangeNotifications"]:
            return {"listeners": world.listeners + 1}
        case ["MPMediaLibrary", "endGeneratingLibraryChangeNotifications"]:
            return {"listeners": max(world.listeners - 1, 0)}
        case ["LSSManager", "getUsage:"] if world.answer == "hold":
            return {"held": world.held + 1}
        case ["LSSManager", "getUsage:"]:
            return {"due": world.due + (world.now + world.answer_delay,)}
        case ["NSNotificationCenter", "addObserver:selector:name:object:", "LMQuorlPlaylistChooser", _, name, _] if (
            name == "MPMediaLibraryDidChangeNotification"
        ):
            return _pushed(world, PLAYLISTS)
        case ["NSBundle", _, "SYNC_SETTINGS_USAGE_LIMIT_TITLE", *_] if command["do"] == "tap":
            return _pushed(world, LIMITS)
        case ["PSListController", "showController:" | "showController:animate:", str(guest), *_] if world.takes_guests:
            return {"stack": (*world.stack, guest)}
        case ["dispatch", "dispatch_after", _]:
            return {"arms": (*world.arms, Arm(began, world.now, world.alive[ROOT], world.roots_made))}
        case ["dispatch", "dispatch_source_set_timer", delay, *_]:
            return {"timer": None if delay == "forever" else world.now + delay}
        case ["dealloc", gone] if gone in world.alive:
            alive = {**world.alive, gone: world.alive[gone] - 1}
            return {"alive": alive, "timer": None if gone == PLAYLISTS else world.timer}
    return {}


def _pushed(world: World, pane: str) -> Json:
    return {"stack": (*world.stack, pane), "alive": {**world.alive, pane: world.alive[pane] + 1}}
