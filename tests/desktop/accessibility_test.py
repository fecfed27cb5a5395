"""What a screen reader finds on the accessibility bus, and how far it gets by press actions alone."""

import os
import pathlib
import re
import subprocess
import time
import unittest

import gi

gi.require_version("Atspi", "2.0")
from gi.repository import Atspi, Gio, GLib

ROOT = pathlib.Path(__file__).resolve().parents[2]
BUILD = pathlib.Path(os.environ["BUILD"])
PATIENCE = 60  # seconds
NAME, CHECKED = "object:property-change:accessible-name", "object:state-changed:checked"


def offer_accessibility_bus():
    """From here on the session's bus starts it when it is asked for."""
    service = "dbus-1/services/org.a11y.Bus.service"
    pathlib.Path(os.environ["XDG_DATA_HOME"], service).symlink_to(f"/usr/share/{service}")
    Gio.bus_get_sync(Gio.BusType.SESSION).call_sync(
        "org.freedesktop.DBus", "/", "org.freedesktop.DBus", "ReloadConfig", None, None, 0, -1, None)


def everything_in(element):
    """The element, and all below it that is there."""
    yield element
    for index in range(element.get_child_count()):
        child = element.get_child_at_index(index)
        if child:
            yield from everything_in(child)


def has(element, state):
    return element.get_state_set().contains(state)


def is_checked(element):
    return has(element, Atspi.StateType.CHECKED)


def is_showing(element):
    return has(element, Atspi.StateType.SHOWING)


class ScreenReader(unittest.TestCase):
    @classmethod
    def setUpClass(cls):
        offer_accessibility_bus()
        display = subprocess.Popen(["Xvfb", "-displayfd", "1", "-nolisten", "tcp"],
                                   stdout=subprocess.PIPE, text=True)
        cls.addClassCleanup(cls.end, display)
        os.environ["DISPLAY"] = f":{display.stdout.readline().strip()}"
        Atspi.init()

    @staticmethod
    def end(process):
        process.terminate()
        process.communicate()

    def setUp(self):
        self.told = []
        self.listener = Atspi.EventListener.new(self.told.append)
        for kind in (NAME, CHECKED):
            self.listener.register(kind)
            self.addCleanup(self.listener.deregister, kind)
        self.music = pathlib.Path(os.environ["HOME"], self.id(), "Music")
        self.music.parent.mkdir()
        subprocess.run([ROOT / "tools/make-demo-library", self.music], check=True, capture_output=True)
        quorl = subprocess.Popen([BUILD / "bin/quorl", "--music", self.music],
                                 env={**os.environ, "QT_LINUX_ACCESSIBILITY_ALWAYS_ON": "1"})
        self.addCleanup(self.end, quorl)
        self.wait_for_pane("Music")

    def until(self, condition, what):
        """What the condition gives back as soon as that is something."""
        end = time.monotonic() + PATIENCE
        wake = GLib.timeout_add(50, lambda: GLib.SOURCE_CONTINUE)
        try:
            while time.monotonic() < end:
                found = self.looked_at(condition)
                if found:
                    return found
                GLib.MainContext.default().iteration(True)
        finally:
            GLib.source_remove(wake)
        self.fail(f"{what}; there is: {self.looked_at(self.described)}")

    @staticmethod
    def looked_at(condition):
        try:
            return condition()
        except GLib.Error:
            return None  # what was looked at has just gone

    def showing(self):
        """All that a person sees of the app, as it is now."""
        desktop = Atspi.get_desktop(0)
        for index in range(desktop.get_child_count()):
            app = desktop.get_child_at_index(index)
            if app and app.get_name() == "quorl":
                app.set_cache_mask(Atspi.Cache.NONE)
                yield from filter(is_showing, everything_in(app))

    def described(self):
        """Role, name and description of all that a person sees."""
        return [(each.get_role_name(), each.get_name(), each.get_description())
                for each in self.showing()]

    def element(self, role, name=".*"):
        def find():
            return next((each for each in self.showing() if each.get_role_name() == role
                         and re.fullmatch(name, each.get_name())), None)
        return self.until(find, f"no {role} {name!r}")

    def wait_for_rows(self, *wanted):
        """They are the last ones."""
        def are_last():
            rows = [line for line in self.described() if re.search(r"\d of \d", line[2])]
            return rows[-len(wanted):] == list(wanted)
        self.until(are_last, f"no rows {wanted}")

    def wait_for_pane(self, title):
        def is_the_only_list():
            return [name for role, name, _ in self.described() if role == "list"] == [title]
        self.until(is_the_only_list, f"no pane {title!r}")

    def press(self, role, name):
        element = self.element(role, name)
        self.assertEqual((element.get_action_name(0), element.do_action(0)), ("Press", True))
        return element

    def open(self, button, title):
        self.press("push button", button)
        self.wait_for_pane(title)
        self.told.clear()

    def wait_for_news(self, *wanted):
        """Kind, role and name of all that was told since the pane was opened, as soon as what is
        wanted is among it."""
        def news():
            return {(event.type, event.source.get_role_name(), event.source.get_name())
                    for event in self.told}
        return self.until(lambda: news() >= set(wanted) and news(), f"no news of {wanted}")

    def choose(self, name, instead_of):
        """Nothing but the two rows may be told of."""
        row = self.press("list item", name)
        changed = [(CHECKED, "list item", each) for each in (instead_of, name)]
        self.assertEqual(self.wait_for_news(*changed), set(changed))
        self.assertTrue(is_checked(row))

    def switch_charger(self, *news):
        switch = self.element("check box", "Simulated Charger")
        was_on = is_checked(switch)
        self.press("check box", "Simulated Charger")
        told = self.wait_for_news((CHECKED, "check box", "Simulated Charger"), *news)
        self.assertNotEqual(is_checked(switch), was_on)
        return told

    def test_gets_by_press_alone_from_a_playlist_and_a_limit_to_a_sync(self):
        self.wait_for_rows(("push button", "Synced Playlist", "None, 1 of 2"),
                           ("push button", "Playlist Limit", "500 MB, 2 of 2"))
        self.open("Back to Velora", "Velora")
        self.switch_charger()
        self.open("Music", "Music")
        self.open("Synced Playlist", "Synced Playlist")
        self.wait_for_rows(("list item", "None", "9 of 9"))
        self.choose("Road Trip", instead_of="None")
        self.open("Back to Music", "Music")
        self.open("Playlist Limit", "Playlist Limit")
        self.choose("1 GB", instead_of="500 MB")
        self.open("Back to Music", "Music")
        self.wait_for_rows(("push button", "Synced Playlist", "Sync Pending…, 1 of 2"),
                           ("push button", "Playlist Limit", "1 GB, 2 of 2"))
        self.open("Back to Velora", "Velora")
        told = self.switch_charger((NAME, "paragraph", "Everything is up to date."))
        self.assertEqual({role for kind, role, _ in told if kind == NAME}, {"paragraph"})

    def test_has_one_frame_and_a_notice_that_can_be_put_away(self):
        self.music.rename(self.music.with_name("Elsewhere"))
        self.element("notification", "There is no music folder at .*")
        self.until(lambda: [line for line in self.described() if line[0] == "frame"]
                   == [("frame", "Velora", "")], "not the one frame")
        self.press("push button", "Put the notice away")
        self.until(lambda: "notification" not in [role for role, _, _ in self.described()],
                   "the notice stays")


if __name__ == "__main__":
    unittest.main()
