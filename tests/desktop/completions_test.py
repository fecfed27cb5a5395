"""What shells offer after the names of the programs: each option and nothing else, and playlists by name."""

import os
import pathlib
import re
import subprocess
import tempfile
import unittest

ROOT = pathlib.Path(__file__).resolve().parents[2]
BUILD = pathlib.Path(os.environ["BUILD"])
COMPLETIONS = ROOT / "resources/completions"
PROGRAMS = "quorl", "quorl-script", "quorl-syncd"

PLAYLISTS = r"""#!/bin/sh
[ "$*" = --playlists ] && printf '1\t3\t9\tRoad Trip\n2\t1\t5\tRobert & "Co"\n3\t1\t5\tLong Run\n'
"""


def text_of(path):
    return path.read_text(encoding="utf-8")


def help_text(program="quorl"):
    return subprocess.run([BUILD / "bin" / program, "--help"], capture_output=True, text=True, check=True).stdout


def manual_of(program):
    """Its manual page, without the options of systemctl."""
    lines = text_of(ROOT / f"docs/man/{program}.1").replace("\\-", "-").splitlines()
    return "\n".join(line for line in lines if "systemctl" not in line)


def in_bash_words(text):
    """Each list of words that a script for bash gives to compgen."""
    return " ".join(re.findall(r"compgen -W '([^']*)'", text))


def options_in(text):
    return set(re.findall(r"(?<![\w-])--[a-z][a-z-]*", text))


def panes_in(text):
    """The panes that an option of the help or of the manual offers."""
    return set(re.search(r"--pane[^\n]*?((?:\w+\|)+\w+)", text).group(1).split("|"))


class Options(unittest.TestCase):
    def setUp(self):
        self.options = {program: options_in(help_text(program)) for program in PROGRAMS}

    def check_each(self, offered):
        for program, options in self.options.items():
            with self.subTest(program):
                self.assertEqual(offered(program), options)

    def test_are_found_in_the_help(self):
        self.assertLessEqual({"--text", "--choose", "--version"}, self.options["quorl"])
        self.assertLessEqual({"--plugins", "--help"}, self.options["quorl-script"])
        self.assertLessEqual({"--trial", "--rate-limit"}, self.options["quorl-syncd"])

    def test_are_all_in_the_manual(self):
        self.check_each(lambda program: options_in(manual_of(program)))
        self.assertEqual(panes_in(manual_of("quorl")), panes_in(help_text()))

    def test_are_all_offered_by_bash(self):
        self.check_each(lambda program: options_in(in_bash_words(text_of(COMPLETIONS / f"{program}.bash"))))

    def test_are_all_offered_by_zsh(self):
        self.check_each(lambda program: options_in(text_of(COMPLETIONS / f"_{program}")))

    def test_are_all_offered_by_fish(self):
        self.check_each(lambda program: {f"--{name}" for name in re.findall(
            r" -l ([a-z-]+)", text_of(COMPLETIONS / f"{program}.fish"))})


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

    def by_bash(self, *words, program="quorl"):
        script = ('source "$0"; program=$1; shift; COMP_WORDS=("$program" "$@"); COMP_CWORD=$#; compopt() { :; }; '
                  '"_${program//-/_}" "$program"; printf "%s\\n" "${COMPREPLY[@]}"')
        return self.lines_of("bash", "--norc", "-c", script, COMPLETIONS / f"{program}.bash", program, *words)

    def by_fish(self, line):
        file = COMPLETIONS / f"{line.split()[0]}.fish"
        lines = self.lines_of("fish", "--no-config", "-c", f"source {file}; complete -C '{line}'")
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
        self.assertIn(f"({' '.join(self.by_bash('--pane', ''))})", text_of(COMPLETIONS / "_quorl"))

    def test_playlists_that_begin_so_by_fish(self):
        self.assertEqual(self.by_fish("quorl --choose Road"), ["Road Trip"])
        self.assertIn("none", self.by_fish("quorl --choose "))

    def test_folders_for_the_engine_and_scripts_for_their_host(self):
        home = pathlib.Path(self.environment["HOME"])
        (home / "Music").mkdir()
        (home / "a-story.jsonl").touch()
        self.assertEqual(self.by_bash("--music-folder", f"{home}/", program="quorl-syncd"), [f"{home}/Music"])
        self.assertEqual(self.by_bash("--ret", program="quorl-syncd"), ["--retry-after"])
        self.assertEqual(self.by_bash(f"{home}/a", program="quorl-script"), [f"{home}/a-story.jsonl"])
        self.assertEqual(self.by_bash("--plugins", f"{home}/", program="quorl-script"), [f"{home}/Music"])
        self.assertEqual(self.by_fish(f"quorl-script {home}/a"), [f"{home}/a-story.jsonl"])
        self.assertEqual(self.by_fish("quorl-syncd --ret"), ["--retry-after"])

    def test_is_written_as_zsh_reads_it(self):
        for program in PROGRAMS:
            self.lines_of("zsh", "--no-rcs", "-n", COMPLETIONS / f"_{program}")


if __name__ == "__main__":
    unittest.main()
