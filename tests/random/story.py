"""A script and what came of it, command by command."""

import json
import zlib
from dataclasses import dataclass
from functools import cached_property
from itertools import takewhile
from typing import Iterator

from playing import PATIENCE, Playing, play, play_in_two_pieces
from world import Json, World, after


@dataclass(frozen=True)
class Moment:
    """A command, or a step of one, and what came of it. A batch comes after its steps, with what it added."""

    command: Json
    reply: Json
    before: World
    after: World
    is_step: bool  #: nothing is run or drawn before its reply

    def entries(self, *beginning: str) -> list[list]:
        """What of the trace begins with these words."""
        return [entry for entry in self.reply.get("trace", ()) if entry[: len(beginning)] == list(beginning)]

    def did(self, *names: str) -> bool:
        """Whether it is a command of one of these names that was carried out."""
        return self.reply["ok"] and self.command["do"] in names


@dataclass(frozen=True)
class Trial:
    """A script, played three times: as it is; in two pieces; without what changes nothing."""

    lines: list[str]
    whole: Playing
    early_lines: int  #: in the first piece
    early: Playing  #: what came before the second piece was there
    pieces: Playing
    lean: Playing

    @cached_property
    def replies(self) -> list[Json]:
        return [json.loads(reply) for reply in self.whole.replies]

    @cached_property
    def story(self) -> list[Moment]:
        return list(_moments(World(), zip(map(command_of, self.lines), self.replies)))

    @cached_property
    def traced(self) -> list[Moment]:
        """The story up to the first moment from which on not all is traced, for then the world is not known."""
        return list(takewhile(lambda moment: moment.after.selected is None, self.story))


def attempt(program: str, lines: list[str], patience: float = PATIENCE) -> Trial:
    """Plays a script in all ways. Where it is cut into pieces hangs on the script alone."""
    script = _text(lines)
    whole = play(program, script, patience)
    length = zlib.crc32(script) % (len(script) + 1)  # any, also within a line
    early, pieces = play_in_two_pieces(program, script, length, patience)
    kept = [line for line, reply in zip(lines, whole.replies) if is_kept(line, reply)]
    lean = play(program, _text(kept), patience)
    return Trial(lines, whole, script[:length].count(b"\n"), early, pieces, lean)


def is_kept(line: str, reply: bytes) -> bool:
    """Whether a line may change anything: no refused one, and no mere look."""
    return reply.startswith(b'{"ok":true') and line != '{"do":"snapshot"}'


def command_of(line: str) -> Json:
    """The command of a line; one without a name where it is none."""
    try:
        command = json.loads(line)
    except ValueError:
        command = None
    return command if isinstance(command, dict) and isinstance(command.get("do"), str) else {"do": ""}


def _text(lines: list[str]) -> bytes:
    return "".join(line + "\n" for line in lines).encode()


def _moments(world: World, pairs, is_step: bool = False) -> Iterator[Moment]:
    for command, reply in pairs:
        if command["do"] == "batch" and reply["ok"]:
            for moment in _moments(world, zip(command["steps"], reply["replies"]), True):
                world = moment.after
                yield moment
        moment = Moment(command, reply, world, after(world, command, reply), is_step)
        world = moment.after
        yield moment
