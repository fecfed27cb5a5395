"""The demonstration library as it is found on disk."""

import hashlib
import os
import pathlib
import re
import subprocess
import tempfile
import unittest
import urllib.parse
import wave
import xml.etree.ElementTree

TOOL = pathlib.Path(__file__).resolve().parents[2] / "tools" / "make-demo-library"
XSPF = "{http://xspf.org/ns/0/}"


def make(folder):
    return subprocess.run([TOOL, folder], capture_output=True, text=True)


def contents(folder):
    """A digest of each file."""
    files = [path for path in folder.rglob("*") if path.is_file()]
    return {path.relative_to(folder): hashlib.sha256(path.read_bytes()).hexdigest() for path in files}


def modified(folder):
    return {p.relative_to(folder): p.stat().st_mtime_ns for p in folder.rglob("*")}


def entries(playlist):
    """The songs that a playlist file names, as written there."""
    text = playlist.read_text(encoding="utf-8")
    if playlist.suffix == ".xspf":
        locations = xml.etree.ElementTree.fromstring(text).iter(f"{XSPF}location")
        return [urllib.parse.unquote(location.text) for location in locations]
    if playlist.suffix == ".pls":
        return re.findall(r"^File\d+=(.*)$", text, re.MULTILINE)
    return [line for line in text.splitlines() if not line.startswith("#")]


class DemoLibrary(unittest.TestCase):
    @classmethod
    def setUpClass(cls):
        cls.temporary = tempfile.TemporaryDirectory()
        cls.addClassCleanup(cls.temporary.cleanup)
        cls.folder = pathlib.Path(cls.temporary.name, "first")
        result = make(cls.folder)
        if result.returncode != 0:
            raise RuntimeError(result.stderr)

    def playlists(self):
        kinds = (".m3u8", ".pls", ".xspf")
        return {p.relative_to(self.folder).as_posix(): p for p in self.folder.rglob("*") if p.suffix in kinds}

    def test_has_songs_that_play_and_fit_a_small_disk(self):
        songs = list(self.folder.rglob("*.wav"))
        self.assertGreater(len(songs), 60)
        for path in songs:
            self.assertTrue(100_000 <= path.stat().st_size <= 2_000_000, path)
            with wave.open(str(path)) as song:
                frames = song.readframes(song.getnframes())
                self.assertEqual((song.getnchannels(), song.getframerate()), (1, 22_050))
                self.assertNotEqual(frames.strip(b"\0"), b"", f"{path} is silent")
        self.assertLess(sum(path.stat().st_size for path in songs), 60_000_000)

    def test_has_a_playlist_of_every_kind(self):
        counts = {name: len(entries(path)) for name, path in self.playlists().items()}
        self.assertEqual(counts["Road Trip.m3u8"], 12)
        self.assertEqual(counts["Empty.m3u8"], 0)
        self.assertGreater(counts["Long Run.m3u8"], 60)
        self.assertGreater(counts["Quiet Evening.pls"], 0)
        self.assertGreater(counts["Evening Songs.xspf"], 0)
        self.assertGreater(counts["Λαϊκά τραγούδια.m3u8"], 0)
        self.assertGreater(counts["Workout/Intervals.m3u8"], 0)

    def test_marks_what_a_program_is_said_to_have_made(self):
        mix = self.playlists()["Morning Mix.m3u8"].read_text(encoding="utf-8")
        self.assertIn("#GENERATED:mix", mix.splitlines())
        alike = xml.etree.ElementTree.parse(self.playlists()["More Like Copperfinch.xspf"])
        marks = {meta.get("rel"): meta.text for meta in alike.iter(f"{XSPF}meta")}
        self.assertEqual(marks, {"urn:quorl:generated": "playlist"})

    def test_names_only_songs_that_are_there(self):
        for name, path in self.playlists().items():
            for entry in entries(path):
                self.assertTrue((path.parent / entry).is_file(), f"{name}: {entry}")

    def test_is_the_same_wherever_it_is_made(self):
        second = pathlib.Path(self.temporary.name, "second")
        self.assertEqual(make(second).returncode, 0)
        self.assertEqual(contents(second), contents(self.folder))
        self.assertEqual(modified(second), modified(self.folder))

    def test_made_again_is_left_as_it_is(self):
        before = os.stat(self.folder)
        result = make(self.folder)
        self.assertEqual((result.returncode, result.stdout, result.stderr), (0, "", ""))
        self.assertEqual(os.stat(self.folder).st_ino, before.st_ino)


class OccupiedFolder(unittest.TestCase):
    def setUp(self):
        temporary = tempfile.TemporaryDirectory()
        self.addCleanup(temporary.cleanup)
        self.parent = pathlib.Path(temporary.name)
        self.folder = self.parent / "music"
        self.folder.mkdir()

    def test_with_somebodys_music_is_refused_and_left_alone(self):
        (self.folder / "mine.mp3").write_bytes(b"mine")
        result = make(self.folder)
        self.assertNotEqual(result.returncode, 0)
        self.assertIn("name another folder", result.stderr)
        self.assertEqual(list(self.parent.rglob("*")), [self.folder, self.folder / "mine.mp3"])
        self.assertEqual((self.folder / "mine.mp3").read_bytes(), b"mine")

    def test_that_is_empty_is_taken(self):
        self.assertEqual(make(self.folder).returncode, 0)
        self.assertTrue((self.folder / "Road Trip.m3u8").is_file())

    def test_with_an_older_demonstration_library_moves_it_aside(self):
        (self.folder / ".quorl-demo-library").write_text("0")
        (self.folder / "mine.mp3").write_bytes(b"mine")
        result = make(self.folder)
        self.assertEqual(result.returncode, 0)
        (aside,) = (path for path in self.parent.iterdir() if path != self.folder)
        self.assertIn(str(aside), result.stderr)
        self.assertEqual((aside / "mine.mp3").read_bytes(), b"mine")
        self.assertTrue((self.folder / "Road Trip.m3u8").is_file())


if __name__ == "__main__":
    unittest.main()
