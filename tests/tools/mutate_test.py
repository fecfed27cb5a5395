"""./mutate on sources that are made up: which edits there are, and what becomes of them."""

import os
import pathlib
import shutil
import signal
import subprocess
import sys
import tempfile
import unittest

ROOT = pathlib.Path(__file__).resolve().parents[2]
sys.path.append(str(ROOT / "tools"))
sys.dont_write_bytecode = True

from mutation.edits import edits_of  # noqa: E402

NINJA = """
rule compile
  command = c++ -fPIC -o $out -c $in
rule archive
  command = rm -f $out && /usr/bin/ar qc $out $in && :
rule link
  command = : && c++ $flags -Wl,-rpath,'$$ORIGIN/../lib' $in -o $out $libraries && :
build Sum.o: compile {root}/shared/Sum.cpp
build Product.o: compile {root}/static/Product.cpp
build test.o: compile {root}/tests/test.cpp
build lib/libshared.so: link Sum.o
  flags = -shared -Wl,-soname,libshared.so
build libstatic.a: archive Product.o
build bin/figures-test: link test.o | lib/libshared.so libstatic.a
  libraries = lib/libshared.so libstatic.a
"""
NINJA_OF_OTHER_TEST = """
build other.o: compile {root}/tests/other.cpp
build bin/other-test: link other.o | lib/libshared.so libstatic.a
  libraries = lib/libshared.so libstatic.a
"""
SUM = "int sum(int left, int right) {\n    return left + right;\n}\n"
PRODUCT = "int product(int left, int right) {\n    return left * right;\n}\n"
STRICT_TEST = """
int sum(int, int);
int product(int, int);
int main() { return sum(1, 2) == 3 && product(2, 3) == 6 ? 0 : 1; }
"""
BRANCHING_PRODUCT = """int product(int left, int right) {
    if (left == 0)
        return 0;
    return left * right;
}
"""
TEST_OF_SUMS = "int sum(int, int);\nint main() { return sum(1, 2) == 3 ? 0 : 1; }\n"
TEST_OF_PRODUCTS = "int product(int, int);\nint main() { return product(2, 3) == 6 ? 0 : 1; }\n"
TEST_OF_NOTHING = "int main() {}\n"
LENIENT_TEST = STRICT_TEST.replace("sum(1, 2) == 3", "sum(0, 0) == 0")
TEST_WITH_A_CASE_APART = """
#include <cstdio>
#include <string>
int sum(int, int);
int product(int, int);
int main(int, char** options) {
    std::string cases;
    while (*++options != nullptr) {
        const std::string option = *options;
        if (option.rfind("--gtest_filter=", 0) == 0) cases = option.substr(15);
    }
    if (cases == "Figures.Sum") return sum(1, 2) == 3 ? 0 : 1;
    if (cases == "-Figures.Sum") return product(2, 3) == 6 ? 0 : 1;
    std::puts("[  FAILED  ] Figures.Sum (0 ms)");
    return 1;
}
"""
SUITES = """
[[suite]]
name = "shared"
sources = ["shared/*.cpp"]
tests = ["figures-test"]
required = 100
[[suite]]
name = "static"
sources = ["static/*.cpp"]
tests = ["figures-test"]
required = 100
"""
UNNOTICED = """shared/Sum.cpp sum
-return left + right;
+return left - right;
"""
UNNOTICED_DEFAULT = """shared/Sum.cpp sum
-return left + right;
+return {};
"""


class Edits(unittest.TestCase):
    def edits(self, text):
        """The kind of each edit, and what becomes of the source's only line."""
        with tempfile.TemporaryDirectory() as folder:
            source = pathlib.Path(folder, "Source.cpp")
            source.write_text(text)
            content = source.read_bytes()
            return {(edit.kind, edit.applied(content).decode())
                    for edit in edits_of(source.parent, source.name, ["-std=c++20"])}

    def assertEdits(self, text, *expected):
        self.assertLessEqual(set(expected), self.edits(text))

    def test_a_comparison_is_turned_and_its_boundary_moved(self):
        self.assertEqual(self.edits("bool f(int a, int b) { bool c = a < b; return c; }"), {
            ("comparison turned", "bool f(int a, int b) { bool c = a >= b; return c; }"),
            ("boundary moved", "bool f(int a, int b) { bool c = a <= b; return c; }"),
            ("default returned", "bool f(int a, int b) { bool c = a < b; return {}; }"),
        })

    def test_a_comparison_of_objects_is_turned(self):
        object_type = "struct O { bool operator==(const O&) const; }; "
        self.assertEdits(
            f"{object_type}void f(O a, O b) {{ bool c = a == b; }}",
            ("comparison turned", f"{object_type}void f(O a, O b) {{ bool c = a != b; }}"))

    def test_a_comparison_that_the_compiler_rewrites_is_turned(self):
        object_type = "struct O { bool operator==(const O&) const; }; "
        self.assertEdits(
            f"{object_type}void f(O a, O b) {{ bool c = a != b; }}",
            ("comparison turned", f"{object_type}void f(O a, O b) {{ bool c = a == b; }}"))

    def test_operators_are_replaced(self):
        for operator, other in (("+", "-"), ("-", "+"), ("*", "/"), ("/", "*"), ("%", "*"), ("<<", ">>"),
                                ("&", "|"), ("&&", "||"), ("||", "&&"), ("+=", "-=")):
            self.assertEqual(
                {("operator replaced", f"void f(int a, int b) {{ int c = (a {other} b); }}")},
                self.edits(f"void f(int a, int b) {{ int c = (a {operator} b); }}"))
        self.assertEdits("void f(int a) { ++a; }", ("operator replaced", "void f(int a) { --a; }"))

    def test_constants_are_changed(self):
        for constant, other in (("0", "1"), ("1", "0"), ("15", "16"), ("1.0F", "0.0F"), ("0xFF", "0"),
                                ("true", "false"), ('"words"', '"words~"')):
            self.assertEqual(self.edits(f"const auto value = {constant};"),
                             {("constant changed", f"const auto value = {other};")})

    def test_an_enumerator_becomes_another_one(self):
        enum = "enum class E { First, Second, Third }; "
        self.assertEqual(self.edits(f"{enum}const E e = E::First;"),
                         {("constant changed", f"{enum}const E e = E::Second;")})
        self.assertEqual(self.edits(f"{enum}const E e = E::Third;"),
                         {("constant changed", f"{enum}const E e = E::First;")})

    def test_the_label_of_a_case_stays_as_it_is(self):
        self.assertEqual(self.edits("void f(int a) { switch (a) { case 1: break; } }"), set())

    def test_a_negation_is_dropped(self):
        self.assertEqual(self.edits("void f(bool a) { bool b = !a; }"),
                         {("negation dropped", "void f(bool a) { bool b = a; }")})

    def test_a_condition_is_made_constant(self):
        self.assertEqual(self.edits("void f(bool a) { if (a) {} }"), {
            ("condition made constant", "void f(bool a) { if (true) {} }"),
            ("condition made constant", "void f(bool a) { if (false) {} }"),
        })
        self.assertEqual(self.edits("void f(bool a) { while (a) {} }"),
                         {("condition made constant", "void f(bool a) { while (false) {} }")})
        self.assertEqual(self.edits("void f(bool a, int b, int c) { int d = a ? b : c; }"), {
            ("condition made constant", "void f(bool a, int b, int c) { int d = true ? b : c; }"),
            ("condition made constant", "void f(bool a, int b, int c) { int d = false ? b : c; }"),
        })

    def test_what_a_condition_declares_is_still_there_when_it_is_constant(self):
        self.assertEdits("int* g(); void f() { if (int* a = g()) {} }",
                         ("condition made constant", "int* g(); void f() { if (int* a = g(); true) {} }"))
        self.assertEdits("int* g(); void f() { if (int* a = g(); *a == *a) {} }",
                         ("condition made constant", "int* g(); void f() { if (int* a = g(); true) {} }"))

    def test_a_default_is_returned_in_place_of_a_value(self):
        self.assertEqual(self.edits("int f(int a) { return a; }"),
                         {("default returned", "int f(int a) { return {}; }")})
        self.assertEqual(self.edits("int& f(int& a) { return a; }"), set())
        self.assertEqual(self.edits("int* f() { return nullptr; }"), set())

    def test_a_statement_is_dropped(self):
        self.assertEqual(self.edits("void g(); void f() { g(); }"),
                         {("statement dropped", "void g(); void f() { ; }")})
        self.assertEqual(self.edits("void f(int a, int b) { a = b; }"),
                         {("statement dropped", "void f(int a, int b) { ; }")})

    def test_neighbouring_calls_are_swapped(self):
        self.assertEdits("void g(); void h(); void f() { g(); h(); }",
                         ("statements swapped", "void g(); void h(); void f() { h(); g(); }"))
        self.assertNotIn("statements swapped",
                         {kind for kind, _ in self.edits("void g(); void f() { g(); int a; g(); }")})

    def test_an_edit_says_in_which_function_it_is(self):
        with tempfile.TemporaryDirectory() as folder:
            pathlib.Path(folder, "Source.cpp").write_text(
                "namespace n { struct S { int f(int a); }; int S::f(int a) { return a; } }")
            edits = edits_of(pathlib.Path(folder), "Source.cpp", ["-std=c++20"])
        self.assertEqual([edit.function for edit in edits], ["n::S::f"])


class Check(unittest.TestCase):
    """A tree of two sources in two kinds of libraries, and one test."""

    def setUp(self):
        temporary = tempfile.TemporaryDirectory()
        self.addCleanup(temporary.cleanup)
        self.root = pathlib.Path(temporary.name)
        shutil.copy(ROOT / "mutate", self.root)
        shutil.copytree(ROOT / "tools/mutation", self.root / "tools/mutation")
        self.write("build/tiny/build.ninja", NINJA.format(root=self.root))
        self.write("shared/Sum.cpp", SUM)
        self.write("static/Product.cpp", PRODUCT)
        self.write("tests/mutations/suites.toml", SUITES)
        self.list_as_equivalent("")
        self.build_with(STRICT_TEST)

    def write(self, path, text):
        file = self.root / path
        file.parent.mkdir(parents=True, exist_ok=True)
        file.write_text(text)

    def list_as_equivalent(self, text):
        self.write("tests/mutations/equivalent.txt", text)

    def build_with(self, test):
        self.write("tests/test.cpp", test)
        folder = self.root / "build/tiny"
        subprocess.run(["ninja", "-C", folder], check=True, stdout=subprocess.DEVNULL)
        with (folder / "compile_commands.json").open("w") as file:
            subprocess.run(["ninja", "-C", folder, "-t", "compdb", "compile"], check=True, stdout=file)

    def command(self, *arguments):
        return [self.root / "mutate", "--build", self.root / "build/tiny", *arguments]

    def check(self, *arguments):
        return subprocess.run(self.command(*arguments), capture_output=True, text=True)

    def assertFound(self, result, code, *rows):
        """The exit code, and of each suite: edits, caught, timed out, survived, not compiled, equivalent."""
        self.assertEqual(result.returncode, code, result.stdout + result.stderr)
        found = [line.split() for line in result.stdout.splitlines()]
        for name, *figures in rows:
            self.assertIn([name, *map(str, figures)], [line[:7] for line in found], result.stdout)

    def test_what_a_test_catches_is_reported_as_caught(self):
        self.assertFound(self.check("--all"), 0, ("shared", 2, 2, 0, 0, 0, 0), ("static", 2, 2, 0, 0, 0, 0))

    def test_what_none_catches_is_reported_as_survived_and_shown(self):
        self.build_with(LENIENT_TEST)
        result = self.check("--all")
        self.assertFound(result, 1, ("shared", 2, 0, 0, 2, 0, 0), ("static", 2, 2, 0, 0, 0, 0))
        self.assertIn(UNNOTICED, result.stdout)
        self.assertIn(UNNOTICED_DEFAULT, result.stdout)

    def test_survivors_are_few_enough_where_a_share_is_required(self):
        self.build_with(LENIENT_TEST)
        self.write("tests/mutations/suites.toml", SUITES.replace("100", "0"))
        self.assertFound(self.check("--all"), 0, ("shared", 2, 0, 0, 2, 0, 0))

    def test_what_is_listed_as_equivalent_is_left_out(self):
        self.build_with(LENIENT_TEST)
        self.list_as_equivalent(f"# Why\n\n{UNNOTICED}Nobody sums.\n\n{UNNOTICED_DEFAULT}Nobody\nsums.\n")
        self.assertFound(self.check("--all"), 0, ("shared", 0, 0, 0, 0, 0, 2), ("static", 2, 2, 0, 0, 0, 0))

    def test_what_is_listed_stays_so_when_lines_move(self):
        self.write("shared/Sum.cpp", "// About sums.\n\n" + SUM)
        self.list_as_equivalent(f"{UNNOTICED}Nobody sums.\n")
        self.assertFound(self.check("--all"), 0, ("shared", 1, 1, 0, 0, 0, 1))

    def test_a_stale_entry_is_an_error(self):
        self.list_as_equivalent(f"{UNNOTICED.replace('left', 'first')}Nobody sums.\n")
        result = self.check("--all")
        self.assertEqual(result.returncode, 2)
        self.assertIn("return first + right;", result.stderr)

    def test_an_entry_of_a_source_that_is_gone_is_an_error(self):
        self.list_as_equivalent(f"{UNNOTICED.replace('Sum', 'Gone')}Nobody sums.\n")
        self.assertEqual(self.check("--all").returncode, 2)

    def test_an_entry_without_a_reason_is_an_error(self):
        self.list_as_equivalent(UNNOTICED)
        self.assertEqual(self.check("--all").returncode, 2)

    def test_a_test_that_fails_without_an_edit_is_an_error(self):
        self.build_with(STRICT_TEST.replace("== 3", "== 4"))
        result = self.check("--all")
        self.assertEqual(result.returncode, 2)
        self.assertIn("figures-test fails without an edit", result.stderr)

    def test_a_case_that_fails_beside_others_is_run_by_itself(self):
        self.build_with(TEST_WITH_A_CASE_APART)
        self.assertFound(self.check("--all"), 0, ("shared", 2, 2, 0, 0, 0, 0), ("static", 2, 2, 0, 0, 0, 0))

    def test_sources_and_build_stay_as_they_are(self):
        before = self.everything()
        self.check("--all")
        self.assertEqual(self.everything(), before)

    def everything(self):
        return {path: path.read_bytes() for path in self.root.rglob("*")
                if path.is_file() and not path.is_relative_to(self.root / "build/mutations")}

    def test_goes_on_where_it_was_killed(self):
        with subprocess.Popen(self.command("--all"), stdout=subprocess.DEVNULL, stderr=subprocess.PIPE,
                              text=True, start_new_session=True) as process:
            first = process.stderr.readline()
            os.killpg(process.pid, signal.SIGKILL)
            tried = [first, *process.stderr.readlines()]
        result = self.check("--all")
        self.assertFound(result, 0, ("shared", 2, 2, 0, 0, 0, 0), ("static", 2, 2, 0, 0, 0, 0))
        self.assertLessEqual(len(result.stderr.splitlines()), 4 - len(tried))

    def test_a_survivor_is_tried_again_when_the_test_has_changed(self):
        self.build_with(LENIENT_TEST)
        self.check("--all")
        self.build_with(STRICT_TEST)
        self.assertFound(self.check("--all"), 0, ("shared", 2, 2, 0, 0, 0, 0), ("static", 2, 2, 0, 0, 0, 0))

    def test_a_sample_is_that_of_its_seed(self):
        results = [self.check("--seed", "7", "--only", "static") for _ in range(2)]
        self.assertIn("seed of the sample is 7", results[0].stdout)
        self.assertFound(results[0], 0, ("static", 2, 2, 0, 0, 0, 0))
        self.assertNotIn("shared", results[0].stdout)

    def build_counting(self, test, ninja=NINJA):
        self.write("build/tiny/build.ninja", ninja.format(root=self.root).replace("c++ ", "c++ --coverage "))
        self.build_with(test)

    def test_what_the_tests_reach_is_told(self):
        self.write("static/Product.cpp", BRANCHING_PRODUCT)
        self.build_counting(STRICT_TEST)
        result = self.check("--coverage")
        self.assertEqual(result.returncode, 0, result.stderr)
        rows = [line.split() for line in result.stdout.splitlines()]
        self.assertIn(["shared", "100.0", "%", "none"], rows)
        self.assertIn(["static", "75.0", "%", "50.0", "%"], rows)

    def measure_a_test_of_sums_and_one_of_products(self):
        """Then, behind the back of the check, the build has one that notices nothing, and one of both."""
        self.write("tests/mutations/suites.toml", SUITES.replace('"figures-test"', '"figures-test", "other-test"'))
        self.write("tests/other.cpp", TEST_OF_PRODUCTS)
        self.build_counting(TEST_OF_SUMS, NINJA + NINJA_OF_OTHER_TEST)
        self.check("--coverage")
        self.write("tests/other.cpp", STRICT_TEST)
        self.build_with(TEST_OF_NOTHING)
        self.write("tests/other.cpp", TEST_OF_PRODUCTS)
        self.write("tests/test.cpp", TEST_OF_SUMS)

    def test_an_edit_is_tried_on_tests_that_reach_its_line_while_its_source_stays_the_same(self):
        self.measure_a_test_of_sums_and_one_of_products()
        self.assertFound(self.check("--all"), 1, ("shared", 2, 0, 0, 2, 0, 0), ("static", 2, 2, 0, 0, 0, 0))
        self.write("shared/Sum.cpp", f"// Of two.\n{SUM}")
        self.assertFound(self.check("--all"), 0, ("shared", 2, 2, 0, 0, 0, 0))

    def test_an_edit_is_tried_on_all_tests_where_one_has_changed(self):
        self.measure_a_test_of_sums_and_one_of_products()
        self.write("tests/test.cpp", STRICT_TEST)
        self.assertFound(self.check("--all"), 0, ("shared", 2, 2, 0, 0, 0, 0))

    def test_an_edit_is_tried_on_all_tests_where_none_seems_to_reach_it(self):
        self.build_counting(TEST_OF_SUMS)
        self.check("--coverage")
        self.build_with(STRICT_TEST)
        self.write("tests/test.cpp", TEST_OF_SUMS)
        self.assertFound(self.check("--all"), 0, ("static", 2, 2, 0, 0, 0, 0))

    def test_the_report_is_written_to_a_file_too(self):
        self.check("--all", "--report", self.root / "report")
        self.assertIn("shared", (self.root / "report").read_text())


if __name__ == "__main__":
    unittest.main()
