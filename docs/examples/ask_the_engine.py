#!/usr/bin/python3
"""Asks the sync engine for a sync, or to remove its music, and tells how that goes until it is done.

    docs/examples/ask_the_engine.py StartNow
    docs/examples/ask_the_engine.py RemoveMusic

Wants nothing but PyGObject. Ends with 1 where it was not done; the last line says why.
"""

import sys

from gi.repository import Gio, GLib

NAME = "org.quorl.Velora.Sync"
PATH = "/org/quorl/Velora/Sync"
OBJECTS = {"StartNow": "Engine", "RemoveMusic": "Wearable"}


class Conversation:
    def __init__(self, method):
        self.method = method
        self.is_asked = False
        self.loop = GLib.MainLoop()
        self.end = (False, "The sync engine has gone away.")
        # Starts the engine where it does not run yet.
        self.engine = Gio.DBusProxy.new_for_bus_sync(
            Gio.BusType.SESSION, Gio.DBusProxyFlags.NONE, None, NAME, f"{PATH}/Engine", f"{NAME}.Engine")
        self.bus = self.engine.get_connection()

    def hold(self):
        """Listens first, for a sync may be over before the answer to the question is read."""
        self.engine.connect("g-properties-changed", lambda *_: self.ask())
        self.engine.connect("notify::g-name-owner", lambda *_: self.loop.quit())
        self.listen("org.freedesktop.DBus.Properties", "PropertiesChanged", f"{NAME}.Session", self.session_did_change)
        self.listen(f"{NAME}.Session", "Completed", None, self.session_did_finish)
        GLib.idle_add(self.ask)
        if self.engine.get_name_owner():
            self.loop.run()
        return self.end

    def listen(self, interface, signal, first_argument, act):
        self.bus.signal_subscribe(
            NAME, interface, signal, None, first_argument, Gio.DBusSignalFlags.NONE,
            lambda _bus, _sender, _path, _interface, _signal, arguments: act(*arguments.unpack()))

    def ask(self):
        """Once the engine has looked at music and wearable, of which it knows nothing at first."""
        state = self.engine.get_cached_property("SyncState")
        if self.is_asked or not state or state.unpack() == "unknown":
            return
        self.is_asked = True
        place = OBJECTS[self.method]
        try:
            self.bus.call_sync(NAME, f"{PATH}/{place}", f"{NAME}.{place}", self.method, None, None,
                               Gio.DBusCallFlags.NONE, -1, None)
        except GLib.Error as error:
            name = Gio.DBusError.get_remote_error(error)
            self.session_did_finish(False, error.message.removeprefix(f"GDBus.Error:{name}: "))

    def session_did_change(self, _interface, properties, _invalidated):
        if properties.get("CurrentItem"):
            print(f"{properties.get('Progress', 0):.0%} {properties['CurrentItem']}", flush=True)

    def session_did_finish(self, success, message):
        self.end = (success, message)
        self.loop.quit()


def main():
    if len(sys.argv) != 2 or sys.argv[1] not in OBJECTS:
        sys.exit(__doc__)
    success, message = Conversation(sys.argv[1]).hold()
    print(message)
    sys.exit(not success)


main()
