#!/usr/bin/env python3
"""Compares what the companion app holds in memory over a large music folder and over an empty one.

    tests/session-run bench/quorl/memory.py build/release/bin/quorl [ROUNDS]

The large one has 50,000 songs in 2,500 directories and 1,000 playlists with 100 entries each. Both
are shown in turns; each figure is the median of all rounds, of the process's own (anonymous) pages
and of all that is resident, taken once the chooser with all playlists is on the screen.
"""

import pathlib
import statistics
import subprocess
import sys
import tempfile

ALBUMS = 2500
SONGS_EACH = 20
PLAYLISTS = 1000
ENTRIES_EACH = 100


def song(number):
    album, track = divmod(number, SONGS_EACH)
    return f"Artist number {album // 5}/Album number {album}/{track + 10} - A song of usual length.mp3"


def make_library(folder):
    songs = ALBUMS * SONGS_EACH
    for number in range(songs):
        path = folder / song(number)
        path.parent.mkdir(parents=True, exist_ok=True)
        path.write_text(str(number))
    for playlist in range(PLAYLISTS):
        # Far apart, and over all playlists every song.
        entries = [song((playlist + entry * 991) % songs) for entry in range(ENTRIES_EACH)]
        (folder / f"Playlist {playlist}.m3u8").write_text("#EXTM3U\n" + "\n".join(entries) + "\n")


def read_until(stream, text):
    for line in stream:
        if text in line:
            return
    sys.exit(f"quorl ended before it wrote: {text}")


def resident(pid):
    """In KiB: anonymous, all."""
    figures = {}
    for line in pathlib.Path(f"/proc/{pid}/status").read_text().splitlines():
        name, _, value = line.partition(":")
        figures[name] = value.split()[0] if value.split() else ""
    return int(figures["RssAnon"]), int(figures["VmRSS"])


def measure(quorl, folder):
    with subprocess.Popen([quorl, "--text", "--music", folder], text=True,
                          stdin=subprocess.PIPE, stdout=subprocess.PIPE) as process:
        process.stdin.write("1\n?\n")
        process.stdin.flush()
        read_until(process.stdout, "A number taps the row")
        figures = resident(process.pid)
        process.stdin.close()
        process.stdout.read()
    return figures


def main():
    quorl = sys.argv[1]
    rounds = int(sys.argv[2]) if len(sys.argv) > 2 else 5
    with tempfile.TemporaryDirectory() as place:
        folders = {"empty": pathlib.Path(place, "empty"), "large": pathlib.Path(place, "large")}
        folders["empty"].mkdir()
        make_library(folders["large"])
        figures = {name: [] for name in folders}
        for _ in range(rounds):
            for name, folder in folders.items():
                figures[name].append(measure(quorl, folder))
    for index, what in enumerate(("own pages", "resident")):
        empty, large = (statistics.median(each[index] for each in figures[name]) / 1024
                        for name in ("empty", "large"))
        print(f"{what}: {empty:.1f} MiB empty, {large:.1f} MiB large: "
              f"{large - empty:.1f} MiB more, {large / empty:.2f} times")


main()
