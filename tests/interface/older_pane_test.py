"""A plug-in that was built against an older version of the interface is still shown; one of a later version is not."""

import hashlib
import json
import os
import pathlib
import subprocess
import tempfile
import unittest

import interface_test
import listing

HERE = pathlib.Path(__file__).resolve().parent
HOST = os.environ["QUORL_SCRIPT"]


def unpack(file, folder):
    """Writes the headers that a file keeps in one piece, each behind a line with its path, as they were."""
    for part in file.read_text(encoding="utf-8").split("=== ")[1:]:
        path, _, text = part.partition("\n")
        (folder / path).parent.mkdir(exist_ok=True)
        (folder / path).write_text(text, encoding="utf-8")


def compiled(headers, folder):
    """The shared object that the pane becomes with these headers; whoever loads it has the runtime."""
    library = folder / "libOlder.so"
    subprocess.run([os.environ["CXX"], "-std=c++20", "-shared", "-fPIC", "-fvisibility=hidden", f"-I{headers}",
                    "-isystem", listing.libdispatch(), "-D__has_feature(x)=0", "-D__has_extension(x)=0",
                    HERE / "OlderPane.cpp", "-o", library], check=True)
    return library.read_bytes()


def replies_of(library, version, commands):
    """What the plug-in answers, registered as of the version; without replies, why it was refused."""
    with tempfile.TemporaryDirectory() as name:
        bundle = pathlib.Path(name) / "Older.bundle"
        bundle.mkdir()
        (bundle / "libOlder.so").write_bytes(library)
        (bundle / "registration.json").write_text(json.dumps({
            "identifier": "org.quorl.test.older", "library": "libOlder.so", "rootClass": "OlderPane",
            "sha256": {"libOlder.so": hashlib.sha256(library).hexdigest()}, **version}))
        script = "".join(json.dumps(command) + "\n" for command in commands)
        done = subprocess.run([HOST, "--plugins", name], input=script, capture_output=True, text=True, check=False)
    return [json.loads(line) for line in done.stdout.splitlines()], done.stderr


class OlderPane(unittest.TestCase):
    @classmethod
    def setUpClass(cls):
        with tempfile.TemporaryDirectory() as name:
            folder = pathlib.Path(name).resolve()
            unpack(HERE / "3.0-headers.txt", folder)
            cls.interface = listing.listing(folder)
            cls.library = compiled(folder, folder)

    def rows(self, snapshot):
        return {row["title"]: row["value"] for row in snapshot["stack"][0]["specifiers"]}

    def test_was_built_against_the_interface_of_its_time(self):
        self.assertEqual(self.interface, interface_test.recorded()[3, 0])

    def test_is_shown_and_used_as_ever(self):
        replies, errors = replies_of(self.library, {"interfaceVersion": 3}, [
            {"do": "open"}, {"do": "snapshot"}, {"do": "tap", "specifier": "On"},
            {"do": "tap", "specifier": "Choice"}, {"do": "tap", "path": [0, 1]}, {"do": "snapshot"},
            {"do": "back"}, {"do": "advance", "seconds": 1}, {"do": "snapshot"},
            {"do": "send", "selector": "canBeShownFromSuspendedState"}, {"do": "send", "selector": "didWake"},
            {"do": "release"}])

        self.assertEqual((errors, [reply["ok"] for reply in replies]), ("", [True] * 12))
        self.assertEqual(replies[1]["stack"][0]["title"], "Older")
        self.assertEqual(self.rows(replies[1]), {"On": "off", "Choice": "First"})
        chooser = replies[5]["stack"][1]
        self.assertEqual(chooser["title"], "Choice")
        self.assertEqual([(cell["class"], cell["title"], cell["accessory"], cell["tintColor"])
                          for cell in chooser["sections"][0]["cells"]],
                         [("OlderCell", "First", 0, "tint"), ("OlderCell", "Second", 3, "tint")])
        self.assertEqual(self.rows(replies[8]), {"On": "on", "Choice": "Second"})
        self.assertTrue(replies[9]["result"])
        self.assertIn(["dealloc", "OlderPane"], replies[11]["trace"])

    def test_that_says_it_is_of_a_later_version_is_refused_with_what_to_do(self):
        number, minor = interface_test.own_version()
        for version, update in (({"interfaceVersion": number, "interfaceMinorVersion": minor + 1}, "app"),
                                ({"interfaceVersion": number + 1}, "app"),
                                ({"interfaceVersion": number - 1}, "plug-in")):
            with self.subTest(version):
                replies, errors = replies_of(self.library, version, [{"do": "open"}])

                self.assertEqual(replies, [])
                self.assertIn(f"has version {number}.{minor}; update the {update}", errors)


if __name__ == "__main__":
    unittest.main()
