#!/usr/bin/env python3
"""Checks that the code of the guide is the code that the tests compile and run.

A comment <!-- snippet: FILE#NAME --> in a chapter stands before a block of code. FILE lies beside this
script and holds the same text between two lines "// [NAME]". A block of C++ without such a comment is an
error, so is a snippet that no chapter shows.
"""
import argparse
import pathlib
import re
import sys
import textwrap

FOLDER = pathlib.Path(__file__).resolve().parent
BLOCK = re.compile(r"(?:<!-- snippet: (\S+?)#(\S+?) -->\n)?```cpp\n(.*?)^```$", re.DOTALL | re.MULTILINE)


def snippets(file):
    """The snippets of a source file by name, without the indentation they share."""
    found, name, lines = {}, None, []
    for line in file.read_text(encoding="utf-8").splitlines(keepends=True):
        mark = re.fullmatch(r"\s*// \[(\S+)\]\s*", line)
        if not mark:
            lines.append(line)
        elif name is None:
            name, lines = mark[1], []
        elif name == mark[1]:
            found[name] = textwrap.dedent("".join(lines)).strip("\n") + "\n"
            name = None
        else:
            sys.exit(f"{file.name}: [{mark[1]}] begins inside [{name}]")
    if name:
        sys.exit(f"{file.name}: [{name}] does not end")
    return found


def main():
    parser = argparse.ArgumentParser(description=__doc__, formatter_class=argparse.RawDescriptionHelpFormatter)
    parser.add_argument("--update", action="store_true", help="write the blocks of the chapters anew")
    parser.add_argument("chapters", nargs="+", type=pathlib.Path, metavar="CHAPTER.md")
    arguments = parser.parse_args()
    sources, shown, problems = {}, set(), []
    for chapter in arguments.chapters:
        text = chapter.read_text(encoding="utf-8")

        def checked(block):
            file, name, code = block.groups()
            if not file:
                problems.append(f"{chapter.name}: code without a snippet: {code.splitlines()[:1]}")
                return block[0]
            if file not in sources:
                sources[file] = snippets(FOLDER / file)
            if name not in sources[file]:
                problems.append(f"{chapter.name}: {file} has no [{name}]")
                return block[0]
            shown.add((file, name))
            if code != sources[file][name] and not arguments.update:
                problems.append(f"{chapter.name}: {name} differs from {file}; --update mends that")
            return f"<!-- snippet: {file}#{name} -->\n```cpp\n{sources[file][name]}```"

        new = BLOCK.sub(checked, text)
        if arguments.update and new != text:
            chapter.write_text(new, encoding="utf-8")
    for file, found in sources.items():
        problems += [f"{file}: no chapter shows [{n}]" for n in found if (file, n) not in shown]
    if not shown:
        problems.append("no snippet at all")
    sys.exit("\n".join(problems) or None)


main()
