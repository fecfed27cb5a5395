"""tools/failed-tests on a report that ctest wrote."""

import pathlib
import subprocess
import tempfile
import unittest

ROOT = pathlib.Path(__file__).resolve().parents[2]

TESTS = """
add_test(good "echo" "all is well")
add_test(bad "sh" "-c" "seq 100; echo here is why; exit 1")
add_test(left_out "sh" "-c" "exit 77")
set_tests_properties(left_out PROPERTIES SKIP_RETURN_CODE 77)
"""


class FailedTests(unittest.TestCase):
    def test_are_named_with_what_they_said_last(self):
        with tempfile.TemporaryDirectory() as folder:
            report = pathlib.Path(folder, "tests.xml")
            pathlib.Path(folder, "CTestTestfile.cmake").write_text(TESTS)
            subprocess.run(["ctest", "--test-dir", folder, "--output-junit", report], capture_output=True)
            printed = subprocess.run([ROOT / "tools/failed-tests", report],
                                     capture_output=True, text=True, check=True).stdout
        lines = printed.splitlines()
        self.assertEqual((lines[0], lines[-1]), ("bad", "here is why"))
        self.assertIn("100", lines)
        self.assertNotIn("1", lines)
        self.assertNotIn("good", printed)
        self.assertNotIn("left_out", printed)


unittest.main()
