"""Plays a script twice and compares its replies with the expected ones, line by line."""

import json
import pathlib
import subprocess
import sys


def play(program, script):
    return subprocess.run([program, script], stdout=subprocess.PIPE, check=False)


def differences(commands, expected, replies):
    if len(replies) != len(expected):
        yield f"{len(expected)} replies are expected, {len(replies)} came"
    for number, (command, wanted, reply) in enumerate(zip(commands, expected, replies), 1):
        if json.loads(wanted) != json.loads(reply):
            yield f"line {number}: {command}\n  expected {wanted}\n  got      {reply}"


def lines(file):
    return pathlib.Path(file).read_text(encoding="utf-8").split("\n")[:-1]


def main():
    program, script = sys.argv[1:]
    first = play(program, script)
    second = play(program, script)
    expected = lines(pathlib.Path(script).with_suffix(".expected"))
    problems = list(differences(lines(script), expected, first.stdout.decode().split("\n")[:-1]))
    if first.stdout != second.stdout:
        problems.append("played twice, the script gives other replies")
    if first.returncode != int(any('"ok":false' in reply for reply in expected)):
        problems.append(f"the exit status is {first.returncode}")
    print("\n".join(problems))
    return 1 if problems else 0


if __name__ == "__main__":
    sys.exit(main())
