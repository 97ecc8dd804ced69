#!/usr/bin/env python3
"""Builds the site: guides, reference, the map of functions, the performance page. tools/docs runs it.

Usage: build.py WORK OUTPUT

WORK keeps what is made on the way. Prints what is wrong, a line each, and ends with 1 then; OUTPUT is left as it was.
"""
import html
import pathlib
import re
import shutil
import subprocess
import sys

FOLDER = pathlib.Path(__file__).resolve().parent
ROOT = FOLDER.parents[1]
CATALOGUE = ROOT / "catalogue"
sys.path[:0] = [str(FOLDER), str(CATALOGUE)]

import callmap
import finish
import links
import pages
import plots
import reference
import searchdata
import tables
import undocumented

OWN_FILES = ["oru.css", "site.js"]
FRAME = ["header.html", "footer.html"]
NOT_INSTALLED = {"internalwindow.h"}
SOURCE_PAGE = """<!DOCTYPE html>
<html lang="en"><head><meta charset="utf-8"><meta name="viewport" content="width=device-width">
<title>{title}</title><link rel="icon" href="data:,"><link rel="stylesheet" href="{up}oru.css"></head>
<body><div class="contents"><h1>{title}</h1>
<ul>
{rows}</ul>
<p><a href="{up}index.html">The start page</a></p></div></body></html>
"""


def write(path, text):
    path.parent.mkdir(parents=True, exist_ok=True)
    path.write_text(text, encoding="utf-8")


def version():
    return re.search(r"project\(oru VERSION ([\d.]+)", (ROOT / "CMakeLists.txt").read_text(encoding="utf-8"))[1]


def read_headers(work):
    """The installed headers, hand-written and generated, as Doxygen reads them: in `work`/include."""
    generated = work / "generated"
    subprocess.run([sys.executable, "-B", CATALOGUE / "generate.py", "--output", generated], check=True)
    text = (ROOT / "oru/version.h.in").read_text(encoding="utf-8").replace("@PROJECT_VERSION@", version())
    for part, number in zip(("MAJOR", "MINOR", "PATCH"), version().split(".")):
        text = text.replace(f"@PROJECT_VERSION_{part}@", number)
    write(generated / "oru/version.h", text)
    for top in (ROOT, generated):
        for path in sorted((top / "oru").rglob("*.h")):
            name = path.relative_to(top)
            if "internal" not in name.parts and name.name not in NOT_INSTALLED:
                text = with_rows(path.read_text(encoding="utf-8"), generated)
                write(work / "include" / name, with_file_text(name.as_posix(), text))


def with_rows(text, generated):
    """The lists of rows that a header includes: the uniform setters as the operations that they are; the others, of
    which the map shows each row, not at all."""
    def rows(match):
        if not match[1].endswith("/uniformoperations.inc"):
            return ""
        found = re.findall(r"^ORU_UNIFORM_OPERATION\((\w+), (\(.*?\)), ",
                           (generated / match[1]).read_text(encoding="utf-8"), re.MULTILINE)
        return " ".join(f"void {name}{parameters};" for name, parameters in found)

    return re.sub(r'^#include "([^"]+\.inc)"$', rows, text, flags=re.MULTILINE)


def with_file_text(name, text):
    """The same lines, with the comment at the top as Doxygen's text of the file."""
    lines = text.split("\n")
    if "#pragma once" not in lines:
        return text
    end = lines.index("#pragma once")
    top = [line.removeprefix("//") for line in lines[:end]]
    if lines[0].startswith("// Generated from "):
        top[0] = ""
    lines[:end + 1] = [f"///{line}" for line in top] + [f"/// @file {name}"]
    return "\n".join(lines)


def doxygen(work, navigation, **outputs):
    """Runs Doxygen and returns its warnings, each with the place in the repository."""
    for name in FRAME:
        text = (FOLDER / name).read_text(encoding="utf-8")
        write(work / name, text.replace("<!--NAVIGATION-->", navigation))
    text = (FOLDER / "Doxyfile.in").read_text(encoding="utf-8")
    for name, value in {"WORK": work, "SITE": FOLDER, "VERSION": version(), **outputs}.items():
        text = text.replace(f"@{name}@", str(value))
    write(work / "Doxyfile", text)
    run = subprocess.run(["doxygen", work / "Doxyfile"], capture_output=True, text=True)
    if run.returncode:
        sys.exit(f"docs: doxygen failed: {run.stderr.strip()}")
    for place in ("include/", "pages/"):
        run.stderr = run.stderr.replace(f"{work}/{place}", "")
    return [line for line in run.stderr.splitlines() if line.strip()]


def copy_sources(site, folder):
    """The files and folders of the repository that pages link to, as text."""
    for path in sorted(site.sources):
        names = [path]
        if (ROOT / path).is_dir():
            listed = subprocess.run(["git", "ls-files", "--", path], cwd=ROOT, check=True, capture_output=True,
                                    text=True)
            names = [name for name in listed.stdout.split() if pathlib.Path(name).suffix not in pages.PICTURES]
            rows = "".join(f'<li><a href="{name}.txt">{name}</a></li>\n'
                           for name in (html.escape(name.removeprefix(f"{path}/")) for name in names))
            up = "../" * (len(pathlib.PurePath(path).parts) + 1)
            write(folder / "source" / path / "index.html", SOURCE_PAGE.format(title=path, up=up, rows=rows))
        for name in names:
            write(folder / "source" / f"{name}.txt", (ROOT / name).read_text(encoding="utf-8"))


def build(work, output):
    for folder in ("include", "pages", "xml", "html"):
        shutil.rmtree(work / folder, ignore_errors=True)
    read_headers(work)
    (work / "pages").mkdir()
    faults = doxygen(work, "", XML="YES", HTML="NO")
    macros = undocumented.local_macros(ROOT / "oru", work / "generated")
    lacking = sorted(set(undocumented.symbols(work / "xml", macros)))
    faults += [f"{file}:{line}: undocumented: {symbol}" for file, line, symbol in lacking]
    found = reference.symbols(work / "xml")

    site = pages.Site(ROOT)
    for path, name in site.names.items():
        text = site.page(path)
        if name == "performance":
            text = plots.insert(text, ROOT / "docs/performance/results.json")
        write(work / "pages" / path, text)
    functions = callmap.Map(ROOT, work / "generated", reference.operations(found), CATALOGUE, tables)
    for name, text in {"map": functions.page(), **reference.lists(found)}.items():
        write(work / f"pages/{name}.md", text)
    print(functions.summary())

    classes = {symbol.page: (symbol.name, symbol.kind) for symbol in found if symbol.kind in reference.KINDS}
    finisher = finish.Finisher(site, classes)
    faults += [line for line in doxygen(work, finisher.navigation(), XML="NO", HTML="YES") if line not in faults]
    folder = work / "html"
    for path in sorted(folder.rglob("*.html")):
        write(path, finisher.finished(path.read_text(encoding="utf-8"), path.name))
    for path in [*(FOLDER / name for name in OWN_FILES), *(ROOT / picture for picture in site.pictures)]:
        shutil.copy(path, folder)
    copy_sources(site, folder)
    write(folder / "searchdata.js", searchdata.script(found, site, folder, functions.entries()))
    faults += links.check(folder, {"searchdata.js"})
    if faults:
        print("\n".join(f"docs: {fault}" for fault in faults), file=sys.stderr)
        print(f"docs: {len(faults)} faults, {len(lacking)} of them undocumented symbols", file=sys.stderr)
        return 1
    output.parent.mkdir(parents=True, exist_ok=True)
    shutil.rmtree(output, ignore_errors=True)
    shutil.move(folder, output)
    return 0


if __name__ == "__main__":
    if len(sys.argv) != 3:
        sys.exit(__doc__)
    try:
        sys.exit(build(*(pathlib.Path(argument).resolve() for argument in sys.argv[1:])))
    except (OSError, ValueError, pages.Fault, subprocess.CalledProcessError) as fault:
        sys.exit(f"docs: {fault}")
