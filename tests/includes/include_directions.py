"""Keeps the directions in which the rooms of this project may include one another."""

import collections
import dataclasses
import pathlib
import re
import tempfile
import unittest

ROOT = pathlib.Path(__file__).resolve().parents[2]

STANDARD = frozenset(
    """algorithm any array atomic barrier bit bitset cassert cctype cerrno cfenv cfloat charconv
    chrono cinttypes climits clocale cmath compare complex concepts condition_variable
    coroutine csetjmp csignal cstdarg cstddef cstdint cstdio cstdlib cstring ctime cuchar
    cwchar cwctype deque exception execution filesystem format forward_list fstream functional
    future initializer_list iomanip ios iosfwd iostream istream iterator latch limits list
    locale map memory memory_resource mutex new numbers numeric optional ostream queue random
    ranges ratio regex scoped_allocator semaphore set shared_mutex source_location span
    sstream stack stdexcept stop_token streambuf string string_view strstream syncstream
    system_error thread tuple type_traits typeindex typeinfo unordered_map unordered_set
    utility valarray variant vector version""".split()
)

# What of it reaches beyond the process, or waits for another thread.
OUTSIDE_WORLD = frozenset(
    """atomic barrier chrono condition_variable csignal cstdio ctime execution filesystem fstream
    future iomanip ios iosfwd iostream istream latch mutex ostream random semaphore shared_mutex
    sstream stop_token streambuf strstream syncstream thread""".split()
)

QT = r"Q[A-Z]\w*|Qt\w*/.*"
SERVICES = r"gio/.*|gio-unix.*|sdbus-c\+\+/.*|dbus/.*|systemd/sd-bus\.h"
NOTHING = r"(?!)"
ANYTHING = r".*"


@dataclasses.dataclass(frozen=True)
class Rule:
    """What the files of one room may include besides those of that room itself."""

    rooms: tuple = ()  # folders of this project
    libraries: str = NOTHING  # headers from elsewhere
    but_not: str = NOTHING  # exceptions to these
    standard: frozenset = STANDARD  # headers of the C++ standard library


def pane(*rooms):
    return Rule(rooms, standard=STANDARD - OUTSIDE_WORLD)


def runtime(*rooms):
    return Rule(("platform", *rooms), libraries=ANYTHING, but_not=f"{QT}|{SERVICES}")


def services(*rooms):
    return Rule(rooms, libraries=ANYTHING, but_not=QT)


def program(*rooms):
    return Rule(rooms, libraries=ANYTHING)


# By folder or file; the longest that a file lies in is the one that counts.
RULES = {
    "platform": Rule(libraries=r"dispatch/dispatch\.h"),
    "sync": pane("platform"),
    "settings": pane("platform", "sync"),
    "examples": pane("platform"),
    "runtime": runtime("runtime"),
    "runtime/host": runtime(),
    "runtime/objects": runtime("runtime/host"),
    "runtime/services": runtime("runtime/host"),
    "runtime/plugins": runtime("runtime/host", "runtime/objects"),
    "runtime/lists": runtime("runtime/host"),
    "services": services("services"),
    "services/base": services(),
    "services/language": services(),
    "services/media": services("services/base", "services/language", "services/media/playlists"),
    "services/media/playlists": services("services/base", "services/language"),
    "services/preferences": services("services/base", "services/language"),
    "services/wearable": services("services/base", "services/language"),
    "services/engine": services(
        "services/base", "services/language", "services/media/playlists", "services/wearable"),
    "services/finding": services(
        "services/base", "services/engine", "services/language", "services/wearable"),
    "doubles": program("platform", "runtime"),
    "quorl/content": program("platform", "runtime"),
    "quorl/adapters": program("platform", "runtime", "services"),
    "quorl/pages": program(
        "platform", "runtime", "services", "quorl/adapters", "quorl/content", "quorl/facts"),
    "quorl/facts": program("platform", "services", "quorl/adapters"),
    "quorl/process": program("runtime", "services/language"),
    "quorl/app": program(
        "platform", "runtime", "services", "quorl/adapters", "quorl/content", "quorl/facts",
        "quorl/pages", "quorl/process"),
    "quorl/search": program("quorl/content"),
    "quorl/window": program(
        "platform", "runtime", "quorl/app", "quorl/content", "quorl/process", "quorl/search"),
    "quorl/terminal": program(
        "platform", "runtime", "services/base", "services/language", "quorl/app", "quorl/content",
        "quorl/process", "quorl/search"),
    "quorl/commands": program("services", "quorl/app", "quorl/facts", "quorl/process"),
    "quorl/reports": program("runtime", "services", "quorl/app", "quorl/process", "quorl/window"),
    "quorl/main.cpp": program("services/base", "services/language", "quorl"),
    "quorl-script": program("platform", "runtime", "doubles"),
    "quorl-syncd/transfer": program("services"),
    "quorl-syncd/engine": program("services", "quorl-syncd/transfer"),
    "quorl-syncd/notices": program("services", "quorl-syncd/transfer", "quorl-syncd/engine"),
    "quorl-syncd/bus": program(
        "services", "quorl-syncd/transfer", "quorl-syncd/engine", "quorl-syncd/notices"),
    "quorl-syncd/daemon": program("services", "quorl-syncd/transfer", "quorl-syncd/engine"),
    "quorl-syncd/main.cpp": program("services", "quorl-syncd"),
    "quorl-simulate": program("services", "quorl-syncd/transfer", "quorl-syncd/engine"),
}

# Folders that may include whatever they like: nothing else may include them.
FREE = ("tests", "bench", "fuzz")

PROJECT = {path.split("/")[0] for path in RULES} | set(FREE)

INCLUDE = re.compile(
    r'^\s*#\s*(?:include|import)(?:_next)?\s*(?:"([^"]+)"|<([^>]+)>|(.*))', re.MULTILINE)


def includes_of(path):
    """Each include with whether it can be told what it is."""
    for quoted, angled, other in INCLUDE.findall(path.read_text(encoding="utf-8")):
        yield quoted or angled or other, not other


def lies_in(path, room):
    return path == room or path.startswith(room + "/")


def room_of(where):
    """The longest path with a rule that `where` lies in, or None."""
    rooms = [room for room in RULES if lies_in(where, room)]
    return max(rooms, key=len, default=None)


def place_of(root, including, included):
    """The path in this project that an include leads to, or None where it leads elsewhere."""
    beside = (including.parent / included).resolve()
    if beside.is_relative_to(root) and beside.is_file():
        return beside.relative_to(root).as_posix()
    return included if pathlib.PurePath(included).parts[0] in PROJECT else None


def is_allowed(room, root, including, included):
    rule = RULES[room]
    place = place_of(root, including, included)
    if place:
        # Where a room is within another, the outer one's rule does not open the inner one.
        is_own = lies_in(place, room) and room_of(place) == room
        return is_own or any(lies_in(place, open_room) for open_room in rule.rooms)
    if included in STANDARD:
        return included in rule.standard
    return bool(re.fullmatch(rule.libraries, included)) and not re.fullmatch(rule.but_not, included)


def sources(root):
    for folder in sorted(root.iterdir()):
        if folder.is_dir() and folder.name != "build" and not folder.name.startswith("."):
            for path in sorted(folder.rglob("*")):
                if path.suffix in (".h", ".hpp", ".cpp", ".cc", ".c"):
                    yield folder.name, path


def wrong_includes(root):
    """One line of text for each include below `root` that points the wrong way."""
    wrong = []
    for folder, path in sources(root):
        if folder in FREE:
            continue
        where = path.relative_to(root).as_posix()
        room = room_of(where)
        if room is None:
            wrong.append(f"{where}: no rule says what its room may include")
            continue
        for included, is_known in includes_of(path):
            if not is_known or not is_allowed(room, root, path, included):
                wrong.append(f"{where}: may not include {included}")
    return wrong


# Headers of the platform that leave nothing to define, and why.
WITHOUT_SOURCE = {
    "Foundation": "includes others",
    "Inspection": "is for plug-ins to define",
    "InterfaceVersion": "is one constant",
    "NSCollections": "is templates",
    "NSError": "is defined within the class",
    "Selector": "is templates",
}


def problem_of_platform_header(root, header):
    """What is wrong with the sources of a header of the platform, or None."""
    found = sorted((root / "runtime").glob(f"*/{header.stem}.cpp"))
    wanted = 0 if header.stem in WITHOUT_SOURCE else 1
    if len(found) != wanted:
        return f"{header.name}: has {len(found)} sources of its name in runtime/, not {wanted}"
    first = [next(includes_of(path), None) for path in found]
    if first not in ([], [(f"platform/{header.name}", True)]):
        return f"{header.name}: is not what {found[0].name} includes first"
    return None


def problems_of_platform(root):
    headers = sorted((root / "platform").glob("*.h"))
    problems = [problem_of_platform_header(root, header) for header in headers]
    return [problem for problem in problems if problem]


def repeated_header_names(root):
    names = [path.name for _, path in sources(root) if path.suffix in (".h", ".hpp")]
    return sorted(name for name, count in collections.Counter(names).items() if count > 1)


def reaches(root, path, wanted, seen=None):
    """Whether `path` includes the header `wanted`, itself or through others of this project."""
    seen = set() if seen is None else seen
    for included, _ in includes_of(path):
        place = place_of(root, path, included)
        if included == wanted:
            return True
        if place and place not in seen:
            seen.add(place)
            if (root / place).is_file() and reaches(root, root / place, wanted, seen):
                return True
    return False


# The sources of the pane that hand work to a queue; the others know nothing of queues.
QUEUEING = [
    "settings/LMQuorlPlaylistChooser.cpp",
    "settings/LMQuorlSettingsController+LimitFooter.cpp",
    "settings/LMQuorlSettingsController.cpp",
    "sync/LMQuorlSyncManager.cpp",
]


def queueing_sources(root):
    return [path.relative_to(root).as_posix() for folder, path in sources(root)
            if folder in ("settings", "sync") and path.suffix == ".cpp"
            and reaches(root, path, "dispatch/dispatch.h")]


class ThisProject(unittest.TestCase):
    def test_includes_only_in_the_right_directions(self):
        self.assertEqual(wrong_includes(ROOT), [])

    def test_defines_each_platform_header_in_one_source_of_its_name(self):
        self.assertEqual(problems_of_platform(ROOT), [])

    def test_has_no_two_headers_of_one_name(self):
        self.assertEqual(repeated_header_names(ROOT), [])

    def test_takes_queues_into_the_pane_only_where_work_is_queued(self):
        self.assertEqual(queueing_sources(ROOT), QUEUEING)

    def test_has_sources_to_look_at(self):
        self.assertIn("platform", {folder for folder, _ in sources(ROOT)})


class PlantedFiles(unittest.TestCase):
    def setUp(self):
        folder = tempfile.TemporaryDirectory()
        self.addCleanup(folder.cleanup)
        self.root = pathlib.Path(folder.name).resolve()

    def plant(self, where, *included):
        (self.root / where).parent.mkdir(parents=True, exist_ok=True)
        lines = "".join(f"#  include {header}\n" for header in included)
        (self.root / where).write_text(f"#pragma once\n\n{lines}", encoding="utf-8")


class PlantedInclude(PlantedFiles):
    """Each line is an include in one room, in a project that has the files named below."""

    FILES = (
        "platform/Foundation.h",
        "sync/SyncManager.h",
        "settings/Pane.h",
        "runtime/host/Host.h",
        "runtime/objects/Centre.h",
        "runtime/services/Defaults.h",
        "runtime/plugins/Loader.h",
        "runtime/lists/List.h",
        "services/base/Paths.h",
        "services/media/MusicFolder.h",
        "services/media/playlists/Reader.h",
        "services/wearable/Wearable.h",
        "doubles/Clock.h",
        "quorl/adapters/Library.h",
        "quorl/app/Companion.h",
        "quorl/content/Content.h",
        "quorl/terminal/Text.h",
        "quorl/window/MainWindow.h",
        "quorl-script/Script.h",
        "quorl-syncd/transfer/Copy.h",
        "quorl-syncd/engine/Engine.h",
        "quorl-syncd/bus/Bus.h",
    )

    RIGHT = (
        ("platform/A.h", "<vector>"),
        ("platform/A.h", "<chrono>"),
        ("platform/A.h", '"Foundation.h"'),
        ("platform/A.h", "<dispatch/dispatch.h>"),
        ("sync/A.cpp", '"platform/Foundation.h"'),
        ("sync/A.cpp", '"SyncManager.h"'),
        ("sync/A.cpp", "<algorithm>"),
        ("settings/A.cpp", '"sync/SyncManager.h"'),
        ("runtime/A.cpp", '"runtime/plugins/Loader.h"'),
        ("runtime/host/A.cpp", '"platform/Foundation.h"'),
        ("runtime/host/A.cpp", "<chrono>"),
        ("runtime/objects/A.cpp", '"runtime/host/Host.h"'),
        ("runtime/objects/A.cpp", "<unicode/ulocale.h>"),
        ("runtime/plugins/A.cpp", '"runtime/objects/Centre.h"'),
        ("runtime/plugins/A.cpp", "<dlfcn.h>"),
        ("runtime/services/A.cpp", '"runtime/host/Host.h"'),
        ("runtime/lists/A.cpp", '"List.h"'),
        ("services/media/A.cpp", '"MusicFolder.h"'),
        ("services/media/A.cpp", '"services/base/Paths.h"'),
        ("services/media/A.cpp", "<gio/gio.h>"),
        ("doubles/A.cpp", '"runtime/lists/List.h"'),
        ("quorl/app/A.cpp", '"services/media/MusicFolder.h"'),
        ("quorl/app/A.cpp", "<QWidget>"),
        ("quorl/main.cpp", '"quorl/window/MainWindow.h"'),
        ("quorl/content/A.cpp", '"runtime/lists/List.h"'),
        ("quorl/window/A.cpp", '"quorl/app/Companion.h"'),
        ("quorl/terminal/A.cpp", '"services/base/Paths.h"'),
        ("quorl/reports/A.cpp", '"quorl/window/MainWindow.h"'),
        ("quorl-script/A.cpp", '"doubles/Clock.h"'),
        ("quorl-script/A.cpp", "<nlohmann/json.hpp>"),
        ("quorl-syncd/bus/A.cpp", '"quorl-syncd/engine/Engine.h"'),
        ("quorl-syncd/daemon/A.cpp", '"quorl-syncd/engine/Engine.h"'),
        ("quorl-syncd/main.cpp", '"quorl-syncd/bus/Bus.h"'),
        ("quorl-syncd/transfer/A.cpp", '"services/media/MusicFolder.h"'),
        ("tests/A.cpp", '"sync/SyncManager.h"'),
    )

    WRONG = (
        ("platform/A.h", "<unistd.h>"),
        ("platform/A.h", '"sync/SyncManager.h"'),
        ("platform/A.h", '"runtime/plugins/Loader.h"'),
        ("sync/A.cpp", "<dispatch/dispatch.h>"),
        ("sync/A.cpp", '"settings/Pane.h"'),
        ("sync/A.cpp", '"../settings/Pane.h"'),
        ("sync/A.cpp", "<settings/Pane.h>"),
        ("sync/A.cpp", "<stdint.h>"),
        ("sync/A.cpp", "<mutex>"),
        ("sync/A.cpp", "<atomic>"),
        ("sync/A.cpp", "<chrono>"),
        ("settings/A.cpp", "<thread>"),
        ("settings/A.cpp", "<fstream>"),
        ("settings/A.cpp", "<filesystem>"),
        ("settings/A.cpp", "<iostream>"),
        ("settings/A.cpp", '"runtime/plugins/Loader.h"'),
        ("settings/A.cpp", "<QString>"),
        ("settings/A.cpp", "CHOSEN_ELSEWHERE"),
        ("settings/deep/A.cpp", '"../../services/media/MusicFolder.h"'),
        ("runtime/A.cpp", "<QtCore/QString>"),
        ("runtime/A.cpp", "<QString>"),
        ("runtime/A.cpp", "<gio/gio.h>"),
        ("runtime/A.cpp", "<sdbus-c++/sdbus-c++.h>"),
        ("runtime/A.cpp", '"sync/SyncManager.h"'),
        ("runtime/A.cpp", '"services/media/MusicFolder.h"'),
        ("runtime/host/A.cpp", '"runtime/objects/Centre.h"'),
        ("runtime/host/A.cpp", '"../plugins/Loader.h"'),
        ("runtime/objects/A.cpp", '"runtime/plugins/Loader.h"'),
        ("runtime/objects/A.cpp", '"runtime/services/Defaults.h"'),
        ("runtime/services/A.cpp", '"runtime/objects/Centre.h"'),
        ("runtime/plugins/A.cpp", '"runtime/lists/List.h"'),
        ("runtime/lists/A.cpp", '"runtime/services/Defaults.h"'),
        ("runtime/lists/A.cpp", "<QString>"),
        ("services/media/A.cpp", "<QString>"),
        ("services/media/A.cpp", '"platform/Foundation.h"'),
        ("services/media/A.cpp", '"services/wearable/Wearable.h"'),
        ("services/media/playlists/A.cpp", '"services/media/MusicFolder.h"'),
        ("services/media/playlists/A.cpp", '"../MusicFolder.h"'),
        ("services/base/A.cpp", '"services/media/MusicFolder.h"'),
        ("services/wearable/A.cpp", '"services/media/MusicFolder.h"'),
        ("doubles/A.cpp", '"services/base/Paths.h"'),
        ("quorl/app/A.cpp", '"sync/SyncManager.h"'),
        ("quorl/app/A.cpp", '"settings/Pane.h"'),
        ("quorl/app/A.cpp", '"quorl-script/Script.h"'),
        ("quorl/app/A.cpp", '"tests/Fake.h"'),
        ("quorl/content/A.cpp", '"services/base/Paths.h"'),
        ("quorl/content/A.cpp", '"quorl/app/Companion.h"'),
        ("quorl/window/A.cpp", '"quorl/adapters/Library.h"'),
        ("quorl/window/A.cpp", '"quorl/terminal/Text.h"'),
        ("quorl/adapters/A.cpp", '"quorl/app/Companion.h"'),
        ("quorl/app/A.cpp", '"quorl/window/MainWindow.h"'),
        ("quorl/terminal/A.cpp", '"services/media/MusicFolder.h"'),
        ("quorl/search/A.cpp", '"quorl/window/Text.h"'),
        ("quorl/reports/A.cpp", '"quorl/terminal/Text.h"'),
        ("quorl/elsewhere/A.cpp", "<vector>"),
        ("quorl-script/A.cpp", '"quorl/window/MainWindow.h"'),
        ("quorl-script/A.cpp", '"services/base/Paths.h"'),
        ("quorl-syncd/A.cpp", '"../quorl/window/MainWindow.h"'),
        ("quorl-syncd/A.cpp", '"runtime/host/Host.h"'),
        ("quorl-syncd/transfer/A.cpp", '"quorl-syncd/engine/Engine.h"'),
        ("quorl-syncd/engine/A.cpp", '"quorl-syncd/bus/Bus.h"'),
        ("quorl-syncd/daemon/A.cpp", '"quorl-syncd/bus/Bus.h"'),
        ("elsewhere/A.cpp", "<vector>"),
    )

    def wrong_includes_with(self, where, included):
        for path in self.FILES:
            self.plant(path)
        self.plant(where, included)
        wrong = wrong_includes(self.root)
        (self.root / where).unlink()
        return wrong

    def test_in_a_right_direction_is_let_pass(self):
        for where, included in self.RIGHT:
            with self.subTest(where=where, included=included):
                self.assertEqual(self.wrong_includes_with(where, included), [])

    def test_in_a_wrong_direction_is_found(self):
        for where, included in self.WRONG:
            with self.subTest(where=where, included=included):
                found = self.wrong_includes_with(where, included)
                self.assertEqual(len(found), 1)
                self.assertTrue(found[0].startswith(f"{where}: "))


class PlantedPlatformHeader(PlantedFiles):
    def setUp(self):
        super().setUp()
        self.plant("platform/Clock.h")

    def test_with_its_source_is_let_pass(self):
        self.plant("runtime/objects/Clock.cpp", '"platform/Clock.h"', '"runtime/host/Host.h"')

        self.assertEqual(problems_of_platform(self.root), [])

    def test_without_a_source_is_found(self):
        self.assertEqual(len(problems_of_platform(self.root)), 1)

    def test_with_two_sources_is_found(self):
        self.plant("runtime/objects/Clock.cpp", '"platform/Clock.h"')
        self.plant("runtime/lists/Clock.cpp", '"platform/Clock.h"')

        self.assertEqual(len(problems_of_platform(self.root)), 1)

    def test_that_its_source_does_not_include_first_is_found(self):
        for included in ((), ('"runtime/host/Host.h"', '"platform/Clock.h"')):
            with self.subTest(included):
                self.plant("runtime/objects/Clock.cpp", *included)

                self.assertEqual(len(problems_of_platform(self.root)), 1)

    def test_that_needs_no_source_must_have_none(self):
        self.plant("runtime/objects/Clock.cpp", '"platform/Clock.h"')
        self.plant("platform/Foundation.h")
        self.assertEqual(problems_of_platform(self.root), [])

        self.plant("runtime/objects/Foundation.cpp", '"platform/Foundation.h"')
        self.assertEqual(len(problems_of_platform(self.root)), 1)


class PlantedName(PlantedFiles):
    def test_of_two_headers_is_found(self):
        self.plant("platform/Clock.h")
        self.plant("tests/deep/Watch.h")
        self.assertEqual(repeated_header_names(self.root), [])

        self.plant("tests/deep/Clock.h")
        self.assertEqual(repeated_header_names(self.root), ["Clock.h"])


class PlantedQueue(PlantedFiles):
    def test_is_found_also_behind_other_headers(self):
        self.plant("platform/Queue.h", "<dispatch/dispatch.h>")
        self.plant("platform/List.h", '"platform/Queue.h"')
        self.plant("settings/Cell.h", '"platform/List.h"', '"settings/Cell.h"')
        self.plant("settings/Cell.cpp", '"settings/Cell.h"')
        self.plant("settings/Text.cpp", "<string>")

        self.assertEqual(queueing_sources(self.root), ["settings/Cell.cpp"])


if __name__ == "__main__":
    unittest.main()
