#!/usr/bin/env python3
"""Draws what tools/bench develop measured: a bar for each tool, in groups of one photo each.

Usage: peers.py DIGEST SVG
"""
import html
import json
import sys

ROW, BAR, GROUP, TOP = 22, 14, 16, 8  # pixels
LEFT, WIDTH = 130, 720
LONGEST = 400
COLOURS = {"develop": "#2563a8"}
OTHER = "#b8b8b8"
STYLE = ("text{font:13px sans-serif;fill:#444}.group{font-weight:bold}"
         "@media(prefers-color-scheme:dark){text{fill:#ccc}}")


def text_of(measure):
    return f'{measure["wall_s"]:.3g} s, {measure["memory_mb"]} MB'


def draw(digest):
    """Each group's longest bar takes all the room: the groups' times differ too much for one scale."""
    parts, y = [], TOP
    for what, measures in digest.items():
        parts.append(f'<text class="group" x="0" y="{y + BAR - 2}">{html.escape(what)}</text>')
        y += ROW
        scale = LONGEST / max(measure["wall_s"] for measure in measures.values())
        for name, measure in measures.items():
            length = measure["wall_s"] * scale
            parts += [f'<text x="{LEFT - 8}" y="{y + BAR - 2}" text-anchor="end">{html.escape(name)}</text>',
                      f'<rect x="{LEFT}" y="{y}" width="{length:.1f}" height="{BAR}" rx="2" '
                      f'fill="{COLOURS.get(name, OTHER)}"/>',
                      f'<text x="{LEFT + length + 6:.1f}" y="{y + BAR - 2}">{text_of(measure)}</text>']
            y += ROW
        y += GROUP
    return (f'<svg xmlns="http://www.w3.org/2000/svg" viewBox="0 0 {WIDTH} {y}" width="{WIDTH}" role="img">'
            f"<style>{STYLE}</style>\n" + "\n".join(parts) + "\n</svg>\n")


if __name__ == "__main__":
    if len(sys.argv) != 3:
        sys.exit(__doc__)
    with open(sys.argv[1], encoding="utf-8") as file:
        drawing = draw(json.load(file))
    with open(sys.argv[2], "w", encoding="utf-8") as file:
        file.write(drawing)
