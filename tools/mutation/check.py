"""Tries edits on both cores, and keeps what became of each."""

import collections.abc
import concurrent.futures
import dataclasses
import hashlib
import json
import os
import pathlib
import random
import threading
import time

from .build import Build, BuildError, Copy, Preambles
from .coverage import Reach
from .edits import Edit, edits_of
from .plan import Entry, ListError, Suite
from .trials import SCRIPTS, Outcome, Tests, Verdict, program_of

SAMPLED_OF_A_SOURCE = 3


@dataclasses.dataclass(frozen=True)
class Tried:
    """An edit and what became of it."""

    suite: Suite
    edit: Edit
    verdict: Verdict
    seconds: float = 0


class Sources:
    """The edits of each source, less those that change nothing."""

    def __init__(self, build: Build, entries: list[Entry]) -> None:
        self._build = build
        self._entries = entries
        self._read: dict[str, tuple[bytes, list[Edit], int]] = {}

    def size(self, source: str) -> int:
        return (self._build.root / source).stat().st_size

    def content(self, source: str) -> bytes:
        return self._of(source)[0]

    def edits(self, source: str) -> list[Edit]:
        return self._of(source)[1]

    def equivalent(self, source: str) -> int:
        """How many of a source were left out until now."""
        return self._read[source][2] if source in self._read else 0

    def _of(self, source: str) -> tuple[bytes, list[Edit], int]:
        if source not in self._read:
            self._read[source] = self._examine(source)
        return self._read[source]

    def _examine(self, source: str) -> tuple[bytes, list[Edit], int]:
        content = (self._build.root / source).read_bytes()
        found = edits_of(self._build.root, source, self._build.arguments_for_clang(source))
        listed = [entry for entry in self._entries if entry.source == source]
        known = [edit for edit in found if any(entry.matches(edit, content) for entry in listed)]
        for entry in listed:
            if not any(entry.matches(edit, content) for edit in known):
                raise ListError(f"tests/mutations/equivalent.txt: no edit of {source} {entry.function} is "
                                + "\n".join(("this (any more):", *entry.diff)))
        return content, [edit for edit in found if edit not in known], len(known)


class Results:
    """What became of edits in earlier runs. That one was caught holds as long as its source is the same;
    that one survived, as long as the tests are, too."""

    def __init__(self, file: pathlib.Path, build: Build) -> None:
        self._file = file
        self._build = build
        self._tests: dict[str, str] = {}
        self._known: dict[str, dict] = {}
        if file.exists():
            for line in file.read_text().splitlines():
                if line.endswith("}"):  # one may have been cut off
                    result = json.loads(line)
                    self._known[result["edit"]] = result

    def find(self, suite: Suite, edit: Edit, content: bytes) -> Verdict | None:
        result = self._known.get(self._key(edit, content))
        if result is None:
            return None
        verdict = Verdict(Outcome(result["outcome"]), result["test"])
        is_open = verdict.outcome == Outcome.SURVIVED and result["tests"] != self._digest_of_tests(suite)
        return None if is_open else verdict

    def keep(self, tried: Tried, content: bytes) -> None:
        result = {"edit": self._key(tried.edit, content), "outcome": tried.verdict.outcome.value,
                  "test": tried.verdict.test, "tests": self._digest_of_tests(tried.suite)}
        with self._file.open("a") as file:
            file.write(json.dumps(result) + "\n")

    def _key(self, edit: Edit, content: bytes) -> str:
        return f"{edit.source} {hashlib.sha256(content).hexdigest()[:16]} {edit.start} {edit.end} {edit.text}"

    def _digest_of_tests(self, suite: Suite) -> str:
        if suite.name not in self._tests:
            digest = hashlib.sha256()
            for path in self._files_of_tests(suite):
                digest.update(path.read_bytes())
            self._tests[suite.name] = digest.hexdigest()[:16]
        return self._tests[suite.name]

    def _files_of_tests(self, suite: Suite) -> list[pathlib.Path]:
        files = [self._build.folder / "bin" / program_of(test) for test in suite.tests]
        if missing := [file.name for file in files if not file.exists()]:
            raise BuildError(f"{self._build.folder} has no {', '.join(missing)}: build it whole, or say no --build.")
        return files + sorted((self._build.root / "tests/scenarios").glob("*.*") if SCRIPTS in suite.tests else [])


def everything(suites: list[Suite], sources: Sources) -> collections.abc.Iterator[tuple[Suite, Edit]]:
    """All edits suite by suite, those of small sources first."""
    for suite in suites:
        for source in sorted(suite.sources, key=sources.size):
            for edit in sources.edits(source):
                yield suite, edit


def sample(suites: list[Suite], sources: Sources, seed: int) -> collections.abc.Iterator[tuple[Suite, Edit]]:
    """A few edits of one source after another, as the seed has it."""
    chance = random.Random(seed)
    pairs = [(suite, source) for suite in suites for source in suite.sources]
    chance.shuffle(pairs)
    for suite, source in pairs:
        edits = sources.edits(source)
        for edit in chance.sample(edits, min(SAMPLED_OF_A_SOURCE, len(edits))):
            yield suite, edit


class Check:
    """Tries edits until none is left or the time is over."""

    def __init__(self, build: Build, sources: Sources, reach: Reach, folder: pathlib.Path) -> None:
        self._build = build
        self._sources = sources
        self._reach = reach
        self._folder = folder
        self._preambles = Preambles(build, folder / "preambles")
        self._tests = Tests(build)
        self._lock = threading.Lock()

    def run(self, edits: collections.abc.Iterator[tuple[Suite, Edit]], results: Results, seconds: float,
            remembers: bool, tell: collections.abc.Callable[[Tried], None]) -> list[Tried]:
        """What became of each edit; where it `remembers`, what is known from earlier is not tried again."""
        until = time.monotonic() + seconds
        done: list[Tried] = []

        def next_edit() -> tuple[Suite, Edit, bytes] | None:
            for suite, edit in edits:
                content = self._sources.content(edit.source)
                known = results.find(suite, edit, content) if remembers else None
                if known is None:
                    return suite, edit, content
                done.append(Tried(suite, edit, known))
            return None

        def work(name: int) -> None:
            copy = Copy(self._build, self._preambles, self._folder / f"copy-{name}")
            while time.monotonic() < until:
                with self._lock:
                    next_one = next_edit()
                if next_one is None:
                    return
                suite, edit, content = next_one
                tried = self._try_edit(copy, suite, edit, content)
                with self._lock:
                    results.keep(tried, content)
                    done.append(tried)
                    tell(tried)

        workers = os.cpu_count() or 1
        with concurrent.futures.ThreadPoolExecutor(workers) as pool:
            for future in [pool.submit(work, name) for name in range(workers)]:
                future.result()
        return done

    def _try_edit(self, copy: Copy, suite: Suite, edit: Edit, content: bytes) -> Tried:
        began = time.monotonic()
        verdict = self._tests.try_edit(copy, edit.source, edit.applied(content),
                                       self._reach.tests_of(edit, content, suite.tests))
        return Tried(suite, edit, verdict, time.monotonic() - began)
