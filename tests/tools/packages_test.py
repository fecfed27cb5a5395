"""What the Debian packages are made by: one version, what the tree is built with, and a reason for each exception."""

import pathlib
import re
import unittest

ROOT = pathlib.Path(__file__).resolve().parents[2]
DEBIAN = ROOT / "debian"
PROGRAMS = "quorl", "quorl-script", "quorl-syncd"

# Of the role build, what builds libdispatch or only hastens, and what a Debian that builds packages has.
NOT_OF_THE_PACKAGES = {"g++", "ccache", "clang-14", "xz-utils", "debian-archive-keyring"}
# The programs that come with libglib2.0-dev only where a package is not built for another kind of machine.
ONLY_OF_THE_PACKAGES = {"debhelper-compat", "libglib2.0-dev-bin"}


def text_of(path):
    return path.read_text(encoding="utf-8")


def field(name, text):
    """The packages that a field of a control file names."""
    value = re.search(rf"^{name}:((?:.*\n)(?:[ \t].*\n)*)", text, re.MULTILINE).group(1)
    return {entry.split()[0] for entry in value.split(",") if entry.strip()}


class Version(unittest.TestCase):
    def test_of_the_changelog_is_that_of_the_programs(self):
        newest = re.match(r"quorl \(([^)]+)\)", text_of(DEBIAN / "changelog")).group(1)
        project = re.search(r"project\(quorl VERSION (\S+)", text_of(ROOT / "CMakeLists.txt")).group(1)
        self.assertEqual(newest, project)

    def test_of_the_runtime_is_in_the_name_of_its_package(self):
        major = re.search(r"quorl-runtime .*SOVERSION (\d+)", text_of(ROOT / "runtime/CMakeLists.txt")).group(1)
        self.assertIn(f"\nPackage: libquorl-runtime{major}\n", text_of(DEBIAN / "control"))


class Needed(unittest.TestCase):
    def test_is_what_the_tree_is_built_with(self):
        build = set(re.findall(r"^build +(\S+)", text_of(ROOT / "packages.txt"), re.MULTILINE))
        wanted = field("Build-Depends", text_of(DEBIAN / "control"))
        self.assertEqual(wanted - ONLY_OF_THE_PACKAGES, build - NOT_OF_THE_PACKAGES)


class Package(unittest.TestCase):
    def test_of_each_program_brings_its_manual_and_its_completions(self):
        for program in PROGRAMS:
            with self.subTest(program):
                installed = text_of(DEBIAN / f"{program}.install")
                for file in (f"usr/bin/{program}", f"man1/{program}.1", f"bash-completion/completions/{program}",
                             f"site-functions/_{program} ", f"vendor_completions.d/{program}.fish"):
                    self.assertRegex(installed, rf"{re.escape(file)}(?m:$|\b)")

    def test_is_described_by_control_wherever_it_is_given_files(self):
        described = set(re.findall(r"^Package: (\S+)", text_of(DEBIAN / "control"), re.MULTILINE))
        given = {path.stem for ending in ("install", "lintian-overrides") for path in DEBIAN.glob(f"*.{ending}")}
        self.assertLessEqual(given, described)


class Exemption(unittest.TestCase):
    def test_has_its_reason_above_it(self):
        for path in DEBIAN.glob("**/*lintian-overrides"):
            before = ""
            for line in text_of(path).splitlines():
                if line and not line.startswith("#"):
                    self.assertTrue(before.startswith("#"), f"{path.name}: {line}")
                before = line


if __name__ == "__main__":
    unittest.main()
