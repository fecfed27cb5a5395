"""tools/libdispatch on machines where fetching or building goes wrong."""

import os
import pathlib
import shutil
import subprocess
import tempfile
import unittest

TOOL = pathlib.Path(__file__).resolve().parents[2] / "tools" / "libdispatch"

NEEDED = """awk bash cut cp dirname find flock getent id install mkdir mktemp mv nproc readlink rm sed
    sha256sum sort tar uname xz""".split()

MIRROR = 'echo "$(sed -n s/^VERSION_CODENAME=//p /etc/os-release) main http://mirror.invalid/debian"'
DOWNLOAD = f"""case $* in
indextargets*) {MIRROR} ;;
*source*) echo another source >swiftlang_6.0.3.orig.tar.xz ;;
esac"""


class LibDispatch(unittest.TestCase):
    def setUp(self):
        temporary = tempfile.TemporaryDirectory()
        self.addCleanup(temporary.cleanup)
        self.root = pathlib.Path(temporary.name)
        self.cache = self.root / "cache"
        (self.root / "path").mkdir()
        for name in NEEDED:
            os.symlink(shutil.which(name), self.root / "path" / name)
        for name in ("cmake", "ninja", "clang-14"):
            self.plant(name, "exit 1")
        self.plant("apt-get", DOWNLOAD)

    def plant(self, name, commands):
        program = self.root / "path" / name
        program.write_text(f"#!/bin/bash\n{commands}\n")
        program.chmod(0o755)

    def run_tool(self, *arguments):
        return subprocess.run(
            [TOOL, *arguments], capture_output=True, text=True,
            env={"PATH": str(self.root / "path"), "XDG_CACHE_HOME": str(self.cache), "HOME": "/nonexistent"})

    def assertNothingIsKept(self):
        self.assertEqual([path.name for path in self.cache.rglob("*")], ["quorl", "libdispatch.lock"])

    def test_only_asked_for_its_folder_makes_nothing(self):
        result = self.run_tool("--prefix")
        self.assertEqual(result.returncode, 0)
        self.assertEqual(pathlib.Path(result.stdout.strip()).parent, self.cache / "quorl")
        self.assertFalse(self.cache.exists())

    def test_that_is_there_already_is_only_named(self):
        folder = pathlib.Path(self.run_tool("--prefix").stdout.strip())
        folder.mkdir(parents=True)
        result = self.run_tool()
        self.assertEqual((result.stdout, result.stderr, result.returncode), (f"{folder}\n", "", 0))
        self.assertEqual(list(folder.parent.iterdir()), [folder])

    def test_whose_source_is_another_one_is_not_built(self):
        result = self.run_tool()
        self.assertEqual((result.stdout, result.returncode), ("", 1))
        self.assertIn("its SHA-256 differs", result.stderr)
        self.assertNothingIsKept()

    def test_without_network_says_what_to_check(self):
        self.plant("apt-get", f"case $* in indextargets*) {MIRROR} ;; *) exit 100 ;; esac")
        result = self.run_tool()
        self.assertEqual((result.stdout, result.returncode), ("", 1))
        self.assertIn("Check the network", result.stderr)
        self.assertNothingIsKept()

    def test_without_clang_says_what_to_install_before_it_downloads(self):
        (self.root / "path/clang-14").unlink()
        result = self.run_tool()
        self.assertEqual((result.stdout, result.returncode), ("", 1))
        self.assertIn("Install the package clang-14", result.stderr)
        self.assertNotIn("downloading", result.stderr)
        self.assertNothingIsKept()

    def test_clears_away_what_a_killed_run_left(self):
        left = self.cache / "quorl/libdispatch.work/swiftlang_6.0.3.orig.tar.xz"
        left.parent.mkdir(parents=True)
        left.touch()
        result = self.run_tool()
        self.assertIn("downloading", result.stderr)
        self.assertNothingIsKept()


if __name__ == "__main__":
    unittest.main()
