"""Which sources are edited, which tests can notice, and which edits are known to change nothing."""

import dataclasses
import fnmatch
import pathlib
import tomllib

from .edits import Edit


class ListError(Exception):
    """What is wrong with a list in tests/mutations, for people."""


@dataclasses.dataclass(frozen=True)
class Suite:
    """Sources, and the tests that can notice an edit of them, likeliest first."""

    name: str
    sources: list[str]
    tests: list[str]
    required: float
    """The share of edits that has to be caught, in percent."""


def suites(root: pathlib.Path) -> list[Suite]:
    tables = tomllib.loads((root / "tests/mutations/suites.toml").read_text())["suite"]
    found = []
    for table in tables:
        sources = sorted(str(path.relative_to(root)) for pattern in table["sources"] for path in root.glob(pattern))
        if not sources:
            raise ListError(f"tests/mutations/suites.toml: there are no sources of {table['name']}.")
        found.append(Suite(table["name"], sources, table["tests"], table["required"]))
    return found


def is_below(source: str, paths: list[str]) -> bool:
    return not paths or any(fnmatch.fnmatchcase(source, path) or source.startswith(path.rstrip("/") + "/")
                            for path in paths)


@dataclasses.dataclass(frozen=True)
class Entry:
    """An edit that changes no behaviour: paragraphs of a line `SOURCE FUNCTION`, the lines of the edit's diff,
    and why."""

    source: str
    function: str
    diff: tuple[str, ...]
    reason: str

    def matches(self, edit: Edit, content: bytes) -> bool:
        return ((self.source, self.function) == (edit.source, edit.function)
                and self.diff == edit.diff(content))


def entries(root: pathlib.Path, known: list[Suite]) -> list[Entry]:
    """Those of the sources of all suites."""
    text = (root / "tests/mutations/equivalent.txt").read_text()
    paragraphs = [[line for line in paragraph.splitlines() if not line.startswith("#")]
                  for paragraph in text.split("\n\n")]
    found = [entry_of([line for line in lines if line.strip()]) for lines in paragraphs if any(lines)]
    for entry in found:
        if not any(entry.source in suite.sources for suite in known):
            raise ListError(f"tests/mutations/equivalent.txt: {entry.source} is no source that is edited.")
    return found


def entry_of(lines: list[str]) -> Entry:
    source, _, function = lines[0].partition(" ")
    diff = tuple(line[0] + line[1:].strip() for line in lines[1:] if line[0] in "-+")
    reason = " ".join(line.strip() for line in lines[1:] if line[0] not in "-+")
    if not diff or not reason:
        raise ListError(f"tests/mutations/equivalent.txt: {lines[0]}: give lines with - and +, and the reason.")
    return Entry(source, function, diff, reason)
