"""What a check found, in words."""

from .check import Tried
from .plan import Suite
from .trials import Outcome

WIDTH = 16


def survivors(tried: list[Tried]) -> list[Tried]:
    return [one for one in tried if one.verdict.outcome == Outcome.SURVIVED]


def share_caught(tried: list[Tried]) -> float:
    """In percent of those that compile."""
    compiled = [one for one in tried if one.verdict.outcome != Outcome.NOT_COMPILED]
    return 100 * (1 - len(survivors(compiled)) / len(compiled)) if compiled else 100


def is_enough(suite: Suite, tried: list[Tried], is_all: bool) -> bool:
    """A sample is too small to tell a share, but where nothing may survive it tells."""
    if suite.required == 100 or is_all:
        return share_caught(tried) >= suite.required
    return True


def paragraph(tried: Tried, content: bytes) -> str:
    """An edit as tests/mutations/equivalent.txt would have it, but for the reason."""
    edit = tried.edit
    return "\n".join((f"{edit.source} {edit.function}".rstrip(), *edit.diff(content)))


def row(name: str, tried: list[Tried], equivalent: int) -> str:
    counts = [len(tried), *(sum(one.verdict.outcome == outcome for one in tried) for outcome in Outcome), equivalent]
    return "".join((name.ljust(WIDTH), *(str(count).rjust(WIDTH) for count in counts),
                    f"{share_caught(tried):.1f} %".rjust(WIDTH)))


def table(suites: list[Suite], tried: list[Tried], equivalent: dict[str, int]) -> str:
    """A line for each suite; `equivalent` says of each how many edits were left out."""
    titles = ["edits", *(outcome.value for outcome in Outcome), "equivalent", "caught of all"]
    lines = ["".join(("".ljust(WIDTH), *(title.rjust(WIDTH) for title in titles)))]
    for suite in suites:
        of_suite = [one for one in tried if one.suite == suite]
        lines.append(row(suite.name, of_suite, equivalent[suite.name]))
    return "\n".join(lines)


def coverage_table(suites: list[Suite], files: dict[str, dict]) -> str:
    """A line for each suite, of gcovr's summaries of its sources."""
    rows = ["".join(("".ljust(WIDTH), *(title.rjust(WIDTH) for title in ("lines", "branches"))))]
    for suite in suites:
        of_suite = [files[source] for source in suite.sources if source in files]
        shares = (share(sum(file[f"{kind}_covered"] for file in of_suite),
                        sum(file[f"{kind}_total"] for file in of_suite)) for kind in ("line", "branch"))
        rows.append("".join((suite.name.ljust(WIDTH), *(text.rjust(WIDTH) for text in shares))))
    return "\n".join(rows)


def share(covered: int, total: int) -> str:
    return f"{100 * covered / total:.1f} %" if total else "none"
