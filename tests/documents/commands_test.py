"""Every command of the documents is run here, as they say and in their order, or is named below with a reason.

What stands in a fence of sh is run, in a session of its own for each document. Where a fence of text follows, that is
what it prints; "…" stands for anything. What stands in a fence of jsonl is a script of the pane. What panes.md has one do
is done by panes_test.py.
"""

import json
import os
import pathlib
import re
import subprocess
import tempfile
import unittest

import reading
import shell

BUILD = pathlib.Path(os.environ["BUILD"])
SESSION = reading.ROOT / "tests/session-run"

# What may be run: programs of this tree that end by themselves and stay within the session, and harmless others.
RUN = frozenset(
    """ask_the_engine.py quorl quorl-script quorl-simulate quorl-syncd random_test.py
    busctl gsettings msgfmt
    cat cd echo export find grep ls mkdir printf sed sort true""".split()
)

# What is not run, by how the command begins, and why.
NOT_RUN = {
    "./run": "opens a window, and installs packages",
    "./test": "runs this test, and installs packages",
    "build/release/bin/quorl --music": "opens a window",
    "build/release/bin/quorl-simulate --device": "lives a thousand lives, as the tests do by themselves",
    "cmake": "builds",
    "ctest": "runs tests",
    "gdbus monitor": "goes on until it is ended",
    "gsettings monitor": "goes on until it is ended",
    "orca": "wants a screen reader and somebody to hear it",
    "rm -r": "removes what belongs to whoever runs it",
    "sudo": "asks for a password",
    "systemctl": "talks to the manager of the person's own session",
    "tests/random/random_test.py build/release/bin/quorl-script --seconds": "draws for a minute",
    "tools/build": "builds",
    "tools/fuzz": "goes on for an hour",
    "tools/packages": "builds",
    "tools/power-cuts": "boots a kernel many times",
    "tools/try-endurance": "takes hours",
}

KINDS = {"", "sh", "text", "jsonl", "po"}


def begins_with(command, beginning):
    words = beginning.split()
    return command[:len(words)] == words


def reason_not_to_run(command, not_run):
    """How it begins that has a reason, or None."""
    return next((beginning for beginning in not_run if begins_with(command, beginning)), None)


class Plan:
    """What of a document is run."""

    def __init__(self, document, not_run):
        self.document = document
        self.not_run = not_run
        self.problems = []
        self.used = set()  # of not_run
        self.steps = []  # the text that is run, and what it prints or None, for each fence
        self.scripts = [fence for fence in document.fences if fence.kind == "jsonl"]
        for fence in document.fences:
            self._add(fence)
        for line in document.indented():
            self._complain(line, "this stands in no fence")

    def _complain(self, line, what):
        self.problems.append(f"{self.document.path.name}:{line.number}: {what}")

    def _add(self, fence):
        first = fence.lines[0] if fence.lines else reading.Line(0, "")
        if fence.kind not in KINDS:
            self._complain(first, f"nobody knows what to do with {fence.kind}")
        elif fence.kind == "sh":
            text = "\n".join(line.text for line in shell.lines_of(fence) if self._is_run(line))
            self.steps.append((text, None))
        elif fence.kind == "text" and not (fence.is_next and self.steps):
            self._complain(first, "no command prints this")
        elif fence.kind == "text":
            text, _ = self.steps.pop()
            self.steps.append((text, "\n".join(line.text for line in fence.lines)))

    def _is_run(self, line):
        try:
            commands = [command for command in shell.commands_in(line.text) if command]
        except shell.Unreadable as error:
            self._complain(line, f"cannot be read: {error}")
            return False
        reasons = {reason_not_to_run(command, self.not_run) for command in commands} - {None}
        self.used |= reasons
        unknown = [command[0] for command in commands
                   if pathlib.Path(command[0]).name not in RUN and not reason_not_to_run(command, self.not_run)]
        for name in unknown:
            self._complain(line, f"{name} is neither run nor named")
        return not unknown and not reasons


def plans(root, not_run):
    return [Plan(document, not_run) for document in reading.documents(root) if document.path.name != "panes.md"]


def printed_as(expected):
    """What matches the output that a document shows."""
    lines = [re.escape(line.rstrip()).replace("…", ".*") for line in expected.splitlines()]
    return re.compile("".join(r"(?:.*\n)*?" if line == ".*" else line + r"\n" for line in lines))


PRELUDE = r"""
set -euo pipefail
end_engine() {
    local pid
    pid=$(busctl --user call org.freedesktop.DBus / org.freedesktop.DBus \
        GetConnectionUnixProcessID s org.quorl.Velora.Sync 2>&1 | sed -n 's/^u //p') && [[ $pid ]] || return 0
    kill "$pid"
    tail --pid="$pid" -s 0.1 -f /dev/null
}
trap end_engine EXIT
# As where it is installed: the bus knows how to start the engine, and everybody knows the schemas.
export GSETTINGS_SCHEMA_DIR=$SCHEMAS
printf '[D-BUS Service]\nName=org.quorl.Velora.Sync\nExec=%s/quorl-syncd\n' "$PROGRAMS" \
    >"$XDG_DATA_HOME/dbus-1/services/org.quorl.Velora.Sync.service"
busctl --user call org.freedesktop.DBus / org.freedesktop.DBus ReloadConfig
mkdir ~/Music
printf 'a short song' >~/Music/Morning.mp3
printf 'another one' >~/Music/Evening.mp3
printf 'Morning.mp3\nEvening.mp3\nNowhere.mp3\n' >~/Music/Quiet.m3u
"""


def prepare(folder):
    """Makes a folder that looks like the top of this tree, with a release that was built."""
    for path in reading.ROOT.iterdir():
        if path.name != "build" and not path.name.startswith("."):
            (folder / path.name).symlink_to(path)
    (folder / "build").mkdir()
    (folder / "build/release").symlink_to(BUILD)


def run(steps):
    """Runs the steps in a session of their own, and gives back what each has printed and how all ended."""
    with tempfile.TemporaryDirectory() as name:
        folder = pathlib.Path(name)
        prepare(folder)
        script = [PRELUDE]
        for number, (text, _) in enumerate(steps):
            script += [f'exec >"$PRINTED/{number}" 2>&1', text]
        printed = folder / "build/printed"
        printed.mkdir()
        environment = {**os.environ, "PATH": f"{BUILD}/bin:{os.environ['PATH']}", "PROGRAMS": f"{BUILD}/bin",
                       "PRINTED": str(printed), "SCHEMAS": f"{BUILD}/share/glib-2.0/schemas"}
        done = subprocess.run([SESSION, "bash", "-c", "\n".join(script)], cwd=folder, env=environment,
                              stdin=subprocess.DEVNULL, capture_output=True, text=True, check=False)
        outputs = [path.read_text(encoding="utf-8", errors="replace")
                   for path in sorted(printed.iterdir(), key=lambda path: int(path.name))]
        return outputs, done


def failures_of(steps):
    """One text for each step that fails or prints something else than it is said to."""
    outputs, done = run(steps)
    failures = []
    for (text, expected), output in zip(steps, outputs):
        if expected is not None and not printed_as(expected).fullmatch(output.rstrip("\n") + "\n"):
            failures.append(f"{text}\nprints\n{output}\nand not\n{expected}")
    if done.returncode:
        text = steps[len(outputs) - 1][0] if outputs else PRELUDE
        failures.append(f"{text}\nfails:\n{outputs[-1] if outputs else done.stderr}")
    return failures


def refused(fence):
    """What the program of scripts says of the lines that it refuses, or of its end."""
    played = subprocess.run([BUILD / "bin/quorl-script"], input="\n".join(line.text for line in fence.lines),
                            capture_output=True, text=True, check=False)
    replies = [json.loads(line) for line in played.stdout.splitlines()]
    refusals = [reply["error"] for reply in replies if not reply["ok"]]
    return refusals or ([played.stderr] if played.returncode else [])


class ThisProject(unittest.TestCase):
    def setUp(self):
        self.plans = plans(reading.ROOT, NOT_RUN)

    def test_knows_what_to_do_with_each_command_of_its_documents(self):
        self.assertEqual([problem for plan in self.plans for problem in plan.problems], [])

    def test_names_no_command_that_is_in_no_document(self):
        self.assertEqual(set().union(*(plan.used for plan in self.plans)), set(NOT_RUN))

    def test_does_what_its_documents_say(self):
        for plan in self.plans:
            steps = [step for step in plan.steps if step[0].strip()]
            if steps:
                with self.subTest(plan.document.path.name):
                    self.assertEqual("\n\n".join(failures_of(steps)), "")

    def test_plays_the_scripts_of_its_documents(self):
        for plan in self.plans:
            for script in plan.scripts:
                with self.subTest(f"{plan.document.path.name}:{script.lines[0].number}"):
                    self.assertEqual(refused(script), [])

    def test_has_commands_to_run_and_scripts_to_play(self):
        run_in = {plan.document.path.name for plan in self.plans if any(text.strip() for text, _ in plan.steps)}
        self.assertLessEqual({"bus.md", "settings.md", "files.md"}, run_in)
        self.assertTrue(any(plan.scripts for plan in self.plans))


class Planted(unittest.TestCase):
    def setUp(self):
        folder = tempfile.TemporaryDirectory()
        self.addCleanup(folder.cleanup)
        self.root = pathlib.Path(folder.name)

    def plan_of(self, text):
        (self.root / "README.md").write_text(text, encoding="utf-8")
        [plan] = plans(self.root, {"./run": "opens a window", "sudo apt": "installs"})
        return plan


class PlantedCommand(Planted):
    def problems_with(self, command):
        return self.plan_of(f"# Top\n\n```sh\n{command}\n```\n").problems

    def test_that_is_known_is_let_pass(self):
        for command in ("quorl --status", "build/release/bin/quorl --status", "./run --text", "sudo apt install x",
                        "LANGUAGE=de quorl --status | grep Velora >file 2>&1", "# only a word", "ls; ! ls && ls || ls",
                        "for file in *.po; do ls \"$file\"; done", "quorl-syncd &", "quorl \\\n  --status"):
            with self.subTest(command):
                self.assertEqual(self.problems_with(command), [])

    def test_that_is_unknown_is_found(self):
        for command in ("frobnicate", "quorl --status | frobnicate", "ls && frobnicate x", "LANG=C frobnicate",
                        "for file in *; do frobnicate; done", "(frobnicate)", "ls \\\n | frobnicate",
                        "x=$(frobnicate)", "echo \"now: $(frobnicate)\"", "./run && frobnicate"):
            with self.subTest(command):
                self.assertEqual(self.problems_with(command), ["README.md:4: frobnicate is neither run nor named"])

    def test_that_is_unknown_is_not_run(self):
        self.assertEqual(self.plan_of("```sh\nls\nfrobnicate\n```\n").steps, [("ls", None)])

    def test_that_cannot_be_read_is_found(self):
        for command in ("ls 'x", "cat <<END"):
            with self.subTest(command):
                self.assertEqual(len(self.problems_with(command)), 1)

    def test_that_is_named_is_not_run(self):
        plan = self.plan_of("```sh\nls\n./run --text | ls\nls -l\n```\n")

        self.assertEqual(plan.steps, [("ls\nls -l", None)])
        self.assertEqual(plan.used, {"./run"})

    def test_outside_of_a_fence_is_found(self):
        self.assertEqual(self.plan_of("A text:\n\n    frobnicate\n").problems, ["README.md:3: this stands in no fence"])

    def test_of_an_unknown_kind_of_fence_is_found(self):
        self.assertEqual(len(self.plan_of("```shell\nls\n```\n").problems), 1)


class PlantedOutput(Planted):
    def failures_with(self, command, output):
        return failures_of(self.plan_of(f"```sh\n{command}\n```\n\n```text\n{output}\n```\n").steps)

    def test_as_it_is_printed_is_let_pass(self):
        self.assertEqual(self.failures_with("printf 'a 1 (b)\\nx\\ny\\nc\\n'", "a … (b)\n…\nc"), [])

    def test_that_differs_is_found(self):
        for output in ("b", "a\nb", "a …"):
            with self.subTest(output):
                self.assertEqual(len(self.failures_with("echo a", output)), 1)

    def test_of_a_command_that_fails_is_found(self):
        self.assertEqual(len(self.failures_with("echo a; ls /nowhere; echo b", "a\n…")), 1)
        self.assertEqual(len(self.failures_with("ls /nowhere | cat", "…")), 1)

    def test_of_no_command_is_found(self):
        self.assertEqual(self.plan_of("```sh\nls\n```\nWords\n```text\na\n```\n").problems,
                         ["README.md:6: no command prints this"])


class PlantedScript(Planted):
    def test_that_is_refused_is_found(self):
        plan = self.plan_of('```jsonl\n{"do":"open"}\n{"do":"frobnicate"}\n```\n')

        self.assertEqual(len(refused(plan.scripts[0])), 1)


if __name__ == "__main__":
    unittest.main()
