"""Builds the pane's most frequent operations for release, and counts the instructions of each: by an emulator, so
that a figure is the same in each run and on each machine."""

import pathlib
import subprocess
import sys
import tempfile

ROOT = pathlib.Path(__file__).resolve().parents[2]
QEMU = {"x86_64": "qemu-x86_64", "armhf": "qemu-arm", "arm64": "qemu-aarch64"}
PROGRAM = "hot-operations"
BURST = "hot-burst"
TURNS = (100, 300)  # what starting and ending take is in both


def output(*command):
    return subprocess.run(command, cwd=ROOT, check=True, stdout=subprocess.PIPE, text=True).stdout


def built(target, *others):
    """The folder of a build for a kind of machine, with the operations and what else is named."""
    folder = ROOT / f"build/costs-{target}"
    print(f"Building for {target} ...", file=sys.stderr)
    # Qt brings tools of its own that are programs of that machine.
    emulated = [] if target == "x86_64" else ["tools/emulate", target]
    output(*emulated, "cmake", "--preset", folder.name)
    output(*emulated, "cmake", "--build", folder, "--target", PROGRAM, *others)
    return folder


def file_of(folder, target):
    """What a target of the build has made."""
    return next(path for pattern in (f"bin/{target}", f"**/lib{target}.so*", f"**/{target}.so", f"**/{target}")
                for path in sorted(folder.glob(pattern)) if path.is_file() and not path.is_symlink())


def operations(program):
    """The operations of a program, and what to hold each against, where there is such a one."""
    lines = (line.partition("\t") for line in output(program).splitlines())
    return {name: beside for name, _, beside in lines}


class Counter:
    """Counts what programs of a kind of machine execute."""

    def __init__(self, folder):
        self._folder = pathlib.Path(folder)
        self._plugin = self._folder / "count.so"
        output("g++", "-std=c++20", "-shared", "-fPIC", "-o", self._plugin, "bench/hot/CountInstructions.cpp")

    def per_turn(self, target, program, operation):
        first, second = (self._instructions(target, program, operation, str(turns)) for turns in TURNS)
        return (second - first) / (TURNS[1] - TURNS[0])

    def _instructions(self, target, program, *arguments):
        log = self._folder / "log"
        root = [] if target == "x86_64" else ["-L", output("tools/sysroot", target, "--prefix").strip()]
        output(QEMU[target], *root, "-plugin", f"file={self._plugin}", "-d", "plugin", "-D", log, program, *arguments)
        return int(log.read_text())


def counted():
    """The instructions of each operation on this machine, and what to hold it against."""
    folder = built("x86_64", BURST)
    now, besides = {}, {}
    with tempfile.TemporaryDirectory() as scratch:
        counter = Counter(scratch)
        for program in (file_of(folder, target) for target in (PROGRAM, BURST)):
            for name, beside in operations(program).items():
                now[name] = round(counter.per_turn("x86_64", program, name))
                besides[name] = beside
    return now, besides
