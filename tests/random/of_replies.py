"""What holds of any script's replies, whatever the panes do. Each property tells what breaks it."""

from typing import Iterator

from situations import WRONG
from story import Trial, command_of, is_kept

#: These are the script's and the host's business; they call nothing.
CALLS_NOTHING = ("snapshot", "trace", "rows", "scroll", "glance", "strings", "language", "sizes", "screen", "clock")

RESULTS = {
    "batch": ["replies"], "rows": ["result"], "snapshot": ["stack"], "layout": ["title", "detail", "set"],
    "query": ["stage", "progress", "completedAssetCount", "totalAssetCount", "assetSyncPlaylist"],
}


def each_line_has_the_reply_that_it_asks_for(trial: Trial) -> Iterator[str]:
    if len(trial.whole.replies) != len(trial.lines):
        yield f"{len(trial.lines)} lines have {len(trial.whole.replies)} replies"
    for line, reply in zip(trial.lines, trial.replies):
        wanted = {"ok", "trace", *RESULTS.get(command_of(line)["do"], ())} if reply["ok"] else {"ok", "error"}
        if reply.keys() != wanted and not (wanted | {"result"} == reply.keys() and command_of(line)["do"] == "send"):
            yield f"{line}: {reply}"


def nothing_is_written_to_standard_error(trial: Trial) -> Iterator[str]:
    for playing in (trial.whole, trial.pieces, trial.lean):
        if playing.errors:
            yield playing.errors.decode(errors="replace")


def the_exit_status_tells_whether_a_command_failed(trial: Trial) -> Iterator[str]:
    for playing in (trial.whole, trial.pieces):
        status = int(b'"ok":false' in playing.output)
        if playing.status != status:
            yield f"{playing.status} in place of {status}"


def a_wrong_line_is_refused_by_the_name_of_its_field(trial: Trial) -> Iterator[str]:
    for line, reply in zip(trial.lines, trial.replies):
        if line in WRONG and (reply["ok"] or WRONG[line] not in reply["error"]):
            yield f"{line}: {reply}"


def the_same_script_gives_the_same_bytes(trial: Trial) -> Iterator[str]:
    for one, other in zip(trial.whole.replies, trial.pieces.replies):
        if one != other:
            yield f"{one.decode()}\nthe second time: {other.decode()}"
            return
    if len(trial.whole.output) != len(trial.pieces.output):
        yield "one time there is more than the other"


def no_reply_waits_for_what_comes_later(trial: Trial) -> Iterator[str]:
    if not trial.pieces.output.startswith(trial.early.output) or not trial.whole.output.startswith(trial.early.output):
        yield "the first lines have other replies when nothing follows them yet"
    if len(trial.early.replies) != trial.early_lines:
        yield f"{len(trial.early.replies)} replies to the first {trial.early_lines} lines came before there was a rest"


def what_is_refused_or_only_looks_changes_nothing(trial: Trial) -> Iterator[str]:
    kept = [(line, reply) for line, reply in zip(trial.lines, trial.whole.replies) if is_kept(line, reply)]
    for (line, reply), lean in zip(kept, trial.lean.replies):
        if reply != lean:
            yield f"{line}: {reply.decode()}\nwithout the rest: {lean.decode()}"
            return


def only_what_was_chosen_is_traced(trial: Trial) -> Iterator[str]:
    for moment in trial.story:
        chosen = moment.after.selected
        for entry in moment.entries():
            receiver = "life" if entry[0] == "dealloc" else entry[0]
            if chosen is not None and receiver not in chosen:
                yield f"{moment.command}: {entry}"


def what_is_not_the_panes_business_calls_nothing(trial: Trial) -> Iterator[str]:
    for moment in trial.story:
        if moment.did(*CALLS_NOTHING) and moment.entries():
            yield f"{moment.command}: {moment.entries()}"


PROPERTIES = [
    each_line_has_the_reply_that_it_asks_for,
    nothing_is_written_to_standard_error,
    the_exit_status_tells_whether_a_command_failed,
    a_wrong_line_is_refused_by_the_name_of_its_field,
    the_same_script_gives_the_same_bytes,
    no_reply_waits_for_what_comes_later,
    what_is_refused_or_only_looks_changes_nothing,
    only_what_was_chosen_is_traced,
    what_is_not_the_panes_business_calls_nothing,
]
