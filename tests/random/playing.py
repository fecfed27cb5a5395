"""Plays scripts with quorl-script."""

import fcntl
import select
import subprocess
from typing import IO, NamedTuple

PATIENCE = 60.0  #: seconds after which a program counts as one that does not answer any more


class Playing(NamedTuple):
    """What came of a script that was played."""

    output: bytes
    errors: bytes
    status: int | None  #: null where the program did not end

    @property
    def replies(self) -> list[bytes]:
        """The lines of the output."""
        return self.output.split(b"\n")[:-1]


def play(program: str, script: bytes, patience: float) -> Playing:
    """Plays a script that is there as a whole from the start."""
    with subprocess.Popen([program], stdin=subprocess.PIPE, stdout=subprocess.PIPE, stderr=subprocess.PIPE) as process:
        return _finish(process, b"", script, patience)


def play_in_two_pieces(program: str, script: bytes, length: int, patience: float) -> tuple[Playing, Playing]:
    """Plays the first `length` bytes, waits for what can be said to them, and then plays the rest.
    The first result is what had come before there was a rest."""
    piece, rest = script[:length], script[length:]
    with subprocess.Popen(
        [program], stdin=subprocess.PIPE, stdout=subprocess.PIPE, stderr=subprocess.PIPE, bufsize=0
    ) as process:
        fcntl.fcntl(process.stdin, fcntl.F_SETPIPE_SZ, max(len(piece), 1))
        try:
            process.stdin.write(piece)  # fits into the pipe as a whole, so neither waits for the other
        except BrokenPipeError:
            pass  # how it ended is in the result
        early = _read_lines(process.stdout, piece.count(b"\n"), patience)
        return Playing(early, b"", None), _finish(process, early, rest, patience)


def _finish(process: subprocess.Popen, early: bytes, rest: bytes, patience: float) -> Playing:
    try:
        output, errors = process.communicate(rest, timeout=patience)
    except subprocess.TimeoutExpired:
        process.kill()
        output, errors = process.communicate()
        return Playing(early + output, errors, None)
    return Playing(early + output, errors, process.returncode)


def _read_lines(stream: IO[bytes], count: int, patience: float) -> bytes:
    """So many lines, or what came of them before the end or out of patience."""
    read = b""
    while read.count(b"\n") < count and select.select([stream], [], [], patience)[0]:
        chunk = stream.read(1 << 16)
        if not chunk:
            break
        read += chunk
    return read
