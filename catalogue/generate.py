#!/usr/bin/env python3
"""Makes the table-driven C++ of the library from the rows in this folder.

    generate.py --output DIR   writes the files below DIR, touching only those whose text changed, and
                               removes what an earlier run wrote and this one does not
    generate.py --list         prints their paths relative to DIR, one a line, and writes nothing
"""
import argparse
import importlib
import pathlib
import sys

BANNER = "// Generated from "
CATALOGUE = pathlib.Path(__file__).resolve().parent
sys.path.insert(0, str(CATALOGUE))


class Writer:
    """Collects the generated files; writes one only when its text differs from what is there."""

    def __init__(self):
        self.files = {}

    def write(self, path, text, source):
        """Adds the file `path`; `source` names the table and the emitter for its first line."""
        if path in self.files:
            raise ValueError(f"{path} is generated twice")
        self.files[path] = f"{BANNER}{source}; change those, not this file.\n{text}"

    def flush(self, output):
        for old in output.rglob("*.*"):
            if old.relative_to(output).as_posix() not in self.files and self.is_generated(old):
                old.unlink()
        for path, text in self.files.items():
            target = output / path
            if target.exists() and target.read_text(encoding="utf-8") == text:
                continue
            target.parent.mkdir(parents=True, exist_ok=True)
            target.write_text(text, encoding="utf-8")

    @staticmethod
    def is_generated(path):
        return path.is_file() and path.read_bytes().startswith(BANNER.encode())


def emitters():
    """The emit_*.py modules of this folder, in name order."""
    for path in sorted(CATALOGUE.glob("emit_*.py")):
        yield importlib.import_module(path.stem)


def main():
    parser = argparse.ArgumentParser(description=__doc__.split("\n")[0])
    action = parser.add_mutually_exclusive_group(required=True)
    action.add_argument("--output", type=pathlib.Path, metavar="DIR")
    action.add_argument("--list", action="store_true")
    arguments = parser.parse_args()

    writer = Writer()
    try:
        for emitter in emitters():
            emitter.emit(CATALOGUE, writer)
    except (ValueError, OSError) as error:
        sys.exit(f"generate.py: {error}")
    if arguments.list:
        print("\n".join(sorted(writer.files)))
    else:
        writer.flush(arguments.output)


if __name__ == "__main__":
    main()
