"""Where the programs and libraries of a build look for libraries: beside themselves, and nowhere that
depends on who starts them from where."""

import os
import pathlib
import re
import subprocess
import tempfile
import unittest

BUILD = pathlib.Path(os.environ["BUILD"])
ELF = b"\x7fELF"
LINKED = (2, 3)  # programs and shared objects; not the object files that they were linked from


def is_linked(path):
    with path.open("rb") as file:
        head = file.read(18)
    return head.startswith(ELF) and int.from_bytes(head[16:18], "little") in LINKED


def linked_files(folder):
    return [path for path in folder.rglob("*")
            if path.is_file() and not path.is_symlink() and is_linked(path)]


def search_paths(path):
    """The entries of a file's RPATH and RUNPATH."""
    dynamic = subprocess.run(["readelf", "--dynamic", "--wide", path],
                             env=os.environ | {"LC_ALL": "C"}, capture_output=True, text=True, check=True)
    lists = re.findall(r"\((?:RPATH|RUNPATH)\).*\[(.*)\]", dynamic.stdout)
    return [entry for entries in lists for entry in entries.split(":")]


def strange_paths(folder):
    return {str(path.relative_to(folder)): entry
            for path in linked_files(folder) for entry in search_paths(path)
            if entry != "$ORIGIN" and not entry.startswith("$ORIGIN/")}


class SearchPaths(unittest.TestCase):
    def assertLooksBesideItself(self, folder):
        self.assertLessEqual(
            {"quorl-script", "libVeloraMusic.so"}, {path.name for path in linked_files(folder)})
        self.assertEqual(strange_paths(folder), {})

    def test_what_is_built_looks_for_libraries_beside_itself(self):
        self.assertLooksBesideItself(BUILD)

    def test_what_is_installed_looks_for_libraries_beside_itself(self):
        with tempfile.TemporaryDirectory() as prefix:
            subprocess.run(["cmake", "--install", BUILD, "--prefix", prefix],
                           stdout=subprocess.DEVNULL, check=True)
            self.assertLooksBesideItself(pathlib.Path(prefix))


if __name__ == "__main__":
    unittest.main()
