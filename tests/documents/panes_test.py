"""Who follows docs/panes.md from an empty folder, with what is installed, gets the pane of examples/alarm."""

import os
import pathlib
import re
import shlex
import subprocess
import tempfile
import unittest

import commands_test
import reading

GUIDE = reading.ROOT / "docs/panes.md"
EXAMPLE = reading.ROOT / "examples/alarm"
BUILD = pathlib.Path(os.environ["BUILD"])

NOT_RUN = ("quorl --plugins alarm/build/panes",)  # opens a window
OF_FILES = {"cmake", "cpp", "po", "jsonl"}


def steps_of(text):
    """What the guide has one do, in order: a command with what it prints or None, or a piece of a file as a command
    that adds it to the file that was named last."""
    steps, named = [], None
    for part in re.split(r"^(```\w+\n.*?^```$)", text, flags=re.MULTILINE | re.DOTALL):
        fence = re.fullmatch(r"```(\w+)\n(.*?)```", part, re.DOTALL)
        if not fence:
            named = ([named] + [name for name in reading.CODE.findall(part) if (EXAMPLE / name).is_file()])[-1]
            continue
        kind, content = fence.groups()
        if kind == "text":
            steps[-1] = (steps[-1][0], content)
        elif kind in OF_FILES:
            steps.append((adding(content, f"alarm/{named}"), None))
        else:
            steps += [(line, None) for line in content.splitlines() if line not in NOT_RUN]
    return steps


def adding(content, file):
    """Pieces of one file stand apart."""
    quoted = shlex.quote(file)
    return f"[ ! -e {quoted} ] || echo >>{quoted}\nprintf %s {shlex.quote(content)} >>{quoted}"


def followed(steps, prefix, folder):
    """Follows the guide in an empty folder; gives back what each step has printed, and how all ended."""
    printed = folder / "printed"
    printed.mkdir()
    (folder / "empty").mkdir()
    script = ["set -euo pipefail"]
    for number, (text, _) in enumerate(steps):
        script += [f'exec >"$PRINTED/{number}" 2>&1', text]
    environment = {**os.environ, "PATH": f"{prefix}/bin:/usr/bin:/bin", "CMAKE_PREFIX_PATH": str(prefix),
                   "PRINTED": str(printed), "QT_QPA_PLATFORM": "offscreen",
                   "GSETTINGS_SCHEMA_DIR": f"{prefix}/share/glib-2.0/schemas"}
    done = subprocess.run([commands_test.SESSION, "bash", "-c", "\n".join(script)], cwd=folder / "empty",
                          env=environment, stdin=subprocess.DEVNULL, capture_output=True, text=True, check=False)
    return [(printed / str(number)).read_text(encoding="utf-8") for number in range(len(list(printed.iterdir())))], done


def files_below(folder):
    return {path.relative_to(folder).as_posix(): path.read_text(encoding="utf-8")
            for path in folder.rglob("*") if path.is_file() and folder / "build" not in path.parents}


# What nobody is told to do: the shared object of the pane that was installed is damaged.
DAMAGE = ("printf x >~/.local/lib/quorl/panes/Alarm.bundle/libAlarm.so; echo b | quorl --text",
          "…\n…A plug-in cannot be shown.\n…\n…damaged…\n…")


class Guide(unittest.TestCase):
    maxDiff = None

    def test_leads_to_the_example_and_to_what_it_says_is_shown(self):
        steps = [*steps_of(GUIDE.read_text(encoding="utf-8")), DAMAGE]
        with tempfile.TemporaryDirectory() as name:
            folder = pathlib.Path(name).resolve()
            subprocess.run(["cmake", "--install", BUILD, "--prefix", folder / "prefix"], stdout=subprocess.DEVNULL, check=True)
            outputs, done = followed(steps, folder / "prefix", folder)

            self.assertEqual(done.returncode, 0, f"{steps[len(outputs) - 1][0]}\n{outputs[-1]}{done.stderr}")
            self.assertEqual(files_below(folder / "empty/alarm"), files_below(EXAMPLE))
        for (command, expected), output in zip(steps, outputs):
            if expected is not None:
                self.assertRegex(output, f"^{commands_test.printed_as(expected).pattern}$", command)
        self.assertGreater(sum(expected is not None for _, expected in steps), 1)


if __name__ == "__main__":
    unittest.main()
