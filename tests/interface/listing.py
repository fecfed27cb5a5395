#!/usr/bin/python3
"""Lists what of the headers in platform/ a plug-in that was built against them relies on, a line for each thing.

    tests/interface/listing.py           the interface of this tree
    tests/interface/listing.py FOLDER    that of the headers in FOLDER/platform

A line begins with what it is about: "class", "function", "constant" or "enumerator", and its name. Sizes are bytes,
offsets bits, and both those of this machine.
"""

import pathlib
import subprocess
import sys
import tempfile

import clang.cindex as cindex
from clang.cindex import AccessSpecifier, CursorKind

ROOT = pathlib.Path(__file__).resolve().parents[2]
CLASSES = (CursorKind.CLASS_DECL, CursorKind.STRUCT_DECL, CursorKind.CLASS_TEMPLATE)
FUNCTIONS = (CursorKind.FUNCTION_DECL, CursorKind.CXX_METHOD, CursorKind.CONSTRUCTOR, CursorKind.DESTRUCTOR)


class Unreadable(Exception):
    """Headers that the compiler does not understand."""


def libdispatch():
    """The folder of the headers of libdispatch that this project keeps, if it is not the system's."""
    return pathlib.Path(subprocess.run([ROOT / "tools/libdispatch", "--prefix"], capture_output=True, text=True,
                                       check=True).stdout.strip(), "include")


def parsed(folder):
    """All headers of folder/platform, read as one."""
    headers = sorted(path.name for path in (folder / "platform").glob("*.h"))
    text = "".join(f'#include "platform/{name}"\n' for name in headers)
    arguments = ["-std=c++20", f"-I{folder}", "-isystem", str(libdispatch())]
    place = str(folder / "all.cpp")
    unit = cindex.Index.create().parse(place, args=arguments, unsaved_files=[(place, text)])
    errors = [str(said) for said in unit.diagnostics if said.severity >= cindex.Diagnostic.Error]
    if errors:
        raise Unreadable("\n".join(errors))
    return unit


def full_name(cursor):
    names = [cursor.spelling]
    while cursor.semantic_parent.kind != CursorKind.TRANSLATION_UNIT:
        cursor = cursor.semantic_parent
        names.insert(0, cursor.spelling)
    return "::".join(names)


def written(type_):
    return type_.get_canonical().spelling


def is_override(cursor):
    return any(child.kind == CursorKind.CXX_OVERRIDE_ATTR for child in cursor.get_children())


def layout_of(cursor):
    """The lines about a class itself: what is where in an object, and in which order its table has what is virtual."""
    name = f"class {full_name(cursor)}:"
    if cursor.kind != CursorKind.CLASS_TEMPLATE:
        yield f"{name} size {cursor.type.get_size()}, align {cursor.type.get_align()}"
    count = {"base": 0, "field": 0, "virtual": 0}

    def line(kind, text):
        count[kind] += 1
        return f"{name} {kind} {count[kind]} {text}"

    for child in cursor.get_children():
        if child.kind == CursorKind.CXX_BASE_SPECIFIER:
            yield line("base", written(child.type))
        elif child.kind == CursorKind.FIELD_DECL:
            yield line("field", f"{child.spelling}: {written(child.type)} at {child.get_field_offsetof()}")
        elif child.kind in FUNCTIONS and child.is_virtual_method() and not is_override(child):
            yield line("virtual", f"{child.spelling}: {written(child.type)}")


def is_of_plugins(cursor):
    """Whether a plug-in that was built contains a reference to the function, and not the function itself."""
    return (cursor.access_specifier != AccessSpecifier.PRIVATE and not cursor.is_definition()
            and not cursor.is_pure_virtual_method() and not cursor.is_default_method()
            and cursor.availability == cindex.AvailabilityKind.AVAILABLE)


def lines_of(cursor):
    if cursor.kind in CLASSES and cursor.is_definition():
        yield from layout_of(cursor)
        for child in cursor.get_children():
            yield from lines_of(child)
    elif cursor.kind == CursorKind.ENUM_DECL:
        for child in cursor.get_children():
            yield f"enumerator {full_name(child)}: {child.enum_value} as {written(cursor.enum_type)}"
    elif cursor.kind in FUNCTIONS and is_of_plugins(cursor):
        yield f"function {full_name(cursor)}: {written(cursor.type)}"
    elif cursor.kind == CursorKind.VAR_DECL and not cursor.is_definition():
        yield f"constant {full_name(cursor)}: {written(cursor.type)}"


def listing(folder):
    """The lines of the headers in folder/platform."""
    own = folder / "platform"
    lines = {}  # each once, in order
    for cursor in parsed(folder).cursor.get_children():
        if cursor.location.file and own == pathlib.Path(cursor.location.file.name).parent:
            lines |= dict.fromkeys(lines_of(cursor))
    return list(lines)


def main():
    print("\n".join(listing(pathlib.Path(*sys.argv[1:]).resolve() if sys.argv[1:] else ROOT)))


if __name__ == "__main__":
    main()
