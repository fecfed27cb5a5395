"""How a build folder compiles and links, and copies of what it made in which one source is another."""

import collections.abc
import contextlib
import json
import os
import pathlib
import re
import shlex
import shutil
import subprocess
import threading

QUICKLY = ["-O0", "-w", "-UNDEBUG", "-D_GLIBCXX_ASSERTIONS"]
"""How an edited source is compiled, whatever the build's way is."""

PREAMBLES_KEPT = 4


class BuildError(Exception):
    """Why something cannot be built or is not there, for people."""


def succeeds(command: list[str] | str, folder: pathlib.Path) -> bool:
    done = subprocess.run(command, cwd=folder, shell=isinstance(command, str), capture_output=True, check=False)
    return done.returncode == 0


class Build:
    """A folder that ninja has built, which is read and never written to."""

    def __init__(self, root: pathlib.Path, folder: pathlib.Path) -> None:
        self.root = root
        self.folder = folder
        try:
            entries = json.loads((folder / "compile_commands.json").read_text())
            commands = subprocess.run(["ninja", "-C", folder, "-t", "commands"],
                                      capture_output=True, text=True, check=True).stdout.splitlines()
        except (OSError, subprocess.CalledProcessError) as error:
            raise BuildError(f"{folder} is not built: {error}") from error
        self._compilations = {entry["file"]: shlex.split(entry["command"]) for entry in entries}
        self._links = {match[1]: line for line in commands
                       if (match := re.search(r" -o (\S+)", line)) and " -c " not in line}
        self._archives = {match[1]: set(match[2].split()) for line in commands
                          if (match := re.search(r"/ar qc (\S+) +(.*?) &&", line))}

    def object_of(self, source: str) -> str:
        """Where the build puts what it compiles of a source."""
        command = self._compilation(source)
        return command[command.index("-o") + 1]

    def compilation(self, source: str, path: pathlib.Path, output: pathlib.Path) -> list[str]:
        """The command that compiles `path` as the build compiles `source`, but quickly."""
        command = self._compilation(source)
        command[command.index("-o") + 1] = str(output)
        command[command.index("-c") + 1] = str(path)
        return [*command, *QUICKLY]

    def arguments_for_clang(self, source: str) -> list[str]:
        """The flags of a source, without what is told to g++ only."""
        command = self._compilation(source)
        for option in ("-o", "-c"):
            place = command.index(option)
            del command[place: place + 2]
        return [word for word in command[1:] if not word.startswith("-D__has_") and word != "-Werror"]

    def libraries_with(self, compiled: str) -> list[str]:
        """The shared libraries that are linked of an object."""
        return [output for output in self._links if ".so" in output and self.link(output, compiled, "", "")]

    def link(self, output: str, compiled: str, replacement: str, linked: str) -> str | None:
        """The command that links `output` with `replacement` in place of an object, to the file `linked`;
        None where the object is no part of it."""
        line = self._links.get(output)
        if line is None:
            raise BuildError(f"{self.folder} has no {output}.")
        command = next(part for part in line.split(" && ") if f" -o {output}" in part)
        command = command.replace(f" -o {output}", f" -o {shlex.quote(linked)}")
        replacement = shlex.quote(replacement)
        if f" {compiled} " in command:
            return command.replace(f" {compiled} ", f" {replacement} ")
        for archive, objects in self._archives.items():
            if compiled in objects and f" {archive}" in command:
                # What is defined already is not looked for in the archive.
                return command.replace(f" {archive}", f" {replacement} {archive}", 1)
        return None

    def registration(self, output: str, bundle: str) -> str | None:
        """The command that registers a plug-in that was linked anew in a copy of its bundle, where it is one."""
        parts = self._links[output].split(" && ")
        command = next((part for part in parts if "-D BUNDLE=" in part), None)
        return command and re.sub(r"-D BUNDLE=\S+", f"-D BUNDLE={bundle}", command)

    def _compilation(self, source: str) -> list[str]:
        try:
            return list(self._compilations[str(self.root / source)])
        except KeyError as error:
            raise BuildError(f"{self.folder} does not compile {source}.") from error


class Preambles:
    """The headers of sources, compiled once for all edits of each."""

    def __init__(self, build: Build, folder: pathlib.Path) -> None:
        self._build = build
        self._folder = folder
        self._lock = threading.Lock()
        self._made: dict[str, pathlib.Path] = {}

    def options(self, source: str) -> list[str]:
        """What makes the compiler use those of a source."""
        with self._lock:
            if source not in self._made:
                self._made[source] = self._make(source)
                self._forget_old()
            return ["-include", str(self._made[source])]

    def _make(self, source: str) -> pathlib.Path:
        header = self._folder / f"{source}.preamble.h"
        header.parent.mkdir(parents=True, exist_ok=True)
        content = (self._build.root / source).read_text()
        header.write_text("".join(re.findall(r"^#include .*\n", content, re.MULTILINE)))
        command = self._build.compilation(source, header, compiled_header(header))
        if not succeeds([command[0], "-x", "c++-header", *command[1:]], self._build.folder):
            raise BuildError(f"The headers of {source} cannot be compiled.")
        return header

    def _forget_old(self) -> None:
        """They are large. Who still uses one whose file is gone compiles the headers anew."""
        while len(self._made) > PREAMBLES_KEPT:
            compiled_header(self._made.pop(next(iter(self._made)))).unlink(missing_ok=True)


def compiled_header(header: pathlib.Path) -> pathlib.Path:
    """Where g++ looks for it."""
    return header.with_name(f"{header.name}.gch")


class Copy:
    """A copy of the programs and libraries of a build, in which one source after another is edited."""

    def __init__(self, build: Build, preambles: Preambles, folder: pathlib.Path) -> None:
        self.folder = folder
        self._build = build
        self._preambles = preambles
        self._object = ""
        self._changed: list[pathlib.Path] = []
        self._up_to_date: set[str] = set()
        shutil.rmtree(folder, ignore_errors=True)
        for part in ("bin", "lib"):
            if (build.folder / part).exists():
                shutil.copytree(build.folder / part, folder / part, symlinks=True,
                                copy_function=_link_or_copy)

    @contextlib.contextmanager
    def edited(self, source: str, content: bytes) -> collections.abc.Iterator[bool]:
        """Whether the source compiles with this content. If so its libraries are those of the edit, and
        programs become so by link()."""
        self._object = self._build.object_of(source)
        try:
            yield self._compile(source, content) and all(map(self._link, self._build.libraries_with(self._object)))
        finally:
            self._restore()

    def link(self, program: str) -> bool:
        """Links a program anew, if the edit is in it; false where that fails."""
        return self._link(f"bin/{program}")

    def _compile(self, source: str, content: bytes) -> bool:
        path = self.folder / "edited.cpp"
        path.write_bytes(content)
        command = self._build.compilation(source, path, self._edited_object())
        beside = ["-iquote", str((self._build.root / source).parent)]
        return succeeds([*command, *self._preambles.options(source), *beside], self._build.folder)

    def _edited_object(self) -> pathlib.Path:
        return self.folder / "edited.o"

    def _link(self, output: str) -> bool:
        path = self.folder / output
        linked = path.with_name(f"{path.name}.new")
        command = self._build.link(output, self._object, str(self._edited_object()), str(linked))
        if command is None or output in self._up_to_date:
            return True
        if not succeeds(command, self._build.folder):
            return False
        self._replace(path)
        linked.replace(path)
        self._up_to_date.add(output)
        return self._register(output, path.parent)

    def _register(self, output: str, bundle: pathlib.Path) -> bool:
        command = self._build.registration(output, str(bundle))
        if command is None:
            return True
        for file in bundle.glob("*.json"):
            self._replace(file)
        return succeeds(command, self._build.folder)

    def _replace(self, path: pathlib.Path) -> None:
        """Takes away a file, which may be the build's own by another name, for one that is made anew."""
        self._changed.append(path)
        path.unlink()

    def _restore(self) -> None:
        for path in self._changed:
            path.unlink(missing_ok=True)
            _link_or_copy(self._build.folder / path.relative_to(self.folder), path)
        self._changed.clear()
        self._up_to_date.clear()


def _link_or_copy(source: str | pathlib.Path, copy: str | pathlib.Path) -> None:
    try:
        os.link(source, copy)
    except OSError:
        shutil.copy2(source, copy)
