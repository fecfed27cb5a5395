"""What the comments of the headers name is there: doxygen reads all of them without a warning."""

import pathlib
import shutil
import subprocess
import tempfile
import unittest

import reading

CONFIGURATION = reading.ROOT / "docs/Doxyfile"


def warnings_in(root):
    """What doxygen complains of in the tree at `root`; nothing that it makes is kept."""
    with tempfile.TemporaryDirectory() as output:
        settings = (CONFIGURATION.read_text(encoding="utf-8") +
                    f"OUTPUT_DIRECTORY = {output}\nGENERATE_HTML = NO\nGENERATE_XML = YES\n")
        done = subprocess.run(["doxygen", "-"], cwd=root, input=settings, capture_output=True, text=True, check=False)
    return done.stderr if done.returncode or done.stderr else ""


def input_folders():
    [line] = [line for line in CONFIGURATION.read_text(encoding="utf-8").splitlines() if line.startswith("INPUT ")]
    return line.partition("=")[2].split()


class ThisProject(unittest.TestCase):
    def test_has_comments_that_fit_what_they_are_about(self):
        self.assertEqual(warnings_in(reading.ROOT), "")

    def test_has_all_of_its_headers_looked_at(self):
        folders = {path.parts[0] for path in reading.files(reading.ROOT) if path.suffix == ".h"}
        self.assertEqual(set(input_folders()), folders - {"tests", "bench", "fuzz"})


class Planted(unittest.TestCase):
    def setUp(self):
        folder = tempfile.TemporaryDirectory()
        self.addCleanup(folder.cleanup)
        self.root = pathlib.Path(folder.name)
        for name in input_folders():
            (self.root / name).mkdir()
        shutil.copytree(reading.ROOT / "platform", self.root / "platform", dirs_exist_ok=True)

    def warnings_with(self, comment):
        text = f"#pragma once\n\nnamespace quorl {{\n\n{comment}\nint twice(int number, int times);\n\n}}\n"
        (self.root / "runtime/Twice.h").write_text(text, encoding="utf-8")
        return warnings_in(self.root)

    def test_comment_of_prose_is_let_pass(self):
        for comment in ("", "/// Twice as many, `number` times.", "/// @param times how often; at least once."):
            with self.subTest(comment):
                self.assertEqual(self.warnings_with(comment), "")

    def test_comment_on_a_parameter_that_is_not_there_is_found(self):
        self.assertIn("argument 'count'", self.warnings_with("/// @param count how often."))

    def test_comment_that_is_not_closed_is_found(self):
        self.assertIn("Twice.h", self.warnings_with("/// @code\n/// twice(1, 2)"))


if __name__ == "__main__":
    unittest.main()
