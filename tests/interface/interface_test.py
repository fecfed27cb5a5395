"""What plug-ins were built against stays: the interface changes as its version says, and not otherwise.

The file VERSION.txt lists what the interface of that version is (listing.py); it is never changed once that version was
released. docs/panes.md says what goes with which part of the version.
"""

import pathlib
import re
import sys
import tempfile
import unittest

import listing

HERE = pathlib.Path(__file__).resolve().parent
ADDS_TO_ITS_CLASS = re.compile(r"class ([^:]+(?:::[^:]+)*): ")


def version_of(text):
    """As two numbers."""
    return tuple(int(number) for number in text.split("."))


def own_version():
    text = (listing.ROOT / "platform/InterfaceVersion.h").read_text(encoding="utf-8")
    return tuple(int(number) for number in re.findall(r"Version = (\d+);", text))


def recorded():
    """The listings by their versions."""
    return {version_of(path.stem): path.read_text(encoding="utf-8").splitlines()
            for path in HERE.glob("*.txt") if re.fullmatch(r"\d+\.\d+", path.stem)}


def class_of(line):
    found = ADDS_TO_ITS_CLASS.match(line)
    return found and found.group(1)


def breaks(older, newer):
    """What a plug-in that was built against `older` trips over in `newer`."""
    classes = {class_of(line) for line in older} - {None}
    gone = [f"gone: {line}" for line in older if line not in newer]
    return gone + [f"new: {line}" for line in newer if line not in older and class_of(line) in classes]


@unittest.skipUnless(sys.maxsize > 2**32, "listed as on machines of 64 bits")
class ThisInterface(unittest.TestCase):
    def test_is_what_is_recorded_of_its_version(self):
        now, then = listing.listing(listing.ROOT), recorded()[own_version()]
        changes = [f"+ {line}" for line in now if line not in then] + [f"- {line}" for line in then if line not in now]

        self.assertEqual(changes, [], "the interface has changed: docs/panes.md says which version it has now")

    def test_has_all_that_the_earlier_versions_of_its_number_had(self):
        own = own_version()
        for version, then in recorded().items():
            if version[0] == own[0] and version < own:
                with self.subTest(version):
                    self.assertEqual(breaks(then, recorded()[own]), [])

    def test_has_the_latest_version_of_those_recorded(self):
        self.assertEqual(max(recorded()), own_version())

    def test_has_the_number_of_things_to_look_at(self):
        kinds = {line.split(" ")[0] for line in recorded()[own_version()]}

        self.assertEqual(kinds, {"class", "function", "constant", "enumerator"})


class Planted(unittest.TestCase):
    """A change of a small interface."""

    BEFORE = """
        template <class T> class Box { T* first; int second; };
        enum class Kind : int { One = 1, Two = 2 };
        class Base { public: virtual ~Base(); };
        class Pane : public Base {
          public:
            virtual void show();
            virtual void hide();
            virtual void draw() = 0;
            int width(int scale) const;
            ~Pane() override;
          private:
            void measure();
            int width_ = 0;
            int height_ = 0;
        };
        extern const int limit;
        void open(Pane& pane);
    """

    def listing_of(self, text):
        with tempfile.TemporaryDirectory() as name:
            folder = pathlib.Path(name).resolve()
            (folder / "platform").mkdir()
            (folder / "platform/Header.h").write_text(f"#pragma once\n{text}", encoding="utf-8")
            return listing.listing(folder)

    def breaks_with(self, old, new):
        self.assertIn(old, self.BEFORE)
        return breaks(self.listing_of(self.BEFORE), self.listing_of(self.BEFORE.replace(old, new, 1)))

    def test_that_a_plugin_does_not_notice_is_let_pass(self):
        for old, new in (("Two = 2", "Two = 2, Three = 3"),
                         ("int width(", "int height() const; int width("),
                         ("~Pane() override;", "~Pane() override; static Pane& first();"),
                         ("void measure();", "void measure(int again);"),
                         ("virtual void draw() = 0;", "virtual void draw();"),
                         ("int width_ = 0;", "int width_ = 7;"),
                         ("void open(Pane& pane);", "void open(Pane& pane); void open(Pane& pane, int how);"),
                         ("extern const int limit;", "extern const int limit; extern const int bound;"),
                         ("class Base {", "class Other { virtual void see(); int at; }; class Base {")):
            with self.subTest(new):
                self.assertEqual(self.breaks_with(old, new), [])

    def test_that_a_plugin_trips_over_is_found(self):
        for old, new in (("Two = 2", "Two = 3"),
                         ("Kind : int", "Kind : long"),
                         ("virtual void hide();", ""),
                         ("virtual void hide();", "virtual void hide() = 0;"),
                         ("virtual void hide();", "virtual void hide(); virtual void move();"),
                         ("virtual void show();\n            virtual void hide();",
                          "virtual void hide(); virtual void show();"),
                         ("virtual void show();", "virtual void show(int how);"),
                         ("virtual void show();", "void show();"),
                         ("public Base", "public Box<int>, public Base"),
                         ("int width(int scale) const;", ""),
                         ("int width(int scale) const;", "int width(long scale) const;"),
                         ("int width(int scale) const;", "long width(int scale) const;"),
                         ("int width(int scale) const;", "int width(int scale);"),
                         ("int height_ = 0;", "int height_ = 0; int depth_ = 0;"),
                         ("int width_ = 0;\n            int height_ = 0;", "int height_ = 0; int width_ = 0;"),
                         ("int height_", "unsigned height_"),
                         ("extern const int limit;", "extern const long limit;"),
                         ("extern const int limit;", ""),
                         ("T* first; int second;", "int second; T* first;"),
                         ("void open(Pane& pane);", "void open(Pane& pane, int how = 0);")):
            with self.subTest(new):
                self.assertNotEqual(self.breaks_with(old, new), [])


if __name__ == "__main__":
    unittest.main()
