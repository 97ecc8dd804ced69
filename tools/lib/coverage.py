# Sums up which lines of oru/ ran, from the counts that programs left in a build folder.
#
#     coverage.py ROOT BUILD
#
# Prints a table of the files with lines that did not run, and the sums. Writes BUILD/uncovered.txt and
# BUILD/coverage.json, which gcovr reads.
import collections
import concurrent.futures
import json
import os
import pathlib
import subprocess
import sys

GCOV = "x86_64-w64-mingw32-gcov-posix"


def lines_of_object(notes):
    """(file, line, count) of every line of an object with code, by the paths that the compiler was given."""
    # Without counts, because no program with the object ran, gcov complains and takes them for 0.
    output = subprocess.run([GCOV, "--json-format", "--stdout", notes], capture_output=True, text=True, check=True)
    return [(file["file"], line["line_number"], line["count"])
            for file in json.loads(output.stdout)["files"] for line in file["lines"]]


def collect(build):
    """How often each line ran, over all objects: {file: {line: count}}. Generated files begin with generated/."""
    counts = collections.defaultdict(collections.Counter)
    with concurrent.futures.ThreadPoolExecutor(os.cpu_count()) as pool:
        for lines in pool.map(lines_of_object, sorted(build.rglob("*.gcno"))):
            for file, line, count in lines:
                if file.startswith(("oru/", "generated/oru/")):
                    counts[file][line] += count
    return dict(sorted(counts.items()))


def ranges(counts):
    """The first and the last of lines that did not run, as long as none between them did."""
    first = last = None
    for line, count in sorted(counts.items()):
        if count == 0:
            first, last = first or line, line
        elif first:
            yield first, last
            first = None
    if first:
        yield first, last


def share(covered, lines):
    return f"{covered:6} of {lines:6}  {100 * covered / lines:6.2f} %" if lines else "     0 of      0"


def main(root, build):
    counts = collect(build)
    place = {file: (build if file.startswith("generated/") else root) / file for file in counts}
    sums = collections.Counter()
    uncovered = []
    for file, lines in counts.items():
        kind = "generated" if file.startswith("generated/") else "hand-written"
        covered = sum(count > 0 for count in lines.values())
        sums[kind, "covered"] += covered
        sums[kind, "lines"] += len(lines)
        if covered < len(lines):
            print(f"{share(covered, len(lines))}  {file}")
            text = place[file].read_text(encoding="utf-8").splitlines()
            uncovered += [f"{file}:{first}-{last}: {text[first - 1].strip()}" for first, last in ranges(lines)]
    for kind in ("hand-written", "generated"):
        print(f"{share(sums[kind, 'covered'], sums[kind, 'lines'])}  all {kind} files")
    (build / "uncovered.txt").write_text("".join(line + "\n" for line in uncovered), encoding="utf-8")
    (build / "coverage.json").write_text(json.dumps({"gcovr/format_version": "0.3", "files": [
        {"file": os.path.relpath(place[file], root), "functions": [], "lines": [
            {"line_number": line, "count": count, "gcovr/noncode": False, "gcovr/excluded": False,
             "branches": []}
            for line, count in sorted(lines.items())]}
        for file, lines in counts.items()]}), encoding="utf-8")


if __name__ == "__main__":
    main(*map(pathlib.Path, sys.argv[1:]))
