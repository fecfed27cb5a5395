"""Runs the tests that can notice an edit, the likeliest first, and stops at the first that fails."""

import collections.abc
import dataclasses
import enum
import math
import os
import pathlib
import runpy
import signal
import subprocess
import threading
import time
import types

from .build import Build, BuildError, Copy

SCRIPTS = "scenarios"
"""Stands among test programs for all scripts in tests/scenarios."""
SCRIPT_PROGRAM = "quorl-script"
PATIENCE = 1800  # seconds for a test of which nothing is known
MEMORY = 4 * 1024 ** 3  # bytes that a test may take; the sanitizers reserve more and have a limit of their own


class Outcome(enum.Enum):
    CAUGHT = "caught"
    TIMED_OUT = "timed out"
    SURVIVED = "survived"
    NOT_COMPILED = "did not compile"


@dataclasses.dataclass(frozen=True)
class Verdict:
    outcome: Outcome
    test: str = ""
    """Which test noticed."""


@dataclasses.dataclass(frozen=True)
class Run:
    """How a test is run: its program with one list of options after another, each at most `limit` seconds."""

    test: str
    options: list[list[str]]
    limit: float


class TimedOut(Exception):
    """A test took far longer than without an edit."""


def passes(command: list[str], folder: pathlib.Path, limit: float) -> tuple[bool, bytes]:
    """Whether a command ends well, and what it printed."""
    environment = os.environ | {"ASAN_OPTIONS": "malloc_context_size=1:hard_rss_limit_mb=2048"}
    with subprocess.Popen(command, cwd=folder, env=environment, stdin=subprocess.DEVNULL,
                          stdout=subprocess.PIPE, stderr=subprocess.DEVNULL, start_new_session=True) as process:
        try:
            output, _ = process.communicate(timeout=limit)
        except subprocess.TimeoutExpired as error:
            raise TimedOut from error
        finally:
            end_group(process.pid)
    return process.returncode == 0, output


def end_group(leader: int) -> None:
    """What a test has started and left behind must not outlive it."""
    try:
        os.killpg(leader, signal.SIGKILL)
    except ProcessLookupError:
        pass


class Tests:
    """The tests of a build: how each is run, and how long it takes without an edit."""

    def __init__(self, build: Build) -> None:
        self._build = build
        self._is_sanitized = "-fsanitize=" in (build.folder / "compile_commands.json").read_text()
        self._runs: dict[str, Run] = {}
        self._lock = threading.Lock()

    def try_edit(self, copy: Copy, source: str, content: bytes, tests: list[str]) -> Verdict:
        """What becomes of a source with this content."""
        with copy.edited(source, content) as compiles:
            if not compiles:
                return Verdict(Outcome.NOT_COMPILED)
            for test in tests:
                try:
                    if not copy.link(program_of(test)):
                        return Verdict(Outcome.NOT_COMPILED)
                    if not self._passes(copy.folder, self.run_unedited(test)):
                        return Verdict(Outcome.CAUGHT, test)
                except TimedOut:
                    return Verdict(Outcome.TIMED_OUT, test)
            return Verdict(Outcome.SURVIVED)

    def run_unedited(self, test: str) -> Run:
        """How a test is run, which is tried once: it has to pass in the build itself."""
        with self._lock:
            if test not in self._runs:
                self._runs[test] = self._first_run(test)
            return self._runs[test]

    def _first_run(self, test: str) -> Run:
        for options in self._ways(test):
            seconds = [self._seconds(test, one) for one in options]
            if seconds and None not in seconds:
                return Run(test, options, 20 + 10 * max(seconds))
        raise BuildError(f"{test} fails without an edit.")

    def _seconds(self, test: str, options: list[str]) -> float | None:
        """How long a test runs without an edit; none where it fails."""
        began = time.monotonic()
        succeeded = self._passes(self._build.folder, Run(test, [options], PATIENCE))
        return time.monotonic() - began if succeeded else None

    def _ways(self, test: str) -> collections.abc.Iterator[list[list[str]]]:
        if test == SCRIPTS:
            yield [[str(script)] for script in sorted((self._build.root / "tests/scenarios").glob("*.jsonl"))]
            return
        # Quickest in one process; but some cases want one of their own.
        cases = self._cases(test)
        apart = self._failing(test)
        yield [gtest(f"-{':'.join(apart)}"), *map(gtest, apart)]
        yield list(map(gtest, cases))

    def _cases(self, test: str) -> list[str]:
        """The names of all cases of a test program."""
        _, output = passes([str(self._build.folder / "bin" / test), "--gtest_list_tests"],
                           self._build.folder, PATIENCE)
        cases, suite = [], ""
        for line in output.decode().splitlines():
            name = line.split("#")[0]
            if name.startswith("  "):
                cases.append(suite + name.strip())
            elif name.strip().endswith("."):
                suite = name.strip()
        return [case for case in cases if "DISABLED_" not in case]

    def _failing(self, test: str) -> list[str]:
        """The cases that fail where all run in one process."""
        _, output = passes([str(self._build.folder / "bin" / test), "--gtest_brief=1"], self._build.folder, PATIENCE)
        lines = (line.split() for line in output.decode(errors="replace").splitlines())
        return sorted({words[3].rstrip(",") for words in lines if words[:3] == ["[", "FAILED", "]"] and "." in words[3]})

    def _passes(self, folder: pathlib.Path, run: Run) -> bool:
        program = str(folder / "bin" / program_of(run.test))
        play = loaded(self._build.root / "tests/scenarios/play.py") if run.test == SCRIPTS else None
        for options in run.options:
            succeeded, output = passes([*self._bounds(run), program, *options], folder, run.limit)
            if not (replies_as_expected(play, program, options[0], succeeded, output) if play else succeeded):
                return False
        return bool(run.options)

    def _bounds(self, run: Run) -> list[str]:
        """What holds a test that went astray even where nobody is left to end it."""
        memory = [] if self._is_sanitized else [f"--as={MEMORY}"]
        return ["prlimit", f"--cpu={math.ceil(run.limit)}", "--core=0", *memory]


def gtest(cases: str) -> list[str]:
    """The options of a test program for these cases: a list with colons, after a minus all but them."""
    return ["--gtest_brief=1", "--gtest_fail_fast", f"--gtest_filter={cases}"]


def replies_as_expected(play: types.SimpleNamespace, program: str, script: str, succeeded: bool, output: bytes) -> bool:
    """What play.py, which is given, finds; but of one run."""
    expected = play.lines(play.expected_file(program, script))
    has_errors = any('"ok":false' in reply for reply in expected)
    try:
        replies = output.decode().split("\n")[:-1]
        return succeeded != has_errors and not any(play.differences(play.lines(script), expected, replies))
    except ValueError:  # no JSON
        return False


def loaded(path: pathlib.Path) -> types.SimpleNamespace:
    """What a file of Python defines."""
    return types.SimpleNamespace(**runpy.run_path(str(path)))


def program_of(test: str) -> str:
    return SCRIPT_PROGRAM if test == SCRIPTS else test
