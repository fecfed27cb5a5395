"""What makes a bundle of a pane says what it wants, and keeps the digests of what is in the bundle."""

import hashlib
import json
import pathlib
import subprocess
import tempfile
import unittest

RESOURCES = pathlib.Path(__file__).resolve().parents[2] / "resources"


class Function(unittest.TestCase):
    def complaint_about(self, arguments):
        with tempfile.TemporaryDirectory() as name:
            script = pathlib.Path(name) / "script.cmake"
            script.write_text(f"include({RESOURCES}/QuorlPane.cmake)\nquorl_add_pane({arguments})\n", encoding="utf-8")
            done = subprocess.run(["cmake", "-P", script], capture_output=True, text=True, check=False)
        self.assertNotEqual(done.returncode, 0)
        return " ".join(done.stderr.split())

    def test_names_what_it_is_not_given(self):
        whole = {"IDENTIFIER": "org.example.alarm", "ROOT_CLASS": "AlarmPane", "SOURCES": "AlarmPane.cpp"}
        for missing in whole:
            with self.subTest(missing):
                given = " ".join(f"{key} {value}" for key, value in whole.items() if key != missing)
                self.assertIn(f"quorl_add_pane(Alarm): say the {missing}.", self.complaint_about(f"Alarm {given}"))

    def test_names_what_it_does_not_know(self):
        self.assertIn("what to do with COLOUR;red", self.complaint_about(
            "Alarm COLOUR red IDENTIFIER org.example.alarm ROOT_CLASS AlarmPane SOURCES AlarmPane.cpp"))


class Registration(unittest.TestCase):
    def setUp(self):
        folder = tempfile.TemporaryDirectory()
        self.addCleanup(folder.cleanup)
        self.bundle = pathlib.Path(folder.name) / "Alarm.bundle"
        self.write("locale/de/LC_MESSAGES/default.mo", "texts")
        self.write("libAlarm.so", "code")
        self.first = pathlib.Path(folder.name) / "first.json"
        self.first.write_text('{"identifier": "org.example.alarm", "sha256": {}, "library": "libAlarm.so"}')

    def write(self, path, text):
        (self.bundle / path).parent.mkdir(parents=True, exist_ok=True)
        (self.bundle / path).write_text(text, encoding="utf-8")

    def register(self, *definitions, bundle=None):
        options = [word for definition in definitions for word in ("-D", definition)]
        return subprocess.run(["cmake", "-D", f"BUNDLE={bundle or self.bundle}", *options, "-P",
                               RESOURCES / "register.cmake"], capture_output=True, text=True, check=False)

    def registered(self):
        return json.loads((self.bundle / "registration.json").read_text(encoding="utf-8"))

    def digests(self):
        return {path.relative_to(self.bundle).as_posix(): hashlib.sha256(path.read_bytes()).hexdigest()
                for path in self.bundle.rglob("*") if path.is_file() and path.name != "registration.json"}

    def test_has_the_digests_of_all_other_files(self):
        self.assertEqual(self.register(f"REGISTRATION={self.first}").returncode, 0)

        self.assertEqual(self.registered(), {
            "identifier": "org.example.alarm", "library": "libAlarm.so", "sha256": self.digests()})

    def test_is_renewed_from_itself(self):
        self.register(f"REGISTRATION={self.first}")
        self.write("libAlarm.so", "stripped")
        (self.bundle / "locale/de/LC_MESSAGES/default.mo").unlink()

        self.assertEqual(self.register().returncode, 0)

        self.assertEqual(list(self.digests()), ["libAlarm.so"])
        self.assertEqual(self.registered(), {
            "identifier": "org.example.alarm", "library": "libAlarm.so", "sha256": self.digests()})

    def test_of_a_bundle_without_its_full_path_is_refused(self):
        done = self.register(f"REGISTRATION={self.first}", bundle="Alarm.bundle")

        self.assertNotEqual(done.returncode, 0)
        self.assertIn("full path", done.stderr)


if __name__ == "__main__":
    unittest.main()
