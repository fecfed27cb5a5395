"""The tables of the documents have what the sources have, and the other way round."""

import json
import re
import unittest
import xml.etree.ElementTree as ElementTree

import reading

ROOT = reading.ROOT
DOCS = ROOT / "docs"

# Codes that the bus never has, and why.
NOT_ON_THE_BUS = {
    "title-synced": "stands above a notification",
    "title-not-synced": "stands above a notification",
    "same-as-another": "is about a playlist that nobody can choose",
    "directory-unreadable": "is about a directory, not about a playlist",
}


def text_of(path):
    return path.read_text(encoding="utf-8")


def rows(document):
    """The cells of each row of a table, with the heading that it stands under."""
    heading = ""
    for line in document.prose:
        if line.text.startswith("#"):
            heading = line.text
        elif line.text.startswith("|"):
            yield heading, [cell.strip() for cell in line.text.strip("|").split("|")]


def plain(cell):
    return cell.replace("`", "")


def members_in_document():
    """Each member of a bus interface as "Name type" or "Name(types)", with its interface."""
    for heading, (name, *others) in rows(reading.Document(DOCS / "bus.md")):
        interface = re.search(r"`(org\.quorl\.[\w.]+)`", heading)
        if interface and re.fullmatch(r"`\w+\(\S*\)`", name):
            yield interface.group(1), plain(name)
        elif interface and len(others) == 2 and others[0].startswith("`"):
            yield interface.group(1), f"{plain(name)} {plain(others[0])}"


def member(element):
    name = element.get("name")
    if element.tag == "property":
        return f"{name} {element.get('type')}" + (", writable" if "write" in element.get("access") else "")
    return f"{name}({''.join(argument.get('type') for argument in element.findall('arg'))})"


def members_in_descriptions():
    for path in sorted((ROOT / "resources/dbus").glob("*.xml")):
        for interface in ElementTree.parse(path).findall("interface"):
            for element in interface:
                yield interface.get("name"), member(element)


def codes_in_sources():
    """What the sources that have codes declare as one."""
    constant, reason = r'auto \w+ = "([a-z-]+)"', r'Reason::\w+,\s*"([a-z-]+)"'
    places = {"services/engine/Codes.h": constant, "services/wearable/Unseen.h": constant,
              "services/media/playlists/LeftOut.cpp": reason}
    return {place: set(re.findall(pattern, text_of(ROOT / place))) for place, pattern in places.items()}


def codes_in_document():
    for heading, cells in rows(reading.Document(DOCS / "bus.md")):
        if heading == "## Codes":
            yield from re.findall(r"`([a-z-]+)`", cells[0])


def keys_in_document():
    for _, cells in rows(reading.Document(DOCS / "settings.md")):
        if len(cells) == 4 and cells[0].startswith("`"):
            yield tuple(plain(cell) for cell in cells[:3])


def keys_in_schemas():
    for path in sorted((ROOT / "resources/preferences").glob("*.xml")):
        for key in ElementTree.parse(path).iter("key"):
            yield key.get("name"), key.get("type"), key.find("default").text


def names_in(value):
    """The names of all fields of a JSON value but for those that are paths."""
    if isinstance(value, list):
        return {name for each in value for name in names_in(each)}
    if isinstance(value, dict):
        own = {name for name in value if "." not in name}
        return own.union(*(names_in(each) for each in value.values()))
    return set()


def example_in(page):
    text = re.search(r"^\.EX\n(.*?)^\.EE$", text_of(page), re.DOTALL | re.MULTILINE).group(1)
    return json.loads(text[text.index("{"):])


def fields_in(page):
    """What the entries of the section on the format are called."""
    section = re.search(r"^\.SH FORMAT\n(.*?)^\.SH ", text_of(page), re.DOTALL | re.MULTILINE).group(1)
    terms = re.findall(r"^\.TP\n\.BR? (.*)$", section, re.MULTILINE)
    return {name for term in terms for name in re.findall(r"\w+", term)}


class TheBus(unittest.TestCase):
    def test_has_the_members_that_are_described(self):
        described = sorted(members_in_descriptions())
        self.assertEqual(sorted(members_in_document()), described)
        self.assertGreater(len(described), 45)

    def test_has_the_codes_of_the_sources(self):
        codes = set().union(*codes_in_sources().values())
        documented = set(codes_in_document())
        self.assertLessEqual(NOT_ON_THE_BUS.keys(), codes)
        self.assertEqual(documented | {"other"}, codes - NOT_ON_THE_BUS.keys())

    def test_has_codes_from_each_source(self):
        for place, codes in codes_in_sources().items():
            with self.subTest(place):
                self.assertGreater(len(codes), 5)


class TheSettings(unittest.TestCase):
    def test_have_the_keys_of_the_schemas(self):
        keys = sorted(keys_in_schemas())
        self.assertEqual(sorted(keys_in_document()), keys)
        self.assertGreater(len(keys), 8)


class TheFormats(unittest.TestCase):
    def test_have_the_fields_that_their_examples_have(self):
        for page in sorted((DOCS / "man").glob("*.5")):
            with self.subTest(page.name):
                self.assertEqual(fields_in(page), names_in(example_in(page)))


class TheTranslations(unittest.TestCase):
    def test_have_what_is_quoted_of_them(self):
        catalogues = "\n".join(text_of(path) for path in sorted((ROOT / "resources/locale").glob("*.po")))
        quoted = [fence for fence in reading.Document(DOCS / "translating.md").fences if fence.kind == "po"]
        self.assertTrue(quoted)
        for fence in quoted:
            with self.subTest(fence.lines[0].number):
                excerpt = "\n".join(line.text for line in fence.lines)
                self.assertTrue(excerpt in catalogues, excerpt)


if __name__ == "__main__":
    unittest.main()
