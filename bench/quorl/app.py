#!/usr/bin/env python3
"""Compares the companion app with a window of Qt that shows the same texts, in turns: until there is a picture of it,
and in memory once nothing goes on. And with itself: over a large music folder and over an empty one.

    tests/session-run bench/quorl/app.py build/bench/bin [ROUNDS]

The large folder has 50,000 songs in 2,500 directories and 1,000 playlists with 100 entries each. Each figure is a line
of JSON: medians, and the ratios of the quarter of the rounds that did best and of the quarter that did worst.
"""

import json
import os
import pathlib
import select
import statistics
import subprocess
import sys
import tempfile
import time

ALBUMS = 2500
SONGS_EACH = 20
PLAYLISTS = 1000
ENTRIES_EACH = 100
MEBI = 2**20
PATIENCE = 60  # seconds
PLAIN = "a window of Qt with the same texts"


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


def compare(what, beside, unit, rounds, ours, theirs):
    """Prints the figures that both give in turns."""
    pairs = [(ours(), theirs()) for _ in range(rounds)]
    ratios = [ours / theirs for ours, theirs in pairs]
    best, middle, worst = statistics.quantiles(ratios, n=4)
    print(json.dumps({"what": what, "beside": beside, "ratio": round(middle, 3),
                      "spread": [round(best, 3), round(worst, 3)], "rounds": rounds,
                      unit: [round(statistics.median(figures), 4) for figures in zip(*pairs)]}), flush=True)


def picture_of(command, picture):
    """Seconds by the clock until a program has written its picture, and of the processor until it has ended.

    The picture goes into a pipe of that name.
    """
    with open(os.open(picture, os.O_RDONLY | os.O_NONBLOCK), "rb") as pipe:
        began = time.monotonic()
        process = subprocess.Popen(command, stdout=subprocess.DEVNULL, stderr=subprocess.DEVNULL)
        with open(os.pidfd_open(process.pid), "rb") as end:
            select.select([pipe, end], [], [])  # it may end before it opens the pipe
        os.set_blocking(pipe.fileno(), True)
        written = pipe.read()
        seconds = time.monotonic() - began
    _, status, usage = os.wait4(process.pid, 0)
    process.returncode = os.waitstatus_to_exitcode(status)
    if process.returncode != 0 or not written:
        sys.exit(f"app.py: {command[0]} ended with {process.returncode}, with {len(written)} bytes of a picture")
    return seconds, usage.ru_utime + usage.ru_stime


def figure_of(pid, file, name):
    """A figure that the kernel has of a process."""
    for line in pathlib.Path(f"/proc/{pid}/{file}").read_text().splitlines():
        if line.startswith(f"{name}:"):
            return int(line.split()[1])
    raise ValueError(name)


def share(pid):
    """Of the memory that is in use, in MiB: what is shared counts for each of its users in part."""
    return figure_of(pid, "smaps_rollup", "Pss") * 1024 / MEBI


def at_rest(command):
    """The memory of a program once that stays what it is."""
    process = subprocess.Popen(command, stdin=subprocess.DEVNULL, stdout=subprocess.DEVNULL,
                               stderr=subprocess.DEVNULL)
    try:
        before, now, end = -1.0, 0.0, time.monotonic() + PATIENCE
        while before != now and time.monotonic() < end:
            time.sleep(2)
            before, now = now, share(process.pid)
        return now
    finally:
        process.terminate()
        process.wait()


def read_until(stream, text):
    for line in stream:
        if text in line:
            return
    sys.exit(f"app.py: quorl ended before it wrote: {text}")


def with_all_playlists(quorl, folder):
    """The memory of the app when the chooser is on the screen, in a terminal."""
    with subprocess.Popen([quorl, "--text", "--music", folder], text=True,
                          stdin=subprocess.PIPE, stdout=subprocess.PIPE, stderr=subprocess.DEVNULL) as process:
        process.stdin.write("1\n?\n")
        process.stdin.flush()
        read_until(process.stdout, "A number chooses the row")
        figure = share(process.pid)
        process.stdin.close()
        process.stdout.read()
    return figure


def main():
    programs = pathlib.Path(sys.argv[1])
    rounds = int(sys.argv[2]) if len(sys.argv) > 2 else 11
    quorl, plain = programs / "quorl", programs / "plain-window"
    os.environ["QT_QPA_PLATFORM"] = "offscreen"
    # Not in /tmp: the app watches what is above the folder, too, and for whoever watches a directory the kernel goes
    # through all names that were ever looked for there.
    with tempfile.TemporaryDirectory(dir=programs) as place:
        empty, large, picture = (pathlib.Path(place, name) for name in ("empty", "large", "picture.png"))
        empty.mkdir()
        shown = subprocess.run([quorl, "--text", "--music", empty], input="q\n", text=True, check=True,
                               capture_output=True).stdout
        texts = [line.strip() for line in shown.splitlines() if line.strip()]
        os.mkfifo(picture)
        starts = [[quorl, "--screenshot", picture, "--music", empty], [plain, "--picture", picture, *texts]]
        for command in starts:
            picture_of(command, picture)  # from now on the files are in memory
        for which, what in enumerate(("start until there is a picture", "the same, processor time")):
            compare(what, PLAIN, "seconds", rounds, *(lambda it=it: picture_of(it, picture)[which] for it in starts))
        compare("memory at rest", PLAIN, "megabytes", 3, lambda: at_rest([quorl, "--music", empty]),
                lambda: at_rest([plain, *texts]))
        make_library(large)
        compare("memory over 50,000 songs", "the same over none", "megabytes", 3,
                lambda: with_all_playlists(quorl, large), lambda: with_all_playlists(quorl, empty))


main()
