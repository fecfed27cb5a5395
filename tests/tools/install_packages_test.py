"""tools/install-packages on machines that only pretend to be a Debian."""

import os
import pathlib
import shutil
import subprocess
import tempfile
import unittest

ROOT = pathlib.Path(__file__).resolve().parents[2]

LIST = """
# role package purpose
build  maker     makes
run    listener  listens
test   checker   checks
"""


class InstallPackages(unittest.TestCase):
    def setUp(self):
        temporary = tempfile.TemporaryDirectory()
        self.addCleanup(temporary.cleanup)
        self.root = pathlib.Path(temporary.name)
        (self.root / "tools").mkdir()
        (self.root / "path").mkdir()
        (self.root / "packages.txt").write_text(LIST)
        shutil.copy(ROOT / "tools/install-packages", self.root / "tools")
        for name in ("awk", "bash", "comm", "dirname", "env", "readlink", "sort"):
            os.symlink(shutil.which(name), self.root / "path" / name)
        self.plant("apt-get", f'echo "$@" >>"{self.root}/calls"')
        self.plant("sleep", "")
        self.be(user=0, installed=[])

    def plant(self, name, commands):
        program = self.root / "path" / name
        program.write_text(f"#!/bin/bash\n{commands}\n")
        program.chmod(0o755)

    def be(self, user, installed):
        self.plant("id", f"echo {user}")
        self.plant("dpkg-query", "\n".join(f"echo installed {package}" for package in installed))

    def install(self, *roles):
        return subprocess.run(
            [self.root / "tools/install-packages", *roles],
            env={"PATH": str(self.root / "path")}, capture_output=True, text=True)

    def calls(self):
        calls = self.root / "calls"
        return calls.read_text().splitlines() if calls.exists() else []

    def test_with_everything_there_does_and_says_nothing_and_wants_no_root(self):
        self.be(user=1000, installed=["maker", "listener", "something"])
        result = self.install("build", "run")
        self.assertEqual((result.returncode, result.stdout, result.stderr), (0, "", ""))
        self.assertEqual(self.calls(), [])

    def test_installs_only_what_is_missing_from_the_roles_asked_for(self):
        self.be(user=0, installed=["maker"])
        result = self.install("build", "run")
        self.assertEqual(result.returncode, 0, result.stderr)
        update, _, install = self.calls()
        self.assertTrue(update.endswith(" update"))
        self.assertTrue(install.endswith("install --yes --no-install-recommends listener"))

    def test_says_how_much_it_fetches(self):
        self.plant("apt-get", """case " $* " in
            *" --print-uris "*) printf "'address' a.deb %s MD5Sum:0\\n" 1600000 400001 ;;
            esac""")
        self.assertIn("Fetching 3 MB ...", self.install("run").stderr)

    def test_without_root_goes_through_sudo(self):
        self.be(user=1000, installed=[])
        self.plant("sudo", f'echo sudo >>"{self.root}/calls"; exec "$@"')
        self.assertEqual(self.install("run").returncode, 0)
        self.assertEqual(self.calls()[0], "sudo")

    def test_without_root_or_sudo_says_what_to_install(self):
        self.be(user=1000, installed=[])
        result = self.install("run")
        self.assertEqual(result.returncode, 1)
        self.assertIn("apt-get install --no-install-recommends listener", result.stderr)
        self.assertEqual(self.calls(), [])

    def test_on_another_system_says_where_the_list_is(self):
        (self.root / "path/dpkg-query").unlink()
        result = self.install("run")
        self.assertEqual(result.returncode, 1)
        self.assertIn("packages.txt", result.stderr)

    def test_tries_again_when_the_network_fails(self):
        self.plant("apt-get", f'echo "$@" >>"{self.root}/calls"; (($(wc -l <"{self.root}/calls") > 2))')
        os.symlink(shutil.which("wc"), self.root / "path/wc")
        self.assertEqual(self.install("run").returncode, 0)

    def test_gives_up_with_what_apt_said(self):
        self.plant("apt-get", 'echo "E: no route" >&2; exit 100')
        result = self.install("run")
        self.assertEqual(result.returncode, 1)
        self.assertEqual(result.stderr.count("E: no route"), 3)


if __name__ == "__main__":
    unittest.main()
