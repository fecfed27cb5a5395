"""What ./run starts, in a tree whose other tools only say that they were called."""

import os
import pathlib
import pwd
import shutil
import socket
import subprocess
import tempfile
import unittest

ROOT = pathlib.Path(__file__).resolve().parents[2]
PROGRAMS = {
    "tools/install-packages": "",
    "tools/libdispatch": "echo /somewhere/libdispatch",
    "tools/build": "",
    "tools/make-demo-library": 'mkdir -p "$1"',
    "build/release/bin/quorl": 'printf "%s\\n" "$@"',
    "path/dbus-run-session": 'shift 2; echo "bus of its own"; exec "$@"',
}


class RunScript(unittest.TestCase):
    def setUp(self):
        temporary = tempfile.TemporaryDirectory()
        self.addCleanup(temporary.cleanup)
        self.root = pathlib.Path(temporary.name)
        self.home = self.root / "home"
        self.demo = self.home / ".cache/quorl/demo-music"
        self.home.mkdir()
        shutil.copy(ROOT / "run", self.root)
        for path, commands in PROGRAMS.items():
            self.plant(path, commands)
        self.environment = {
            "HOME": str(self.home),
            "PATH": f"{self.root}/path:{os.environ['PATH']}",
            "DISPLAY": ":7",
            "DBUS_SESSION_BUS_ADDRESS": "unix:path=/nonexistent",
        }

    def plant(self, path, commands):
        program = self.root / path
        program.parent.mkdir(parents=True, exist_ok=True)
        program.write_text(f"#!/bin/bash\n{commands}\n")
        program.chmod(0o755)

    def plant_playlist(self, path):
        (self.home / path).parent.mkdir(parents=True, exist_ok=True)
        (self.home / path).touch()

    def run_script(self, *arguments):
        return subprocess.run(
            [self.root / "run", *arguments], env=self.environment, capture_output=True, text=True)

    def started_with(self, *arguments):
        result = self.run_script(*arguments)
        self.assertEqual(result.returncode, 0, result.stderr)
        return result.stdout.splitlines()

    def test_with_a_display_a_bus_and_playlists_adds_and_says_nothing(self):
        self.plant_playlist("Music/deep/down/Mine.M3U")
        result = self.run_script("--some", "two words")
        self.assertEqual(result.stdout.splitlines(), ["--some", "two words"])
        self.assertEqual(result.stderr, "")

    def test_without_playlists_shows_the_demonstration_library_and_says_so(self):
        (self.home / "Music").mkdir()
        result = self.run_script()
        self.assertEqual(result.stdout.splitlines(), ["--music", str(self.demo)])
        self.assertTrue(self.demo.is_dir())
        self.assertIn(str(self.demo), result.stderr)

    def test_looks_for_playlists_where_the_user_keeps_music(self):
        settings = self.home / ".config/user-dirs.dirs"
        settings.parent.mkdir()
        settings.write_text('XDG_DESKTOP_DIR="$HOME/Desktop"\nXDG_MUSIC_DIR="$HOME/My Tunes"\n')
        self.plant_playlist("My Tunes/Mine.xspf")
        self.assertEqual(self.started_with(), [""])
        self.plant_playlist("Music/Elsewhere.m3u")
        (self.home / "My Tunes/Mine.xspf").unlink()
        self.assertEqual(self.started_with(), ["--music", str(self.demo)])

    def test_takes_the_music_folder_that_is_given(self):
        for arguments in (["--music", "/mine"], ["--music=/mine"]):
            with self.subTest(arguments=arguments):
                self.assertEqual(self.started_with(*arguments), arguments)
        self.assertFalse(self.demo.exists())

    def test_without_a_display_shows_text_and_says_so(self):
        self.plant_playlist("Music/Mine.m3u")
        del self.environment["DISPLAY"]
        result = self.run_script()
        self.assertEqual(result.stdout.splitlines(), ["--text"])
        self.assertIn("No display here: showing the pane as text.", result.stderr)

    def test_without_a_display_keeps_what_was_asked_for(self):
        self.plant_playlist("Music/Mine.m3u")
        del self.environment["DISPLAY"]
        for option in ("--text", "--screenshot=pane.png", "--library", "--status", "--help", "--version"):
            with self.subTest(option=option):
                self.assertEqual(self.started_with(option), [option])

    def test_without_a_bus_starts_one(self):
        self.plant_playlist("Music/Mine.m3u")
        del self.environment["DBUS_SESSION_BUS_ADDRESS"]
        self.assertEqual(self.started_with("--x"), ["bus of its own", "--x"])

    def test_uses_the_bus_of_the_users_session(self):
        self.plant_playlist("Music/Mine.m3u")
        del self.environment["DBUS_SESSION_BUS_ADDRESS"]
        self.environment["XDG_RUNTIME_DIR"] = str(self.root)
        with socket.socket(socket.AF_UNIX) as bus:
            bus.bind(str(self.root / "bus"))
            self.assertEqual(self.started_with("--x"), ["--x"])

    def test_without_a_home_finds_one(self):
        del self.environment["HOME"]
        self.plant("build/release/bin/quorl", 'echo "$HOME"')
        self.assertEqual(self.started_with("--version"), [pwd.getpwuid(os.getuid()).pw_dir])

    def test_stops_where_a_step_fails(self):
        for tool in ("install-packages", "libdispatch", "build"):
            with self.subTest(tool=tool):
                self.plant(f"tools/{tool}", "exit 3")
                result = self.run_script("--version")
                self.assertNotEqual(result.returncode, 0)
                self.assertEqual(result.stdout, "")
                self.plant(f"tools/{tool}", "")

    def test_gives_the_status_of_the_app_back(self):
        self.plant("build/release/bin/quorl", "exit 4")
        self.assertEqual(self.run_script("--version").returncode, 4)


if __name__ == "__main__":
    unittest.main()
