"""Plays a script twice and compares its replies with the expected ones, line by line."""

import json
import pathlib
import subprocess
import sys


def play(program, script):
    return subprocess.run([program, script], capture_output=True, check=False)


def differences(commands, expected, replies):
    if len(replies) != len(expected):
        yield f"{len(expected)} replies are expected, {len(replies)} came"
    for number, (command, wanted, reply) in enumerate(zip(commands, expected, replies), 1):
        if json.loads(wanted) != json.loads(reply):
            yield f"line {number}: {command}\n  expected {wanted}\n  got      {reply}"


def lines(file):
    return pathlib.Path(file).read_text(encoding="utf-8").split("\n")[:-1]


def expected_file(program, script):
    """What the script gives on the program's machine: numbers of 32 bits hold less."""
    behind_a_script = pathlib.Path(program).with_name(f".{pathlib.Path(program).name}")  # see tools/link-emulated
    with open(behind_a_script if behind_a_script.exists() else program, "rb") as file:
        has_32_bits = file.read(5) == b"\x7fELF\x01"
    on_32_bits = pathlib.Path(script).with_suffix(".expected32")
    return on_32_bits if has_32_bits and on_32_bits.exists() else pathlib.Path(script).with_suffix(".expected")


def main():
    program, script = sys.argv[1:]
    first = play(program, script)
    second = play(program, script)
    expected = lines(expected_file(program, script))
    problems = list(differences(lines(script), expected, first.stdout.decode().split("\n")[:-1]))
    if first.stdout != second.stdout:
        problems.append("played twice, the script gives other replies")
    for complaint in sorted({first.stderr, second.stderr} - {b""}):
        problems.append(f"on standard error: {complaint.decode(errors='replace')}")
    if first.returncode != int(any('"ok":false' in reply for reply in expected)):
        problems.append(f"the exit status is {first.returncode}")
    print("\n".join(problems))
    return 1 if problems else 0


if __name__ == "__main__":
    sys.exit(main())
