"""tools/sysroot, tools/emulate and tools/link-emulated, on machines of all kinds."""

import os
import pathlib
import shutil
import subprocess
import tempfile
import unittest

TOOLS = pathlib.Path(__file__).resolve().parents[2] / "tools"
NEEDED = "awk bash cat cut diff dirname flock getent id mkdir mv readlink rm sed sort touch xargs".split()


class OtherMachines(unittest.TestCase):
    def setUp(self):
        temporary = tempfile.TemporaryDirectory()
        self.addCleanup(temporary.cleanup)
        self.cache = pathlib.Path(temporary.name) / "cache"
        self.path = pathlib.Path(temporary.name) / "path"
        self.path.mkdir()
        for name in NEEDED:
            os.symlink(shutil.which(name), self.path / name)
        apt = self.path / "apt-get"
        apt.write_text('#!/bin/bash\n[[ $1 == indextargets ]] && echo "bookworm main http://mirror.invalid/debian"\n')
        apt.chmod(0o755)

    def run_tool(self, name, *arguments):
        return subprocess.run(
            [TOOLS / name, *arguments], capture_output=True, text=True,
            env={"PATH": str(self.path), "XDG_CACHE_HOME": str(self.cache), "HOME": "/nonexistent"})

    def test_only_asked_for_its_folder_makes_nothing(self):
        result = self.run_tool("sysroot", "armhf", "--prefix")
        self.assertEqual((result.stdout, result.returncode), (f"{self.cache}/quorl/sysroot-armhf\n", 0))
        self.assertFalse(self.cache.exists())

    def test_another_cache_can_be_named(self):
        environment = {"PATH": str(self.path), "QUORL_CACHE": "/elsewhere", "HOME": "/nonexistent"}
        for command in (["sysroot", "arm64", "--prefix"], ["libdispatch", "--target", "arm64", "--prefix"]):
            folder = subprocess.run([TOOLS / command[0], *command[1:]], capture_output=True, text=True,
                                    env=environment, check=True).stdout.strip()
            self.assertEqual(pathlib.Path(folder).parent, pathlib.Path("/elsewhere"))

    def test_a_kind_of_machine_that_is_unknown_is_told_with_those_that_are_not(self):
        for arguments in ([], ["riscv64"]):
            result = self.run_tool("sysroot", *arguments)
            self.assertEqual(result.returncode, 1)
            self.assertIn("Say armhf, arm64 or i386.", result.stderr)

    def test_where_nothing_can_be_fetched_nothing_is_kept(self):
        result = self.run_tool("sysroot", "armhf")
        self.assertEqual((result.stdout, result.returncode), ("", 1))
        self.assertIn("Check the network", result.stderr)
        self.assertEqual(sorted(path.name for path in self.cache.rglob("*")), ["quorl", "sysroot.lock"])

    def test_what_is_there_already_is_only_named(self):
        folder = self.cache / "quorl" / "sysroot-arm64"
        (folder / "var/lib/dpkg").mkdir(parents=True)
        wanted = subprocess.run(
            ["awk", '($1 == "build" || $1 == "test") && $2 ~ /-dev$/ || $1 == "sysroot" { print $2 }',
             TOOLS.parent / "packages.txt"], capture_output=True, text=True, check=True).stdout
        (folder / "packages").write_text(wanted)
        result = self.run_tool("sysroot", "arm64")
        self.assertEqual((result.stdout, result.returncode), (f"{folder}\n", 0))

    def test_a_command_is_needed_to_be_run_elsewhere(self):
        for arguments in ([], ["armhf"], ["riscv64", "true"]):
            result = subprocess.run([TOOLS / "emulate", *arguments], capture_output=True, text=True)
            self.assertEqual(result.returncode, 1)
            self.assertIn("Say for instance: tools/emulate armhf true", result.stderr)

    def test_where_the_kernel_starts_programs_of_i386_their_libraries_are_where_they_look(self):
        can_mount = subprocess.run(["unshare", "--mount", "true"], capture_output=True).returncode == 0
        if not can_mount or "overlay" not in pathlib.Path("/proc/filesystems").read_text():
            self.skipTest("nothing can be laid over anything here")
        library = "usr/lib/i386-linux-gnu/libonly.so"
        root = self.cache / "quorl" / "sysroot-i386"
        (root / "lib").mkdir(parents=True)
        (root / library).parent.joinpath("cmake").mkdir(parents=True)
        (root / library).touch()
        loader = root / "lib/ld-linux.so.2"
        loader.write_text("#!/bin/sh\n")
        loader.chmod(0o755)
        result = subprocess.run([TOOLS / "emulate", "i386", "ls", f"/{library}"], capture_output=True, text=True,
                                env={**os.environ, "QUORL_CACHE": str(root.parent)})
        self.assertEqual((result.stdout, result.stderr), (f"/{library}\n", ""))
        self.assertFalse(pathlib.Path("/", library).exists())


class ProgramsBehindScripts(unittest.TestCase):
    """What tools/link-emulated makes of what a linker has made, which here is a text."""

    def setUp(self):
        temporary = tempfile.TemporaryDirectory()
        self.addCleanup(temporary.cleanup)
        self.folder = pathlib.Path(temporary.name)
        self.emulator = self.script("emulator", 'printf "%s\\n" "$@"')
        self.linker = self.script("linker", 'while [ "$1" != -o ]; do shift; done; echo linked > "$2"')

    def script(self, name, text):
        path = self.folder / name
        path.write_text(f"#!/bin/sh\n{text}\n")
        path.chmod(0o755)
        return path

    def link(self, *arguments):
        subprocess.run([TOOLS / "link-emulated", self.emulator, "/the root", self.linker, *arguments],
                       cwd=self.folder, check=True)

    def test_a_program_is_started_by_the_emulator_wherever_one_is_and_whatever_it_is_given(self):
        (self.folder / "bin").mkdir()
        self.link("a.o", "-o", "bin/program", "-lm")
        os.symlink("bin/program", self.folder / "link")
        for name in ("bin/program", "link"):
            started = subprocess.run([self.folder / name, "one", "and two", ""], cwd="/", capture_output=True,
                                     text=True, check=True).stdout.splitlines()
            self.assertEqual(started, ["-L", "/the root", "-0", str(self.folder / name),
                                       str(self.folder / "bin/.program"), "one", "and two", ""])
        self.assertEqual((self.folder / "bin/.program").read_text(), "linked\n")

    def test_a_library_stays_as_it_is(self):
        self.link("-shared", "-o", "library.so", "a.o")
        self.assertEqual((self.folder / "library.so").read_text(), "linked\n")

    def test_what_cannot_be_linked_is_not_there(self):
        with self.assertRaises(subprocess.CalledProcessError):
            subprocess.run([TOOLS / "link-emulated", self.emulator, "/", "false", "-o", "program"],
                           cwd=self.folder, check=True)
        self.assertFalse((self.folder / "program").exists())


if __name__ == "__main__":
    unittest.main()
