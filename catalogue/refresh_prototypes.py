#!/usr/bin/env python3
"""Rewrites the result and parameter columns of gl_entry_points.tsv from the Khronos registry.

    refresh_prototypes.py /usr/share/khronos-api/gl.xml     (Debian package khronos-api)

Names, order and groups are the table's own and stay as they are. A name that the registry does not
know keeps its row: the three entry points of GL_APPLE_flush_render are declared nowhere.
"""
import pathlib
import re
import sys
import xml.etree.ElementTree

TABLE = pathlib.Path(__file__).resolve().parent / "gl_entry_points.tsv"


def text_before_name(element):
    full = re.sub(r"\s+", " ", "".join(element.itertext())).strip()
    name = element.find("name").text
    return full[:full.rindex(name)].strip(), name


def main(registry):
    commands = {}
    for command in xml.etree.ElementTree.parse(registry).getroot().find("commands"):
        result, name = text_before_name(command.find("proto"))
        parameters = [text_before_name(p) for p in command.findall("param")]
        commands[name] = result, ", ".join(
            (kind if kind.endswith("*") else kind + " ") + name for kind, name in parameters)
    lines = []
    for line in TABLE.read_text(encoding="utf-8").splitlines():
        cells = line.split("\t")
        if not line.startswith("#") and cells[0] in commands:
            line = "\t".join(cells[:2] + list(commands[cells[0]]))
        lines.append(line)
    TABLE.write_text("\n".join(lines) + "\n", encoding="utf-8")


if __name__ == "__main__":
    if len(sys.argv) != 2:
        sys.exit("usage: refresh_prototypes.py GL_XML")
    main(sys.argv[1])
