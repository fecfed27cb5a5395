"""Reads lines of a shell: which commands they have."""

import re
import shlex

import reading

KEYWORDS = frozenset("! do done else fi for if then until while { }".split())
ENDS_OF_COMMANDS = frozenset("; ;; | || & && ( ) |&".split())


class Unreadable(Exception):
    """A line of a shell in a form that this test does not read."""


def commands_in(text):
    """The words of each simple command of a line of a shell."""
    words = shlex.shlex(text, posix=True, punctuation_chars=True)
    words.whitespace_split = True
    command = []
    try:
        for word in [*words, ";"]:
            if word == "<<":
                raise Unreadable("a text within a script")
            if word not in ENDS_OF_COMMANDS:
                for inner in re.findall(r"\$\(([^()]*)\)", word):
                    yield from commands_in(inner)
                command.append(word)
            elif command:
                yield without_beginning(command)
                command = []
    except ValueError as error:
        raise Unreadable(str(error)) from error


def without_beginning(command):
    """A command without the values that it is given and the words of the shell before it."""
    rest = list(command)
    if rest[0] == "for":
        return []
    while rest and (rest[0] in KEYWORDS or re.match(r"\w+=", rest[0])):
        rest.pop(0)
    return rest


def lines_of(fence):
    """The lines of a shell, each with those that it goes on with."""
    begun = None
    for line in fence.lines:
        text = line.text if begun is None else begun.text[:-1] + line.text.lstrip()
        line = reading.Line((begun or line).number, text)
        begun = line if text.endswith("\\") else None
        if begun is None:
            yield line
    if begun:
        yield begun
