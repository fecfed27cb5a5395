"""Makes a script short that breaks a property."""

from typing import Callable


def shorten(lines: list[str], is_broken: Callable[[list[str]], bool]) -> list[str]:
    """Leaves out lines, many at once and then few, as long as what is left is still broken."""
    length = len(lines) // 2
    while length:
        shorter = _without_pieces(lines, length, is_broken)
        length = length if len(shorter) < len(lines) and length == 1 else length // 2
        lines = shorter
    return lines


def _without_pieces(lines: list[str], length: int, is_broken: Callable[[list[str]], bool]) -> list[str]:
    """Leaves out each piece of this length, from the end on, that is not needed."""
    for begin in reversed(range(0, len(lines), length)):
        rest = lines[:begin] + lines[begin + length :]
        if is_broken(rest):
            lines = rest
    return lines
