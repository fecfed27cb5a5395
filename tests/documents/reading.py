"""Reads the documents of this tree: their text, their links, and what stands in fences."""

import dataclasses
import pathlib
import re

ROOT = pathlib.Path(__file__).resolve().parents[2]

FENCE = re.compile(r"```(\w*)\s*$")
HEADING = re.compile(r"#{1,6}\s+(.*?)\s*#*$")
CODE = re.compile(r"`([^`]+)`")
LINK = re.compile(r"\]\(<?([^()\s>]+)>?(?:\s+\"[^\"]*\")?\)")
IMAGE = re.compile(r"<(?:img|a)\b[^>]*?(?:src|href)=\"([^\"]+)\"")


@dataclasses.dataclass(frozen=True)
class Line:
    number: int
    text: str


@dataclasses.dataclass(frozen=True)
class Fence:
    """What stands between two lines of backquotes."""

    kind: str
    lines: tuple  # of Line
    is_next: bool  # nothing but blank lines stands between it and the fence before


class Document:
    def __init__(self, path):
        self.path = path
        self.prose = []  # the lines outside of all fences
        self.fences = []
        self._read(path.read_text(encoding="utf-8").splitlines())

    def _read(self, texts):
        inside, kind, is_next = None, "", False
        for number, text in enumerate(texts, 1):
            fence = FENCE.match(text)
            if inside is None and fence:
                inside, kind = [], fence.group(1)
            elif inside is None:
                self.prose.append(Line(number, text))
                is_next = is_next and not text.strip()
            elif fence:
                self.fences.append(Fence(kind, tuple(inside), is_next))
                inside, is_next = None, True
            else:
                inside.append(Line(number, text))

    def indented(self):
        """The first line of each block that is code for its indentation alone."""
        before = ""
        for line in self.prose:
            if line.text.startswith("    ") and not before.strip():
                yield line
            before = line.text

    def code(self):
        """Each line with what stands in backquotes on it."""
        for line in self.prose:
            for text in CODE.findall(line.text):
                yield line, text

    def links(self):
        for line in self.prose:
            plain = CODE.sub("", line.text)
            for target in LINK.findall(plain) + IMAGE.findall(plain):
                yield line, target

    def anchors(self):
        """What a link to a heading of this document may have behind its #."""
        counts = {}
        for line in self.prose:
            heading = HEADING.match(line.text)
            if heading:
                anchor = anchor_of(heading.group(1))
                counts[anchor] = counts.get(anchor, -1) + 1
                yield f"{anchor}-{counts[anchor]}" if counts[anchor] else anchor


def anchor_of(heading):
    words = re.sub(r"\[([^]]*)\]\([^)]*\)", r"\1", heading).lower()
    return re.sub(r"[^\w\- ]", "", words).replace(" ", "-")


def is_ours(path):
    """Neither built nor hidden."""
    return path.parts[0] != "build" and not any(part.startswith(".") or part == "__pycache__" for part in path.parts)


def files(root):
    """All files of a tree, as paths in it."""
    found = []
    for top in sorted(root.iterdir()):
        inside = top.rglob("*") if top.is_dir() and is_ours(top.relative_to(root)) else [top]
        found += [path.relative_to(root) for path in inside if path.is_file()]
    return sorted(path for path in found if is_ours(path))


def documents(root):
    return [Document(root / path) for path in files(root) if path.suffix == ".md"]
