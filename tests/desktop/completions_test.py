"""What shells offer after "quorl": each option of the program and nothing else, and playlists by name."""

import os
import pathlib
import re
import subprocess
import tempfile
import unittest

ROOT = pathlib.Path(__file__).resolve().parents[2]
BUILD = pathlib.Path(os.environ["BUILD"])
COMPLETIONS = ROOT / "resources/completions"
BASH, ZSH, FISH = (COMPLETIONS / name for name in ("quorl.bash", "_quorl", "quorl.fish"))
MANUAL = ROOT / "docs/man/quorl.1"

PLAYLISTS = r"""#!/bin/sh
[ "$*" = --playlists ] && printf '1\t3\t9\tRoad Trip\n2\t1\t5\tRobert & "Co"\n3\t1\t5\tLong Run\n'
"""


def text_of(path):
    return path.read_text(encoding="utf-8")


def help_text():
    return subprocess.run([BUILD / "bin/quorl", "--help"], capture_output=True, text=True, check=True).stdout


def options_in(text):
    return set(re.findall(r"(?<![\w-])--[a-z][a-z-]*", text))


def panes_in(text):
    """The panes that an option of the help or of the manual offers."""
    return set(re.search(r"--pane[^\n]*?((?:\w+\|)+\w+)", text).group(1).split("|"))


class Options(unittest.TestCase):
    def setUp(self):
        self.help = help_text()
        self.options = options_in(self.help)

    def test_are_found_in_the_help(self):
        self.assertLessEqual({"--text", "--choose", "--version"}, self.options)

    def test_are_all_in_the_manual(self):
        manual = text_of(MANUAL).replace("\\-", "-")
        self.assertEqual(options_in(manual), self.options)
        self.assertEqual(panes_in(manual), panes_in(self.help))

    def test_are_all_offered_by_bash_and_zsh(self):
        for path in (BASH, ZSH):
            with self.subTest(path.name):
                self.assertEqual(options_in(text_of(path)), self.options)

    def test_are_all_offered_by_fish(self):
        long_options = re.findall(r" -l ([a-z-]+)", text_of(FISH))
        self.assertEqual({f"--{name}" for name in long_options}, self.options)


class Offered(unittest.TestCase):
    def setUp(self):
        folder = tempfile.TemporaryDirectory()
        self.addCleanup(folder.cleanup)
        program = pathlib.Path(folder.name, "quorl")
        program.write_text(PLAYLISTS, encoding="utf-8")
        program.chmod(0o755)
        self.environment = {**os.environ, "PATH": f"{folder.name}:{os.environ['PATH']}", "HOME": folder.name}

    def lines_of(self, *command):
        result = subprocess.run(command, capture_output=True, text=True, env=self.environment, check=True)
        self.assertEqual(result.stderr, "")
        return result.stdout.splitlines()

    def by_bash(self, *words):
        script = ('source "$0"; COMP_WORDS=(quorl "$@"); COMP_CWORD=$#; compopt() { :; }; _quorl quorl; '
                  'printf "%s\\n" "${COMPREPLY[@]}"')
        return self.lines_of("bash", "--norc", "-c", script, BASH, *words)

    def by_fish(self, line):
        lines = self.lines_of("fish", "--no-config", "-c", f"source {FISH}; complete -C '{line}'")
        return [line.split("\t")[0] for line in lines]

    def test_playlists_that_begin_so_by_bash_as_words_of_the_shell(self):
        self.assertEqual(self.by_bash("--choose", "Ro"), ["Road\\ Trip", 'Robert\\ \\&\\ \\"Co\\"'])
        self.assertEqual(self.by_bash("--choose", "Road\\ T"), ["Road\\ Trip"])
        self.assertEqual(self.by_bash("--choose", '"Road'), ["Road Trip"])
        self.assertEqual(self.by_bash("--choose", "no"), ["none"])

    def test_options_and_panes_by_bash(self):
        self.assertEqual(self.by_bash("--pla"), ["--playlists"])
        self.assertEqual(self.by_bash("--pane", ""), ["root", "playlist", "limit", "front"])
        self.assertEqual(self.by_bash("--limit", ""), [""])

    def test_panes_are_those_of_the_program(self):
        panes = panes_in(help_text())
        self.assertEqual(set(self.by_bash("--pane", "")), panes)
        self.assertEqual(set(self.by_fish("quorl --pane ")), panes)
        self.assertIn(f"({' '.join(self.by_bash('--pane', ''))})", text_of(ZSH))

    def test_playlists_that_begin_so_by_fish(self):
        self.assertEqual(self.by_fish("quorl --choose Road"), ["Road Trip"])
        self.assertIn("none", self.by_fish("quorl --choose "))

    def test_is_written_as_zsh_reads_it(self):
        self.lines_of("zsh", "--no-rcs", "-n", ZSH)


if __name__ == "__main__":
    unittest.main()
