"""Keeps the texts of the Music pane and of the app, and their translations, together."""

import json
import pathlib
import re
import shutil
import subprocess
import tempfile
import unittest

import polib

ROOT = pathlib.Path(__file__).resolve().parents[2]

PREFIX = "SYNC_SETTINGS_"
LITERAL = r'"(?:[^"\\\n]|\\.)*"'
KEY_IN_CODE = re.compile(rf'"{PREFIX}\w*"')
TEXT_IN_CODE = re.compile(rf'\{{\s*("{PREFIX}\w*")\s*,\s*({LITERAL}(?:\s*{LITERAL})*)\s*\}}')
BLANK = re.compile(r"\{[^{}]*\}|%\d")

# What marks a text of the app, or of the engine, in its sources.
KEYWORDS = ("translated:1", "toTranslate:1", "translatedCount:1,2", "tr:1", "translate:2")


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


def entries(path):
    """The entries of a catalogue, without those that are empty or marked as doubtful."""
    checked = run("msgfmt", "--check", "-o", "/dev/null", str(path))
    if checked.returncode:
        raise UnreadableText(checked.stderr)
    return [entry for entry in polib.pofile(str(path)) if entry.translated()]


def is_of_pane(entry):
    return entry.msgid.startswith(PREFIX)


def languages(root):
    return {path.stem for path in (root / "resources" / "locale").glob("*.po")}


def texts_in_catalogue(path):
    """The texts of the pane in a catalogue by key."""
    return {entry.msgid: entry.msgstr for entry in entries(path) if is_of_pane(entry)}


def app_texts_in_code(root):
    """What is marked to be translated in the sources of the app and of the services."""
    sources = [str(path) for folder in ("quorl", "quorl-syncd", "services") for path in sorted((root / folder).rglob("*.cpp"))]
    keywords = [f"--keyword={keyword}" for keyword in KEYWORDS]
    read = run("xgettext", "--from-code=UTF-8", "--language=C++", "--keyword", *keywords, "-o", "-", *sources)
    if read.returncode:
        raise UnreadableText(read.stderr)
    return {entry.msgid: entry for entry in polib.pofile(read.stdout)}


def blanks(text):
    return sorted(BLANK.findall(text))


def forms(entry):
    return list(entry.msgstr_plural.values()) or [entry.msgstr]


def takes_other_blanks(english, translation):
    """Whether a translation fills in other things. A form for a certain count need not name it."""
    wanted = blanks(english.msgid_plural or english.msgid)
    unnamed = [blank for blank in wanted if blank != "{count}"]
    allowed = [wanted, unnamed] if english.msgid_plural else [wanted]
    return any(blanks(form) not in allowed for form in forms(translation))


def app_problems(root, path, english):
    """As `problems`, of the texts of the app in one catalogue. English ones stand in the sources."""
    translations = {entry.msgid: entry for entry in entries(path) if not is_of_pane(entry)}
    missing = [] if path.name == "en.po" else sorted(english.keys() - translations.keys())
    found = [f"{path.name}: misses {text}" for text in missing]
    found += [f"{path.name}: {text} is in no source" for text in sorted(translations.keys() - english.keys())]
    for text in sorted(english.keys() & translations.keys()):
        if takes_other_blanks(english[text], translations[text]):
            found.append(f"{path.name}: {text} takes other arguments than in English")
    return found


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
    of_app = app_texts_in_code(root)
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
        found += app_problems(root, path, of_app)
    return found


class ThisProject(unittest.TestCase):
    def test_has_the_same_texts_in_its_sources_and_in_each_language(self):
        self.assertEqual(problems(ROOT), [])

    def test_has_texts_and_languages_to_look_at(self):
        self.assertGreater(len(texts_in_code(ROOT)), 30)
        self.assertGreater(len(app_texts_in_code(ROOT)), 140)
        self.assertLessEqual({"ar", "de", "en", "es", "fr", "it", "ja", "nl", "pl", "pt_BR", "ru", "sv", "zh_CN"},
                             languages(ROOT))

    def test_tells_desktops_in_each_language_what_it_is(self):
        entry = (ROOT / "resources/desktop/org.quorl.Velora.desktop").read_text(encoding="utf-8")
        for key in ("GenericName", "Comment", "Keywords"):
            self.assertEqual(set(re.findall(rf"^{key}\[(\w+)\]=.", entry, re.MULTILINE)), languages(ROOT) - {"en"})
        for component, elements in (("Velora", ("summary", "p")), ("Velora.MusicPane", ("name", "summary"))):
            text = (ROOT / f"resources/desktop/org.quorl.{component}.metainfo.xml").read_text(encoding="utf-8")
            for element in elements:
                self.assertEqual(set(re.findall(rf'<{element} xml:lang="(\w+)">.', text)), languages(ROOT) - {"en"})


class PlantedError(unittest.TestCase):
    """Each test changes one text in a copy of this project's."""

    def setUp(self):
        self.directory = tempfile.TemporaryDirectory()
        self.addCleanup(self.directory.cleanup)
        self.root = pathlib.Path(self.directory.name)
        shutil.copytree(ROOT / "settings", self.root / "settings")
        for folder in ("quorl", "quorl-syncd", "services", "resources/locale"):
            shutil.copytree(ROOT / folder, self.root / folder)

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

    def change_app_text(self, old, new):
        self.change("resources/locale/de.po", old, new)

    def test_text_of_the_app_that_is_not_translated_is_found(self):
        self.change_app_text('msgstr "Unbekannt"', 'msgstr ""')
        self.assert_only_problem("de.po: misses Unknown")

    def test_text_of_the_app_that_is_gone_is_found(self):
        self.change("quorl/pages/SyncPage.cpp", "Sync Now", "Sync At Once")
        self.assertIn("fr.po: misses Sync At Once", problems(self.root))
        self.assertIn("fr.po: Sync Now is in no source", problems(self.root))

    def test_other_blanks_in_a_text_of_the_app_are_found(self):
        text = "{available} of {capacity} free"
        for wrong in ("{available} frei", "{available} von {kapazität} frei", "{available} {available} {capacity}"):
            with self.subTest(text=wrong):
                self.setUp()
                self.change_app_text("{available} von {capacity} frei", wrong)
                self.assert_only_problem(f"de.po: {text} takes other arguments than in English")

    def test_count_may_be_left_out_of_a_form_but_nothing_else(self):
        self.change_app_text("{count} weiterer Titel konnte", "Ein weiterer Titel konnte")
        self.assertEqual(problems(self.root), [])
        self.change_app_text("Ein weiterer Titel konnte", "{songs} weiterer Titel konnte")
        self.assert_only_problem("de.po:  {count} more song could not be sent. takes other arguments than in English")

    def test_the_same_arguments_in_another_order_are_let_pass(self):
        for right in ("%tu %@ %@", "%3$@ %2$@ %1$tu", "100%% %1$tu %2$@ %3$@"):
            with self.subTest(text=right):
                self.change_text("de", "FOOTER_SYNCED_MB_N_SONGS", right)
                self.assertEqual(problems(self.root), [])


if __name__ == "__main__":
    unittest.main()
