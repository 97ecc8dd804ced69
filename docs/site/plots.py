#!/usr/bin/env python3
"""Draws the performance page from what tools/bench measured.

Usage: plots.py RESULTS DIGEST   writes the medians and ratios of tools/bench's results, which the page is drawn from
"""
import html
import json
import re
import sys

MARKER = re.compile(r"^<!-- plot: (\w+)\n(.*?)-->\n", re.DOTALL | re.MULTILINE)
KEPT = ("base_ns", "oru_ns", "ratio")
ROW, BAR, TOP = 46, 15, 22  # pixels
FULL = 82  # per cent of the width that the longest bar takes
AS_FAST = 1.05  # up to here the difference is noise


def digest(results):
    """Of each program the comparisons of a base with the library: nanoseconds of one call, and their ratio. What has no
    base of its own is compared with the program's benchmark Plain….
    """
    programs = {}
    for program, result in results.items():
        rows, plain = {}, None
        for row in result["benchmarks"]:
            name = re.sub(r"/(?:iterations:\d+|min_time:[\d.]+|manual_time)", "", row["name"])
            if name.startswith("Plain"):
                plain = row["cpu_time"]
                continue
            if "ratio" not in row:
                if plain is None:
                    continue
                row |= {"base_ns": plain, "oru_ns": row["cpu_time"], "ratio": row["cpu_time"] / plain}
            rows[name] = {key: float(f"{row[key]:.4g}") for key in KEPT}
        programs[program] = rows
    return programs


def time_text(nanoseconds):
    for unit, size in (("s", 1e9), ("ms", 1e6), ("µs", 1e3)):
        if nanoseconds >= size:
            return f"{nanoseconds / size:.3g} {unit}"
    return f"{nanoseconds:.3g} ns"


def plot(rows):
    """Bars of ratios as SVG: positions in per cent, so that it fits any width with letters of one size."""
    longest = max(max(row["ratio"] for _, row in rows), 1.1)
    one = FULL / longest
    height = TOP + ROW * len(rows)
    parts = [f'<svg class="plot" height="{height}" role="img">',
             f'<line class="one" x1="{one:.2f}%" x2="{one:.2f}%" y1="{TOP - 6}" y2="{height}"/>',
             f'<text class="axis" x="{one:.2f}%" y="{TOP - 10}" text-anchor="middle">1: as fast</text>']
    for number, (label, row) in enumerate(rows):
        y = TOP + ROW * number
        kind = ' class="worse"' if row["ratio"] > AS_FAST else ""
        width = row["ratio"] * one
        times = f'{time_text(row["base_ns"])} → {time_text(row["oru_ns"])}'
        parts += [f'<text x="0" y="{y + 14}">{html.escape(label)} <tspan class="axis">{times}</tspan></text>',
                  f'<rect{kind} x="0" y="{y + 20}" width="{width:.2f}%" height="{BAR}" rx="2"/>',
                  f'<text x="{width:.2f}%" dx="6" y="{y + 32}">{row["ratio"]:.2f}</text>']
    return "".join(parts) + "</svg>"


def insert(text, path):
    """The page with each marker's plot: the program's name, then lines 'benchmark | label', and the next paragraph as its
    caption."""
    results = json.loads(path.read_text(encoding="utf-8"))["programs"]

    def figure(match):
        rows = []
        for line in match[2].strip().split("\n"):
            name, _, label = (part.strip() for part in line.partition("|"))
            if name not in results.get(match[1], {}):
                raise ValueError(f"{path.name} has no {name} of {match[1]}")
            rows.append((label, results[match[1]][name]))
        return f"\n\\htmlonly\n{plot(rows)}\n\\endhtmlonly\n\n"

    return MARKER.sub(figure, text)


if __name__ == "__main__":
    if len(sys.argv) != 3:
        sys.exit(__doc__)
    with open(sys.argv[1], encoding="utf-8") as file:
        programs = digest(json.load(file))
    blocks = []
    for program, rows in programs.items():  # a row a line, so that a change can be read
        lines = ",\n".join(f"   {json.dumps(name)}: {json.dumps(row)}" for name, row in rows.items())
        blocks.append(f"  {json.dumps(program)}: {{\n{lines}\n  }}")
    with open(sys.argv[2], "w", encoding="utf-8") as file:
        file.write('{\n "machine": "2 virtual CPUs, llvmpipe under Wine",\n "programs": {\n')
        file.write(",\n".join(blocks) + "\n }\n}\n")
