"""What the documents name is there: each link, each heading that one leads to, each file."""

import fnmatch
import pathlib
import re
import tempfile
import unittest

import reading

# A path, or the name of a source, that somebody could look for in this tree.
LOOKS_LIKE_A_FILE = re.compile(r"[\w.+*@-]+(?:/[\w.+*@-]+)+/?|[\w+*-]+\.(?:h|cpp|py|po|md)")
# What stands for many names.
PLACEHOLDER = re.compile(r"\b(?:X|xx|NUMBER)\b")

# Files elsewhere: on the wearable, and made by the build.
ELSEWHERE = ("Music/", ".quorl/", "build/")


def is_of_this_tree(name, paths):
    """Whether a file or folder is called so, with its folders or the last of them, with its ending or without."""
    wanted = name.removeprefix("./").rstrip("/")
    endings = (wanted, f"*/{wanted}")
    patterns = [f"{start}{rest}" for start in endings for rest in ("", ".*", "/*")]
    return any(fnmatch.fnmatchcase(path, pattern) for path in paths for pattern in patterns)


def missing_files(document, paths):
    for line, text in document.code():
        is_name = LOOKS_LIKE_A_FILE.fullmatch(text) and not PLACEHOLDER.search(text)
        if is_name and not text.startswith(ELSEWHERE) and not is_of_this_tree(text, paths):
            yield f"{document.path.name}:{line.number}: there is no {text}"


def open_backquotes(document):
    """A text that goes on behind the end of its line would not be seen."""
    for line in document.prose:
        if line.text.count("`") % 2:
            yield f"{document.path.name}:{line.number}: a backquote is open"


def broken_links(document):
    for line, target in document.links():
        path, _, anchor = target.partition("#")
        if re.match(r"[a-z]+:", target):
            continue
        leads_to = (document.path.parent / path).resolve() if path else document.path
        if not leads_to.exists():
            yield f"{document.path.name}:{line.number}: {target} leads nowhere"
        elif anchor and anchor not in reading.Document(leads_to).anchors():
            yield f"{document.path.name}:{line.number}: {path or document.path.name} has no heading #{anchor}"


def led_to(root):
    """The documents that links lead to from the one at the top."""
    found, waiting = set(), [root / "README.md"]
    while waiting:
        path = waiting.pop()
        if path.suffix == ".md" and path not in found:
            found.add(path)
            targets = [target.partition("#")[0] for _, target in reading.Document(path).links()]
            waiting += [(path.parent / target).resolve() for target in targets if target and ":" not in target]
    return found


def problems(root):
    """One line of text for each thing that a document of the tree names and that is not there."""
    paths = [path.as_posix() for path in reading.files(root)]
    found = []
    for document in reading.documents(root):
        found += [*broken_links(document), *missing_files(document, paths), *open_backquotes(document)]
    return found


class ThisProject(unittest.TestCase):
    def test_has_what_its_documents_name(self):
        self.assertEqual(problems(reading.ROOT), [])

    def test_leads_from_the_top_to_all_that_is_for_people(self):
        self.assertLessEqual(set((reading.ROOT / "docs").glob("*.md")), led_to(reading.ROOT))

    def test_has_documents_to_look_at(self):
        documents = reading.documents(reading.ROOT)
        names = {document.path.relative_to(reading.ROOT).as_posix() for document in documents}
        self.assertLessEqual({"README.md", "docs/bus.md", "tests/random/README.md"}, names)
        self.assertGreater(sum(len(list(document.links())) for document in documents), 10)
        self.assertGreater(sum(len(list(document.code())) for document in documents), 500)


class Planted(unittest.TestCase):
    """A document in a tree of one source and another document."""

    def setUp(self):
        folder = tempfile.TemporaryDirectory()
        self.addCleanup(folder.cleanup)
        self.root = pathlib.Path(folder.name).resolve()
        self.write("quorl/app/Companion.h", "")
        self.write("build/made.md", "[nowhere](gone.md)")
        self.write("docs/guide.md", "# A Guide: `how`, and why\n\n## Twice\n\n## Twice\n")

    def write(self, path, text):
        (self.root / path).parent.mkdir(parents=True, exist_ok=True)
        (self.root / path).write_text(text, encoding="utf-8")

    def problems_with(self, text):
        self.write("README.md", f"# Top\n\n{text}\n")
        return problems(self.root)


class PlantedLink(Planted):
    def test_that_leads_somewhere_is_let_pass(self):
        for target in ("docs/guide.md", "docs/", "#top", "docs/guide.md#a-guide-how-and-why",
                       "docs/guide.md#twice-1", "https://example.org/gone"):
            with self.subTest(target):
                self.assertEqual(self.problems_with(f"[a link]({target})"), [])

    def test_that_leads_nowhere_is_found(self):
        for target in ("docs/gone.md", "#nowhere", "docs/guide.md#nowhere", "docs/guide.md#twice-2"):
            with self.subTest(target):
                self.assertEqual(len(self.problems_with(f"[a link]({target})")), 1)

    def test_of_an_image_that_leads_nowhere_is_found(self):
        for image in ("![a picture](gone.png)", '<img src="gone.png" alt="a picture">'):
            with self.subTest(image):
                self.assertEqual(self.problems_with(image), ["README.md:3: gone.png leads nowhere"])

    def test_in_a_fence_or_in_backquotes_is_none(self):
        self.assertEqual(self.problems_with("`[a link](gone.md)`\n\n```\n[a link](gone.md)\n```"), [])


class PlantedPath(Planted):
    def test_to_a_file_that_is_there_is_let_pass(self):
        for path in ("quorl/app/Companion.h", "quorl/app/Companion", "quorl/app", "quorl/", "app/Companion",
                     "quorl/*/Companion.h", "Companion.h", "guide.md"):
            with self.subTest(path):
                self.assertEqual(self.problems_with(f"Look at `{path}`."), [])

    def test_to_a_file_that_is_not_there_is_found(self):
        for path in ("quorl/app/Compagnon.h", "quorl/ap", "quorly/app", "app/Compagnon", "Compagnon.h", "gide.md"):
            with self.subTest(path):
                self.assertEqual(self.problems_with(f"Look at `{path}`."), [f"README.md:3: there is no {path}"])

    def test_that_goes_on_behind_its_line_is_found(self):
        self.assertEqual(self.problems_with("Look at `quorl\n--text`."),
                         ["README.md:3: a backquote is open", "README.md:4: a backquote is open"])

    def test_elsewhere_or_to_anything_is_let_pass(self):
        for path in ("Music/Song.mp3", "quorl/X.h", "X.cpp", "/usr/share/quorl", "~/Music", "quorl --text", "a / b"):
            with self.subTest(path):
                self.assertEqual(self.problems_with(f"Look at `{path}`."), [])


if __name__ == "__main__":
    unittest.main()
