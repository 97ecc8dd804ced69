#!/usr/bin/env python3
"""Holds the tables of docs/guide/failures.md against the texts of the checks in the library's sources.

    check_messages.py PAGE SOURCES   fails for a text without a row and for a row without a text
    check_messages.py --list SOURCES   prints the texts and where they stand

A row begins with the text in backquotes. "…" in it stands for what the message adds.
"""
import argparse
import pathlib
import re
import sys

CHECKS = {"ORU_ASSERT": "", "ORU_ENFORCE": "Enforce ", "ORU_ASSERT_SUCCEEDED": "", "ORU_ASSERT_TEXT": "",
          "ORU_ENFORCE_TEXT": "Enforce ", "ORU_ASSERT_NOTED": "", "ORU_THROW_INTERNAL": "", "ORU_TRANSLATION_FAILURE": "",
          "ORU_ENUM_FAILURE": "", "ThrowInternal": ""}
TEXT_AT = {"ORU_ASSERT_TEXT": 0, "ORU_ASSERT_NOTED": 0, "ORU_ENFORCE_TEXT": 0, "ThrowInternal": 2}  # the argument that is the text
CALL = re.compile(r"(?<!define )\b(" + "|".join(CHECKS) + r")\(")
LITERAL = re.compile(r'"((?:[^"\\]|\\.)*)"')


def arguments_of(text, begin):
    """The arguments of the call whose parenthesis opens before `begin`."""
    depth, at, found = 1, begin, []
    while depth:
        literal = LITERAL.match(text, at)
        if literal:
            at = literal.end()
            continue
        depth += {"(": 1, ")": -1}.get(text[at], 0)
        if depth == 0 or (depth == 1 and text[at] == ","):
            found.append(text[begin:at])
            begin = at + 1
        at += 1
    return found


def composed(code):
    """The text that a piece of code composes: its literals, with "…" for what stands between them."""
    between = LITERAL.sub("\0", re.sub(r"^\s*(?:ComposeText|std::string)?\(?\s*(?=\")", "", code)).split("\0")
    parts = LITERAL.findall(code)
    if not parts:
        return None  # a variable: its text stands where it is set
    gaps = ["" if not gap.strip(" \n)") else "…" for gap in between]
    text = "".join(gap + part for gap, part in zip(gaps, [*parts, ""]))
    return text.replace('\\"', '"').replace("\\n", "\n")


def texts(folder):
    """Every text of a check with its place; one that is composed ends with "…"."""
    for path in sorted([*folder.rglob("*.cpp"), *folder.rglob("*.h")]):
        if path.name == "checks.h":
            continue  # where the checks themselves are defined
        source = re.sub(r"//.*", "", path.read_text(encoding="utf-8")).replace("\\\n", " \n")
        for call in CALL.finditer(source):
            name, arguments = call[1], arguments_of(source, call.end())
            place = f"{path.as_posix()}:{source.count(chr(10), 0, call.start()) + 1}"
            if name in ("ORU_ASSERT", "ORU_ENFORCE", "ORU_ASSERT_SUCCEEDED"):
                text = " ".join(",".join(arguments).split())
            else:
                text = composed(arguments[TEXT_AT[name]] if name in TEXT_AT else ",".join(arguments))
                if text is None:
                    continue
                if name == "ORU_TRANSLATION_FAILURE":
                    text = f'!"{text}"'
            yield CHECKS[name] + text.strip(), place


def rows(page):
    """The texts of the tables, which begin at the page's first section."""
    tables = page.read_text(encoding="utf-8").partition("\n## ")[2]
    return re.findall(r"^\| `(.+?)` \|", tables, re.MULTILINE)


def covers(row, text):
    pattern = ".*".join(re.escape(part) for part in row.replace("\\|", "|").split("…"))
    return re.fullmatch(pattern, text.strip(), re.DOTALL) is not None


def main():
    parser = argparse.ArgumentParser(description=__doc__.split("\n")[0])
    parser.add_argument("--list", action="store_true")
    parser.add_argument("page", type=pathlib.Path, nargs="?")
    parser.add_argument("sources", type=pathlib.Path)
    arguments = parser.parse_args()
    found = list(texts(arguments.sources))
    if arguments.list:
        for text, place in found:
            print(f"{place}: {text!r}")
        return 0
    table = rows(arguments.page)
    missing = [(text, place) for text, place in found if not any(covers(row, text) for row in table)]
    stale = [row for row in table if not any(covers(row, text) for text, _ in found)]
    for text, place in missing:
        print(f"{place}: no row for {text!r}", file=sys.stderr)
    for row in stale:
        print(f"{arguments.page}: no source says {row!r}", file=sys.stderr)
    return 1 if missing or stale else 0


if __name__ == "__main__":
    sys.exit(main())
