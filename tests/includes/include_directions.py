"""Keeps the directions in which the folders of this project may include one another."""

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

QT = r"Q[A-Z]\w*|Qt\w*/.*"
SERVICES = r"gio/.*|gio-unix.*|sdbus-c\+\+/.*|dbus/.*|systemd/sd-bus\.h"
NOTHING = r"(?!)"
ANYTHING = r".*"


@dataclasses.dataclass(frozen=True)
class Rule:
    """What the files of one folder may include besides the C++ standard library."""

    folders: tuple  # folders of this project
    libraries: str = NOTHING  # headers from elsewhere
    but_not: str = NOTHING  # exceptions to these


HOST = ("platform", "runtime", "services")

RULES = {
    "platform": Rule(("platform",), libraries=r"dispatch/dispatch\.h"),
    "sync": Rule(("platform", "sync")),
    "settings": Rule(("platform", "sync", "settings")),
    "runtime": Rule(("platform", "runtime"), libraries=ANYTHING, but_not=f"{QT}|{SERVICES}"),
    "services": Rule(("services",), libraries=ANYTHING, but_not=QT),
    "quorl": Rule((*HOST, "quorl"), libraries=ANYTHING),
    "quorl-script": Rule((*HOST, "quorl-script"), libraries=ANYTHING),
    "quorl-syncd": Rule((*HOST, "quorl-syncd"), libraries=ANYTHING),
}

# Folders that may include whatever they like: nothing else may include them.
FREE = ("tests", "bench", "fuzz")

INCLUDE = re.compile(
    r'^\s*#\s*(?:include|import)(?:_next)?\s*(?:"([^"]+)"|<([^>]+)>|(.*))', re.MULTILINE)


def folder_of(root, including, included):
    """The folder of this project that an include leads into, or None where it leads elsewhere."""
    beside = (including.parent / included).resolve()
    if beside.is_relative_to(root) and beside.is_file():
        return beside.relative_to(root).parts[0]
    first = pathlib.PurePath(included).parts[0]
    return first if first in RULES or first in FREE else None


def is_allowed(rule, root, including, included):
    folder = folder_of(root, including, included)
    if folder:
        return folder in rule.folders
    if included in STANDARD:
        return True
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
        where = path.relative_to(root)
        if folder not in RULES:
            wrong.append(f"{where}: no rule says what {folder}/ may include")
            continue
        for quoted, angled, other in INCLUDE.findall(path.read_text(encoding="utf-8")):
            included = quoted or angled or other
            if other or not is_allowed(RULES[folder], root, path, included):
                wrong.append(f"{where}: may not include {included}")
    return wrong


class ThisProject(unittest.TestCase):
    def test_includes_only_in_the_right_directions(self):
        self.assertEqual(wrong_includes(ROOT), [])

    def test_has_sources_to_look_at(self):
        self.assertIn("platform", {folder for folder, _ in sources(ROOT)})


class PlantedInclude(unittest.TestCase):
    """Each line is an include in one folder, in a project that has the files named below."""

    FILES = (
        "platform/Foundation.h",
        "sync/SyncManager.h",
        "settings/Pane.h",
        "runtime/Loader.h",
        "services/media/MusicFolder.h",
        "quorl/window/MainWindow.h",
        "quorl-script/Script.h",
    )

    RIGHT = (
        ("platform/A.h", "<vector>"),
        ("platform/A.h", '"Foundation.h"'),
        ("platform/A.h", "<dispatch/dispatch.h>"),
        ("sync/A.cpp", '"platform/Foundation.h"'),
        ("sync/A.cpp", '"SyncManager.h"'),
        ("settings/A.cpp", '"sync/SyncManager.h"'),
        ("runtime/A.cpp", "<unicode/ulocale.h>"),
        ("runtime/A.cpp", "<dlfcn.h>"),
        ("services/media/A.cpp", '"MusicFolder.h"'),
        ("services/media/A.cpp", "<gio/gio.h>"),
        ("quorl/A.cpp", '"services/media/MusicFolder.h"'),
        ("quorl/A.cpp", "<QWidget>"),
        ("quorl-script/A.cpp", "<nlohmann/json.hpp>"),
        ("tests/A.cpp", '"sync/SyncManager.h"'),
    )

    WRONG = (
        ("platform/A.h", "<unistd.h>"),
        ("platform/A.h", '"sync/SyncManager.h"'),
        ("platform/A.h", '"runtime/Loader.h"'),
        ("sync/A.cpp", "<dispatch/dispatch.h>"),
        ("sync/A.cpp", '"settings/Pane.h"'),
        ("sync/A.cpp", '"../settings/Pane.h"'),
        ("sync/A.cpp", "<settings/Pane.h>"),
        ("sync/A.cpp", "<stdint.h>"),
        ("settings/A.cpp", '"runtime/Loader.h"'),
        ("settings/A.cpp", "<QString>"),
        ("settings/A.cpp", "CHOSEN_ELSEWHERE"),
        ("settings/deep/A.cpp", '"../../services/media/MusicFolder.h"'),
        ("runtime/A.cpp", "<QtCore/QString>"),
        ("runtime/A.cpp", "<QString>"),
        ("runtime/A.cpp", "<gio/gio.h>"),
        ("runtime/A.cpp", "<sdbus-c++/sdbus-c++.h>"),
        ("runtime/A.cpp", '"sync/SyncManager.h"'),
        ("runtime/A.cpp", '"services/media/MusicFolder.h"'),
        ("services/media/A.cpp", "<QString>"),
        ("services/media/A.cpp", '"platform/Foundation.h"'),
        ("quorl/A.cpp", '"sync/SyncManager.h"'),
        ("quorl/A.cpp", '"settings/Pane.h"'),
        ("quorl/A.cpp", '"quorl-script/Script.h"'),
        ("quorl-script/A.cpp", '"quorl/window/MainWindow.h"'),
        ("quorl-syncd/A.cpp", '"../quorl/MainWindow.h"'),
        ("quorl/A.cpp", '"tests/Fake.h"'),
        ("elsewhere/A.cpp", "<vector>"),
    )

    def wrong_includes_with(self, where, included):
        with tempfile.TemporaryDirectory() as folder:
            root = pathlib.Path(folder).resolve()
            for path in self.FILES:
                (root / path).parent.mkdir(parents=True, exist_ok=True)
                (root / path).touch()
            (root / where).parent.mkdir(parents=True, exist_ok=True)
            (root / where).write_text(f"#pragma once\n\n#  include {included}\n", encoding="utf-8")
            return wrong_includes(root)

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


if __name__ == "__main__":
    unittest.main()
