"""Keeps the list of scenarios complete."""

import pathlib
import re
import unittest

FOLDER = pathlib.Path(__file__).resolve().parent


class ScenarioList(unittest.TestCase):
    def test_every_script_has_its_story_and_its_expected_replies(self):
        scripts = sorted(script.stem for script in FOLDER.glob("*.jsonl"))
        expected = sorted(file.stem for file in FOLDER.glob("*.expected"))
        expected_on_32_bits = sorted(file.stem for file in FOLDER.glob("*.expected32"))
        readme = (FOLDER / "README.md").read_text(encoding="utf-8")
        stories = sorted(re.findall(r"^\| `([^`]+)` \| \S", readme, re.MULTILINE))

        self.assertEqual(scripts, expected)
        self.assertEqual(scripts, stories)
        self.assertLessEqual(set(expected_on_32_bits), set(scripts))


if __name__ == "__main__":
    unittest.main()
