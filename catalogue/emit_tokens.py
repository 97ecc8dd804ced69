"""Emits the names of OpenGL constants, one for each value.

Among the constants of a value, the one of gl_token_choices.tsv is taken when there is one. Otherwise:
a name without a vendor's suffix before _ARB, _EXT and the vendors' names in this order; of several core
names the one of the latest OpenGL version, which today's documentation uses; then the shortest.

The thirteen constants that GL_ARB_fragment_program alone adds (0x8804 to 0x8810, its target and its counts
of instructions) get no name: hosts know them as unknown tokens. What it shares with GL_ARB_vertex_program
has one.
"""
import itertools
import re

import tables

TOKENS = "gl_tokens.tsv"
CHOICES = "gl_token_choices.tsv"
SUFFIXES = ["ARB", "EXT", "APPLE", "ATI", "NV", "SGIS"]
LEFT_OUT = "GL_ARB_fragment_program"


def emit(folder, writer):
    names = choose(tables.rows(folder / TOKENS, 3), dict(tables.rows(folder / CHOICES, 2)))
    values = [int(value, 0) for value, _ in names]
    if values != sorted(set(values)):
        raise ValueError(f"{TOKENS}: the values do not ascend")
    rows = "\n".join(f'ORU_GL_TOKEN({value}, "{name}")' for value, name in names)
    writer.write("oru/oru_ogl/extensionator/internal/opengltokens.inc", f"""// One line per named value, ascending; define ORU_GL_TOKEN(Value, Name) before.
{rows}
#undef ORU_GL_TOKEN
""", f"catalogue/{TOKENS} and {CHOICES} by emit_tokens.py")


def choose(tokens, choices):
    """(value, name) for each value, in the order of the table."""
    names = []
    for value, group in itertools.groupby(tokens, key=lambda row: row[0]):
        ranked = sorted(rank(name, origin) + (name,) for _, name, origin in group if origin != LEFT_OUT)
        if not ranked:
            continue
        candidates = [entry[-1] for entry in ranked]
        choice = choices.pop(value, candidates[0])
        if choice not in candidates:
            raise ValueError(f"{CHOICES}: {choice} has not the value {value}")
        names.append((value, choice))
    if choices:
        raise ValueError(f"{CHOICES}: no constant has the value {next(iter(choices))}")
    return names


def rank(name, origin):
    suffix = name.rpartition("_")[2]
    place = SUFFIXES.index(suffix) + 1 if suffix in SUFFIXES else 0
    version = float(origin) if re.fullmatch(r"\d\.\d", origin) else 0
    return place, -version, len(name)
