#!/usr/bin/env python3
"""Checks what the folders promise: layers that know only those below them, tests, benchmarks and harnesses that lie
where what they test lies, and files that can be read.

Prints each offence and ends with 1 when there is one.
"""
import pathlib
import re
import subprocess
import sys

ROOT = pathlib.Path(__file__).resolve().parents[2]

# Files by the beginning of their path, and the layers of the library and of the programs from the bottom up.
# The first that fits counts; files of one layer may include each other.
LAYERS = [
    ("oru/core/", "core", 0),
    ("oru/version.", "core", 0),
    ("oru/oru_ogl/extensionator/", "function layer", 2),
    ("oru/oru_ogl/libraryogl.", "start-up", 3),
    ("oru/oru_ogl/ogl/", "contexts and objects", 3),
    ("oru/oru_ogl/", "base of the OpenGL layer", 1),
    ("oru/oru_ocl/", "compute layer", 4),
    ("apps/common/", "what programs share", 5),
    ("apps/", "programs", 6),
    ("examples/", "programs", 6),
]
CODE = {".h", ".cpp", ".c", ".py", ".cmake", ".sh"}
LONGEST = 800

# Folders of tests/, bench/ and fuzz/ that mirror none: helpers, and what is tested as a whole.
WITHOUT_MIRROR = {"support", "soak", "sweep", "package", "tools", "catalogue"}


def layer(path):
    return next(((name, rank) for start, name, rank in LAYERS if path.startswith(start)), None)


def upward_includes(path, text):
    source = layer(path)
    for number, line in enumerate(text.splitlines(), 1):
        match = re.match(r'\s*#\s*include "([^"]+)"', line)
        if not match or not source:
            continue
        target = layer(match[1])
        if not target:
            yield f"{path}:{number}: includes {match[1]}, which is not a path from the root to a layer below"
        elif target[1] > source[1]:
            yield f"{path}:{number}: {source[0]} includes {match[1]} of the layer above, {target[0]}"


def strays(path):
    top, *folders = path.parts
    folders = folders[:-1]
    if top not in ("tests", "bench", "fuzz") or not folders or folders[0] in WITHOUT_MIRROR or "data" in folders:
        return
    mirrored = pathlib.Path(*folders)
    if not any((ROOT / base / mirrored).is_dir() for base in ("oru", ".")):
        yield f"{path}: there is no folder {mirrored} or oru/{mirrored} that it could be about"


def main():
    listing = subprocess.run(["git", "ls-files", "-co", "--exclude-standard"], cwd=ROOT, check=True,
                             capture_output=True, text=True).stdout
    offences = []
    for name in listing.splitlines():
        path = pathlib.Path(name)
        if not (ROOT / path).is_file():
            continue
        offences += strays(path)
        if path.suffix not in CODE:
            continue
        text = (ROOT / path).read_text(encoding="utf-8")
        offences += upward_includes(name, text)
        if (count := len(text.splitlines())) > LONGEST:
            offences.append(f"{path}: {count} lines, more than {LONGEST}")
    print("\n".join(offences), end="\n" if offences else "")
    return 1 if offences else 0


if __name__ == "__main__":
    sys.exit(main())
