#!/usr/bin/python3
"""Plays random situations with quorl-script and looks whether what must hold does."""

import argparse
import multiprocessing
import os
import pathlib
import random
import sys
import time
from typing import Iterator, NamedTuple

from properties import Property, broken_by, sentence
from shorten import shorten
from situations import script
from story import attempt

MOST_IN_A_SCRIPT = 12
LITTLE_PATIENCE = 2.0  # seconds: a program that does not answer is tried many times


class Failure(NamedTuple):
    number: int
    lines: list[str]
    property: str
    problem: str


class Outcome(NamedTuple):
    situations: int
    failure: Failure | None


def failure_of(program: str, number: int, lines: list[str]) -> Failure | None:
    """What a script breaks, in as few lines as will do."""
    broken = broken_by(attempt(program, lines))
    if broken is None:
        return None

    def is_still_broken(fewer: list[str]) -> bool:
        return bool(fewer) and _breaks(program, fewer, broken[0])

    short = shorten(lines, is_still_broken)
    _, problem = broken_by(attempt(program, short)) or broken
    return Failure(number, short, sentence(broken[0]), problem)


def _breaks(program: str, lines: list[str], property_: Property) -> bool:
    broken = broken_by(attempt(program, lines, LITTLE_PATIENCE))
    return broken is not None and broken[0] is property_


def work(arguments: argparse.Namespace, worker: int) -> Outcome:
    """Plays every so many-th script until one breaks a property, there are enough, or time is up."""
    played = 0
    for number, size in _numbers(arguments, worker):
        lines = script(random.Random(f"{arguments.seed} {number}"), size)
        played += size
        if failure := failure_of(arguments.program, number, lines):
            return Outcome(played, failure)
    return Outcome(played, None)


def _numbers(arguments: argparse.Namespace, worker: int) -> Iterator[tuple[int, int]]:
    """The numbers of the scripts that are a worker's, and how many situations each has."""
    end = time.monotonic() + arguments.seconds if arguments.seconds else None
    number = situations = 0
    while situations < arguments.count and (end is None or time.monotonic() < end):
        size = min(1 + number % MOST_IN_A_SCRIPT, arguments.count - situations)
        if number % arguments.workers == worker:
            yield number, size
        number, situations = number + 1, situations + size


def report(failure: Failure) -> None:
    """Says what is broken, by which lines, and how to see it again."""
    print(f"\nBroken: {failure.property}\n{failure.problem}\n")
    print(f"by these lines, shortened from script {failure.number}:\n")
    print("\n".join(failure.lines))
    print(f"\nTo see it again, save the lines and run {sys.argv[0]} PROGRAM --script FILE")


def options() -> argparse.Namespace:
    parser = argparse.ArgumentParser(description=__doc__)
    parser.add_argument("program", help="quorl-script")
    parser.add_argument("--seed", default="1", help="what the situations hang on; \"any\" for others each time")
    parser.add_argument("--count", type=int, default=sys.maxsize, help="how many situations at most")
    parser.add_argument("--seconds", type=float, help="for how long at most")
    parser.add_argument("--workers", type=int, default=os.cpu_count())
    parser.add_argument("--script", type=pathlib.Path, help="look at this script in place of random ones")
    arguments = parser.parse_args()
    if not arguments.script and not arguments.seconds and arguments.count == sys.maxsize:
        parser.error("say how many situations (--count) or for how long (--seconds)")
    if arguments.seed == "any":
        arguments.seed = str(random.SystemRandom().randrange(2**32))
    return arguments


def run(arguments: argparse.Namespace) -> list[Failure]:
    """Plays random situations in as many processes as there are workers."""
    began = time.monotonic()
    with multiprocessing.Pool(arguments.workers) as pool:
        outcomes = pool.starmap(work, [(arguments, worker) for worker in range(arguments.workers)])
    count = sum(outcome.situations for outcome in outcomes)
    print(f"Seed {arguments.seed}: {count} situations in {time.monotonic() - began:.0f} s")
    return sorted(outcome.failure for outcome in outcomes if outcome.failure)


def main() -> int:
    arguments = options()
    if arguments.script:
        lines = arguments.script.read_text(encoding="utf-8").split("\n")[:-1]
        failures = [failure for failure in [failure_of(arguments.program, 0, lines)] if failure]
    else:
        failures = run(arguments)
    for failure in failures[:1]:
        report(failure)
    return 1 if failures else 0


if __name__ == "__main__":
    sys.exit(main())
