"""Which lines and branches of the sources the tests reach, and which test reaches which line."""

import dataclasses
import hashlib
import json
import pathlib
import re
import subprocess

from .build import Build, BuildError
from .edits import Edit
from .plan import Suite
from .trials import Tests

DIGESTS = "digests"
"""Beside the tracefiles: of each source, and of all tests, what it was when they were made."""
TESTS = "tests"


def digest(*files: pathlib.Path) -> str:
    return hashlib.sha256(b"".join(file.read_bytes() for file in files)).hexdigest()


def digest_of_tests(root: pathlib.Path) -> str:
    return digest(*sorted(path for path in (root / TESTS).rglob("*") if path.is_file()
                          and not path.is_relative_to(root / TESTS / "mutations")))


def gcovr(build: Build, *options: str) -> str:
    # A branch to where an exception is caught is the compiler's own, and no decision.
    done = subprocess.run(["gcovr", "--root", build.root, "--exclude-throw-branches",
                           "--exclude-unreachable-branches", *options],
                          cwd=build.folder, capture_output=True, text=True, check=False)
    if done.returncode != 0:
        raise BuildError(f"gcovr cannot tell what the tests reach:\n{done.stderr}")
    return done.stdout


def measure(build: Build, suites: list[Suite], folder: pathlib.Path) -> dict[str, dict]:
    """Runs the tests of the suites in a build that counts, keeps in `folder` what each reaches, and returns
    gcovr's summary of each source."""
    folder.mkdir(parents=True, exist_ok=True)
    for old in folder.iterdir():
        old.unlink()
    sources = sorted({source for suite in suites for source in suite.sources})
    tests = sorted({test for suite in suites for test in suite.tests})
    digests = {source: digest(build.root / source) for source in sources} | {TESTS: digest_of_tests(build.root)}
    (folder / DIGESTS).write_text(json.dumps(digests))
    runner = Tests(build)
    objects = sorted({str((build.folder / build.object_of(source)).parent) for source in sources})
    filters = [option for source in sources for option in ("--filter", re.escape(str(build.root / source)))]
    for counted in build.folder.rglob("*.gcda"):
        counted.unlink()
    for test in tests:
        runner.run_unedited(test)
        gcovr(build, "--delete", "--json", str(folder / f"{test}.json"), *filters, *objects)
    tracefiles = [option for test in tests for option in ("--add-tracefile", str(folder / f"{test}.json"))]
    summary = json.loads(gcovr(build, *tracefiles, "--json-summary"))
    return {file["filename"]: file for file in summary["files"]}


@dataclasses.dataclass(frozen=True)
class Reach:
    """Which tests reach each line of each source that was measured as it is now, with the tests of now."""

    lines: dict[str, dict[int, set[str]]]

    def tests_of(self, edit: Edit, content: bytes, tests: list[str]) -> list[str]:
        """Those of `tests` that come to an edit. All where nothing is known of its lines, and where none comes: of
        what is called by a lambda that is a constant, gcc counts nothing."""
        first = content.count(b"\n", 0, edit.start) + 1
        last = content.count(b"\n", 0, edit.end) + 1
        known = self.lines.get(edit.source, {})
        reached = [known[line] for line in range(first, last + 1) if line in known]
        return [test for test in tests if any(test in by for by in reached)] or tests


def reach(root: pathlib.Path, folder: pathlib.Path) -> Reach:
    """What was kept in `folder`; nothing where nothing was, or the tests have changed."""
    if not (folder / DIGESTS).exists():
        return Reach({})
    digests = json.loads((folder / DIGESTS).read_text())
    if digests.get(TESTS) != digest_of_tests(root):
        return Reach({})
    lines: dict[str, dict[int, set[str]]] = {}
    for path in folder.glob("*.json"):
        for file in json.loads(path.read_text())["files"]:
            source = file["file"]
            if not (root / source).exists() or digests.get(source) != digest(root / source):
                continue
            of_source = lines.setdefault(source, {})
            for line in file["lines"]:
                tests = of_source.setdefault(line["line_number"], set())
                if line["count"] > 0:
                    tests.add(path.stem)
    return Reach(lines)
