"""Drives the Music pane with quorl-script: a sync runs while the user looks at the chooser.

Usage: drive_the_pane.py [PROGRAM]
"""

import json
import subprocess
import sys


class Pane:
    """A running quorl-script. Each call is one command; its reply comes back as a dictionary."""

    def __init__(self, program="quorl-script"):
        self._process = subprocess.Popen(
            [program], stdin=subprocess.PIPE, stdout=subprocess.PIPE, encoding="utf-8")

    def __enter__(self):
        return self

    def __exit__(self, *_):
        self._process.stdin.close()
        self._process.wait()
        self._process.stdout.close()

    def __call__(self, command, **fields):
        self._process.stdin.write(json.dumps({"do": command, **fields}) + "\n")
        self._process.stdin.flush()
        reply = json.loads(self._process.stdout.readline())
        if not reply["ok"]:
            raise ValueError(f"{command}: {reply['error']}")
        return reply


def shown(pane):
    """The rows of the top pane as a person reads them."""
    for section in pane("snapshot")["stack"][-1]["sections"]:
        for cell in section["cells"]:
            mark = "x" if cell["accessory"] else " "
            yield f"[{mark}] {cell['title']:8} {cell['detail'] or ''}".rstrip()


def session(done, total):
    task = {"id": "songs", "group": "asset", "running": done < total, "total": total,
            "completed": done, "progress": done / total}
    return [{"id": "sync", "finished": done == total, "tasks": [task]}]


def main(program):
    with Pane(program) as pane:
        pane("trace", classes=[])
        pane("library", media=["music"], playlists=[
            {"id": "1", "name": "Quiet", "revision": 1, "items": [4_000_000] * 8},
            {"id": "2", "name": "Loud", "revision": 5, "items": [6_000_000] * 4}])
        pane("prefs", set={"assetSyncLimitType": 1, "assetSyncLimit": 50})
        pane("open")
        pane("tap", specifier="Synced Playlist")
        print("At first:", *shown(pane), sep="\n")

        pane("tap", path=[0, 1])
        print("\nThe user picks Loud:", *shown(pane), sep="\n")

        for done in (1, 2, 3):
            pane("sessions", list=session(done, 4))
            pane("advance", seconds=1.5)
            print(f"\n{done} of 4 songs are there:", *shown(pane), sep="\n")

        pane("sessions", list=session(4, 4))
        pane("prefs", set={"lastFullySentAssetSyncPlaylistPersistentID": "2",
                           "lastFullySentAssetSyncPlaylistVersion": 5})
        rows = list(shown(pane))
        print("\nThe sync is done:", *rows, sep="\n")
        return 0 if "[x] Loud     Synced" in rows else 1


if __name__ == "__main__":
    sys.exit(main(*sys.argv[1:2] or ["quorl-script"]))
