"""Whether all sources agree on the size of a file's length and of a time, on every machine."""

import json
import os
import pathlib
import unittest

BUILD = pathlib.Path(os.environ["BUILD"])
WANTED = {"-D_FILE_OFFSET_BITS=64", "-D_TIME_BITS=64"}


class WordSize(unittest.TestCase):
    def test_all_sources_are_compiled_for_large_files_and_late_years(self):
        entries = json.loads((BUILD / "compile_commands.json").read_text())
        self.assertNotEqual(entries, [])
        others = [entry["file"] for entry in entries if not WANTED <= set(entry["command"].split())]
        self.assertEqual(others, [])


if __name__ == "__main__":
    unittest.main()
