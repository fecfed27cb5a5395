"""Keeps the texts of the Music pane and their translations together."""

import json
import pathlib
import re
import shutil
import subprocess
import tempfile
import unittest

ROOT = pathlib.Path(__file__).resolve().parents[2]

PREFIX = "SYNC_SETTINGS_"
LITERAL = r'"(?:[^"\\\n]|\\.)*"'
KEY_IN_CODE = re.compile(rf'"{PREFIX}\w*"')
TEXT_IN_CODE = re.compile(rf'\{{\s*("{PREFIX}\w*")\s*,\s*({LITERAL}(?:\s*{LITERAL})*)\s*\}}')
ENTRY = re.compile(r'^msgid (".+")\nmsgstr (".*")$', re.MULTILINE)


class UnreadableText(Exception):
    """A text that stands in a form that this check does not read."""


def texts_in_code(root):
    """The English default of each key in the sources."""
    texts = {}
    for path in sorted((root / "settings").glob("*.cpp")):
        source = path.read_text(encoding="utf-8")
        found = TEXT_IN_CODE.findall(source)
        if len(found) != len(KEY_IN_CODE.findall(source)):
            raise UnreadableText(f"{path.name}: a key stands without its text beside it")
        for key, literals in found:
            texts[json.loads(key)] = "".join(map(json.loads, re.findall(LITERAL, literals)))
    return texts


def run(*command):
    return subprocess.run(command, capture_output=True, text=True, encoding="utf-8", check=False)


def texts_in_catalogue(path):
    """The texts of a catalogue by key, without those that are empty or marked as doubtful."""
    read = run("msgattrib", "--translated", "--no-fuzzy", "--no-obsolete", "--no-wrap", str(path))
    if read.returncode:
        raise UnreadableText(read.stderr)
    return {json.loads(key): json.loads(text) for key, text in ENTRY.findall(read.stdout)}


def differing_formats(english, translation):
    """The keys whose translation does not take the arguments that the English text takes."""
    header = '"Content-Type: text/plain; charset=UTF-8\\n"'
    lines = ['msgid ""', 'msgstr ""', header, ""]
    key_of_line = {}
    for key in english.keys() & translation.keys():
        begin = len(lines)
        lines += ["#, objc-format", f'msgctxt "{key}"']
        lines += [f"msgid {quoted(english[key])}", f"msgstr {quoted(translation[key])}", ""]
        key_of_line.update(dict.fromkeys(range(begin + 1, len(lines) + 1), key))
    with tempfile.NamedTemporaryFile("w", suffix=".po", encoding="utf-8") as catalogue:
        catalogue.write("\n".join(lines))
        catalogue.flush()
        checked = run("msgfmt", "--check-format", "-o", "/dev/null", catalogue.name)
    places = re.findall(rf"^{re.escape(catalogue.name)}:(\d+): ", checked.stderr, re.MULTILINE)
    if checked.returncode and not places:
        raise UnreadableText(checked.stderr)
    return sorted({key_of_line[int(place)] for place in places})


def quoted(text):
    return json.dumps(text, ensure_ascii=False)


def problems(root):
    """One line of text for each text that is missing, left over, or not as it should be."""
    english = texts_in_code(root)
    found = []
    for path in sorted((root / "resources" / "locale").glob("*.po")):
        texts = texts_in_catalogue(path)
        found += [f"{path.name}: misses {key}" for key in sorted(english.keys() - texts.keys())]
        found += [f"{path.name}: {key} is in no source" for key in sorted(texts.keys() - english.keys())]
        if path.name == "en.po":
            common = sorted(english.keys() & texts.keys())
            found += [f"en.po: {key} is not as in the source" for key in common if english[key] != texts[key]]
        for key in differing_formats(english, texts):
            found.append(f"{path.name}: {key} takes other arguments than in English")
    return found


class ThisProject(unittest.TestCase):
    def test_has_the_same_texts_in_its_sources_and_in_each_language(self):
        self.assertEqual(problems(ROOT), [])

    def test_has_texts_and_languages_to_look_at(self):
        self.assertGreater(len(texts_in_code(ROOT)), 30)
        languages = {path.stem for path in (ROOT / "resources" / "locale").glob("*.po")}
        self.assertLessEqual({"en", "de", "fr", "ar"}, languages)


class PlantedError(unittest.TestCase):
    """Each test changes one text in a copy of this project's."""

    def setUp(self):
        self.directory = tempfile.TemporaryDirectory()
        self.addCleanup(self.directory.cleanup)
        self.root = pathlib.Path(self.directory.name)
        shutil.copytree(ROOT / "settings", self.root / "settings")
        shutil.copytree(ROOT / "resources" / "locale", self.root / "resources" / "locale")

    def change(self, file, old, new):
        path = self.root / file
        text = path.read_text(encoding="utf-8")
        self.assertIn(old, text)
        path.write_text(text.replace(old, new, 1), encoding="utf-8")

    def change_text(self, language, key, new):
        path = self.root / "resources" / "locale" / f"{language}.po"
        text = path.read_text(encoding="utf-8")
        changed, count = re.subn(
            rf'(msgid "{PREFIX}{key}"\nmsgstr ).*', lambda match: match[1] + quoted(new), text
        )
        self.assertEqual(count, 1)
        path.write_text(changed, encoding="utf-8")

    def assert_only_problem(self, problem):
        self.assertEqual(problems(self.root), [problem])

    def test_key_without_an_english_text_is_found(self):
        key = f"{PREFIX}PLAYLIST_PICKER_NONE"
        self.change("resources/locale/en.po", f'msgid "{key}"\nmsgstr "None"\n', "")
        self.assert_only_problem(f"en.po: misses {key}")

    def test_english_text_that_differs_from_the_source_is_found(self):
        self.change("resources/locale/en.po", "Music Storage", "Music storage")
        self.assert_only_problem(f"en.po: {PREFIX}USAGE_LIMIT_SECTION_TITLE is not as in the source")

    def test_key_that_no_source_knows_is_found(self):
        self.change("resources/locale/en.po", f'msgid "{PREFIX}ROOT_TITLE"', 'msgid "LEFT_OVER"\nmsgstr "x"\n\n'
                    f'msgid "{PREFIX}ROOT_TITLE"')
        self.assert_only_problem("en.po: LEFT_OVER is in no source")

    def test_new_key_in_a_source_is_missed_in_each_language(self):
        self.change("settings/LMQuorlLimitChooser.cpp", f"{PREFIX}USAGE_LIMIT_TITLE", f"{PREFIX}NEW")
        self.assertIn(f"de.po: misses {PREFIX}NEW", problems(self.root))
        self.assertIn(f"de.po: {PREFIX}USAGE_LIMIT_TITLE is in no source", problems(self.root))

    def test_key_in_a_source_without_its_text_beside_it_is_found(self):
        self.change("settings/LMQuorlLimitChooser.cpp", '"Storage"', "storageDefault")
        with self.assertRaises(UnreadableText):
            problems(self.root)

    def test_empty_translation_is_found(self):
        self.change_text("fr", "ROOT_TITLE", "")
        self.assert_only_problem(f"fr.po: misses {PREFIX}ROOT_TITLE")

    def test_doubtful_translation_is_found(self):
        self.change("resources/locale/ar.po", f'msgid "{PREFIX}ROOT_TITLE"', f'#, fuzzy\nmsgid "{PREFIX}ROOT_TITLE"')
        self.assert_only_problem(f"ar.po: misses {PREFIX}ROOT_TITLE")

    def test_catalogue_that_cannot_be_read_is_found(self):
        self.change("resources/locale/fr.po", 'msgstr "Musique"', 'msgstr "Musique')
        with self.assertRaises(UnreadableText):
            problems(self.root)

    def test_other_arguments_are_found(self):
        key = "FOOTER_SYNCED_MB_N_SONGS"  # "%tu songs ... %@ with %@ remaining."
        for wrong in (
            "no arguments",
            "%tu %@",
            "%tu %@ %@ %@",
            "%@ %tu %@",
            "%tu %@ %d",
            "%1$tu %2$@",
            "%1$tu %2$@ %3$tu",
            "%1$tu %2$@ %4$@",
            "%1$tu %@ %@",
            "%tu %@ %@ 100 %",
        ):
            with self.subTest(text=wrong):
                self.change_text("de", key, wrong)
                self.assert_only_problem(f"de.po: {PREFIX}{key} takes other arguments than in English")

    def test_arguments_in_a_text_that_takes_none_are_found(self):
        self.change_text("de", "ROOT_TITLE", "Musik %@")
        self.assert_only_problem(f"de.po: {PREFIX}ROOT_TITLE takes other arguments than in English")

    def test_the_same_arguments_in_another_order_are_let_pass(self):
        for right in ("%tu %@ %@", "%3$@ %2$@ %1$tu", "100%% %1$tu %2$@ %3$@"):
            with self.subTest(text=right):
                self.change_text("de", "FOOTER_SYNCED_MB_N_SONGS", right)
                self.assertEqual(problems(self.root), [])


if __name__ == "__main__":
    unittest.main()
