#!/usr/bin/env python3
"""Rewrites gl_tokens.tsv, the OpenGL constants and where they come from, from the Khronos registry.

    refresh_tokens.py /usr/share/khronos-api/gl.xml     (Debian package khronos-api)

The rows are the constants of OpenGL 1.0 to 4.1 (core and compatibility) and of the extensions in
gl_extensions.tsv. A constant's origin is the first OpenGL version that has it, or else all extensions
that do. Values are those of a GLenum: a 64-bit constant has none and is left out.
"""
import pathlib
import sys
import xml.etree.ElementTree

import tables

CATALOGUE = pathlib.Path(__file__).resolve().parent
TABLE = CATALOGUE / "gl_tokens.tsv"
LAST_VERSION = (4, 1)


def required(element):
    """The names of the constants that a version or extension of OpenGL (not of OpenGL ES) requires."""
    for block in element.findall("require"):
        if block.get("api") in (None, "gl", "glcore"):
            yield from (constant.get("name") for constant in block.findall("enum"))


def main(registry):
    root = xml.etree.ElementTree.parse(registry).getroot()
    values = {}
    for constant in root.findall("enums/enum"):
        if constant.get("api") in (None, "gl"):
            values[constant.get("name")] = int(constant.get("value"), 0)

    origins = {}
    for feature in root.findall("feature"):
        version = tuple(map(int, feature.get("number").split(".")))
        if feature.get("api") == "gl" and version <= LAST_VERSION:
            for name in required(feature):
                origins.setdefault(name, feature.get("number"))
    core = set(origins)
    wanted = {string for _, string in tables.rows(CATALOGUE / "gl_extensions.tsv", 2)}
    for extension in root.findall("extensions/extension"):
        if extension.get("name") in wanted:
            for name in sorted(set(required(extension)) - core):
                origins[name] = ",".join(filter(None, [origins.get(name), extension.get("name")]))

    rows = sorted((values[name], name, origin) for name, origin in origins.items()
                  if values[name] < 1 << 32)
    notes = [line for line in TABLE.read_text(encoding="utf-8").splitlines() if line.startswith("#")]
    lines = notes + [f"0x{value:04X}\t{name}\t{origin}" for value, name, origin in rows]
    TABLE.write_text("\n".join(lines) + "\n", encoding="utf-8")


if __name__ == "__main__":
    if len(sys.argv) != 2:
        sys.exit("usage: refresh_tokens.py GL_XML")
    main(sys.argv[1])
