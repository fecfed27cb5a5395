"""What a script can rely on of the program that plays it: lines in, lines out, whatever comes."""

import hashlib
import json
import os
import pathlib
import shutil
import signal
import subprocess
import tempfile
import unittest

PROGRAM = os.environ["QUORL_SCRIPT"]
BUNDLES = pathlib.Path(PROGRAM).parent.parent / "lib/quorl/plugins"
BUSY = b'{"do":"open"}\n' + b'{"do":"snapshot"}\n{"do":"advance","seconds":1}\n' * 50


def play(script, *arguments, **options):
    return subprocess.run([PROGRAM, *arguments], input=script, capture_output=True, check=False, **options)


def replies(result):
    return [json.loads(line) for line in result.stdout.splitlines()]


class WhateverComes(unittest.TestCase):
    def assert_refused_and_goes_on(self, line):
        result = play(line + b'\n{"do":"snapshot"}\n')

        refusal, snapshot = replies(result)
        self.assertFalse(refusal["ok"])
        self.assertTrue(refusal["error"])
        self.assertEqual(snapshot, {"ok": True, "trace": [], "stack": []})
        self.assertEqual(result.returncode, 1)

    def test_a_line_that_is_not_json_is_refused_and_the_next_one_is_read(self):
        for line in (b"", b"   ", b"{", b"nonsense", b"{} {}", b"[1,2", b'{"do":', b"null", b"7", b'"open"'):
            with self.subTest(line):
                self.assert_refused_and_goes_on(line)

    def test_bytes_that_are_no_text_are_refused(self):
        for line in (b'{"do":"\xff\xfe"}', b'{"do":"open"\x00}', b"\x00", b'{"do":"\xc3"}', b'{"do":"\\ud800"}'):
            with self.subTest(line):
                self.assert_refused_and_goes_on(line)

    def test_a_line_that_is_nested_too_deeply_is_refused(self):
        for line in (b"[" * 10_000_000, b'{"do":"batch","steps":[' * 5000, b'{"do":' * 100_000):
            with self.subTest(line[:10]):
                self.assert_refused_and_goes_on(line)

    def test_numbers_beyond_all_bounds_are_refused(self):
        for seconds in (b"1e999", b"-1", b"1" * 100_000, b"-0.5", b"true", b'"1"', b"[]", b"9223372036854775808"):
            with self.subTest(seconds[:10]):
                self.assert_refused_and_goes_on(b'{"do":"advance","seconds":' + seconds + b"}")

    def test_a_line_of_ten_megabytes_is_played(self):
        name = "n" * 10_000_000
        library = {"do": "library", "media": ["music"], "playlists": [{"id": "1", "name": name}]}
        script = json.dumps(library) + '\n{"do":"open"}\n{"do":"tap","specifier":"Synced Playlist"}\n{"do":"snapshot"}\n'

        result = play(script.encode())

        cell = replies(result)[-1]["stack"][1]["sections"][0]["cells"][0]
        self.assertEqual(cell["title"], name)
        self.assertEqual(result.returncode, 0)

    def test_a_line_without_an_end_is_skipped_without_being_kept(self):
        result = play(b"x" * (65 << 20) + b'\n{"do":"snapshot"}\n')

        refusal, snapshot = replies(result)
        self.assertIn("longer than", refusal["error"])
        self.assertTrue(snapshot["ok"])

    def test_time_ends_without_going_round(self):
        result = play(b'{"do":"open"}\n{"do":"advance","seconds":9200000000}\n{"do":"advance","seconds":9200000000}\n')

        self.assertEqual([reply["ok"] for reply in replies(result)], [True, True, False])

    def test_the_last_line_may_lack_its_end(self):
        result = play(b'{"do":"snapshot"}\r\n{"do":"snapshot"}')

        self.assertEqual(len(replies(result)), 2)
        self.assertEqual(result.returncode, 0)

    def test_nothing_in_gives_nothing_out(self):
        result = play(b"")

        self.assertEqual((result.returncode, result.stdout, result.stderr), (0, b"", b""))


class Output(unittest.TestCase):
    def test_each_reply_comes_before_the_next_command_is_given(self):
        with subprocess.Popen([PROGRAM], stdin=subprocess.PIPE, stdout=subprocess.PIPE) as program:
            for command in ("open", "snapshot", "query"):
                program.stdin.write(b'{"do":"%s"}\n' % command.encode())
                program.stdin.flush()
                self.assertTrue(json.loads(program.stdout.readline())["ok"])
            program.stdin.close()
            self.assertEqual(program.wait(), 0)

    def test_a_script_played_twice_gives_the_same_bytes(self):
        self.assertEqual(play(BUSY).stdout, play(BUSY).stdout)

    def test_killed_at_any_line_it_has_written_whole_lines_only(self):
        for lines in (1, 2, 5, 30):
            with self.subTest(lines), tempfile.TemporaryFile() as output:
                with subprocess.Popen([PROGRAM], stdin=subprocess.PIPE, stdout=output) as program:
                    program.stdin.write(BUSY)
                    program.stdin.flush()
                    # Read without a seek: the program shares the file's position.
                    while os.pread(output.fileno(), 1 << 26, 0).count(b"\n") < lines:
                        pass
                    program.send_signal(signal.SIGKILL)
                written = os.pread(output.fileno(), 1 << 26, 0)
            self.assertTrue(written.endswith(b"\n"))
            self.assertTrue(play(BUSY).stdout.startswith(written))

    def test_a_reader_who_leaves_is_no_crash(self):
        with subprocess.Popen([PROGRAM], stdin=subprocess.PIPE, stdout=subprocess.PIPE, stderr=subprocess.PIPE) as program:
            program.stdout.close()
            _, problem = program.communicate(BUSY)

        self.assertEqual(program.returncode, 2)
        self.assertIn(b"standard output", problem)


class Inspection(unittest.TestCase):
    LAYOUT = {"do": "layout", "title": [16, 10, 150, 20], "detail": [200, 10, 60, 20], "fits": 100, "scale": 2}

    def setUp(self):
        folder = tempfile.TemporaryDirectory()
        self.addCleanup(folder.cleanup)
        self.folder = pathlib.Path(folder.name)

    def replies_of_plugin(self, library, root_class, *commands):
        """What a plug-in of the interface of this tree answers."""
        bundle = self.folder / "Other.bundle"
        bundle.mkdir()
        shutil.copy(library, bundle)
        name, digest = pathlib.Path(library).name, hashlib.sha256(pathlib.Path(library).read_bytes()).hexdigest()
        registration = json.loads((BUNDLES / "VeloraMusic.bundle/registration.json").read_text())
        registration.update(library=name, rootClass=root_class, sha256={name: digest})
        (bundle / "registration.json").write_text(json.dumps(registration))
        script = "".join(json.dumps(command) + "\n" for command in commands)
        return replies(play(script.encode(), "--plugins", self.folder))

    def test_asks_each_answer_once_and_in_order(self):
        (reply,) = self.replies_of_plugin(os.environ["COUNTING_PLUGIN"], "CountingPane", {"do": "query"})

        self.assertEqual(reply, {
            "ok": True, "trace": [], "stage": 1, "progress": 2, "completedAssetCount": 3,
            "totalAssetCount": 4, "assetSyncPlaylist": "5"})

    def test_marks_what_a_plugin_does_on_another_thread(self):
        event = {"do": "session", "id": "1", "event": "sessionWillBegin:"}
        *_, here, elsewhere = self.replies_of_plugin(
            os.environ["OBSERVING_PLUGIN"], "ObservingPane", {"do": "sessions", "list": [{"id": "1"}]},
            {"do": "create"}, event, {**event, "thread": "other"})

        post = ["NSNotificationCenter", "postNotificationName:object:", "SessionWillBegin", None]
        self.assertEqual(here, {"ok": True, "trace": [post]})
        self.assertEqual(elsewhere, {"ok": True, "trace": [post + ["thread:other"]]})

    def test_says_so_where_a_plugin_shows_nothing(self):
        query, layout, after = self.replies_of_plugin(
            os.environ["PLAIN_PLUGIN"], "TestPane", {"do": "query"}, self.LAYOUT, {"do": "open"})

        for reply, wanted in ((query, "QuorlInspectionTable"), (layout, "LMQuorlPlaylistCell")):
            self.assertFalse(reply["ok"])
            self.assertIn("Other.bundle", reply["error"])
            self.assertIn(wanted, reply["error"])
        self.assertTrue(after["ok"])

    def test_lays_a_cell_of_the_plugins_own_class_out(self):
        (reply,) = replies(play(json.dumps(self.LAYOUT).encode()))

        self.assertEqual(reply, {
            "ok": True, "trace": [["dealloc", "LMQuorlPlaylistCell"]],
            "title": [16, 10, 110, 20], "detail": [160, 10, 100, 20], "set": ["detail", "title"]})


class CommandLine(unittest.TestCase):
    def setUp(self):
        folder = tempfile.TemporaryDirectory()
        self.addCleanup(folder.cleanup)
        self.folder = pathlib.Path(folder.name)

    def test_scripts_are_played_one_after_the_other_in_one_situation(self):
        (self.folder / "first").write_text('{"do":"open"}\n')
        (self.folder / "second").write_text('{"do":"query"}\n{"do":"nothing"}')

        result = play(b'{"do":"release"}', self.folder / "first", self.folder / "second", "-")

        self.assertEqual([reply["ok"] for reply in replies(result)], [True, True, False, True])
        self.assertEqual(result.returncode, 1)

    def test_wrong_usage_is_told_from_a_wrong_command(self):
        for arguments in (["--no-such-option"], ["--plugins", "/no/such/place"], [self.folder / "missing"], [self.folder]):
            with self.subTest(arguments):
                result = play(b"", *arguments)

                self.assertEqual((result.returncode, result.stdout), (2, b""))
                self.assertTrue(result.stderr)

    def test_help_and_version_are_given(self):
        for option in ("--help", "--version"):
            self.assertIn(b"quorl-script" if option == "--version" else b"--plugins", play(b"", option).stdout)

    def test_the_bundle_of_the_given_place_is_played(self):
        shutil.copytree(BUNDLES / "VeloraMusic.bundle", self.folder / "Broken.bundle")
        (self.folder / "Broken.bundle/registration.json").write_text("{}")

        result = play(b'{"do":"open"}\n', "--plugins", self.folder)

        self.assertEqual(result.returncode, 2)
        self.assertIn(b"Broken.bundle/registration.json", result.stderr)


if __name__ == "__main__":
    unittest.main()
