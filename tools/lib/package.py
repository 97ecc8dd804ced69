#!/usr/bin/env python3
"""Packs what a build folder installs, with guide, examples and licences, into zip files whose bytes depend on the
revision alone.

Usage: package.py BUILD OUTPUT

Prints the files it made, each with its size. On a failure it ends with 1 and leaves no file behind.
"""
import hashlib
import json
import os
import pathlib
import posixpath
import re
import subprocess
import sys
import tempfile
import time
import zipfile

import licences

ROOT = pathlib.Path(__file__).resolve().parents[2]

# What the package takes from the repository, and where it lies there.
FILES = [
    ("packaging/README.md", "README.md"),
    ("CHANGELOG.md", "CHANGELOG.md"),
    ("CONTRIBUTING.md", "CONTRIBUTING.md"),  # with the promise between versions
    ("LICENSE", "LICENSE"),
    ("SECURITY.md", "SECURITY.md"),
    ("docs/start.md", "docs/start.md"),
    ("docs/guide", "docs/guide"),
    ("docs/images", "docs/images"),
    ("docs/architecture.md", "docs/architecture.md"),
    ("docs/performance/README.md", "docs/performance/README.md"),
    ("docs/oruinfo.schema.json", "docs/oruinfo.schema.json"),
    ("examples", "examples"),
    ("apps/common", "apps/common"),  # what the examples share
]
DEBUG_DATA = ".debug"


def output_of(*command):
    return subprocess.run(command, cwd=ROOT, check=True, capture_output=True, text=True).stdout


def version_of(build):
    """The version of the build, and that the recipe for vcpkg, which has to repeat it, names the same."""
    cache = (build / "CMakeCache.txt").read_text(encoding="utf-8")
    version = re.search(r"^CMAKE_PROJECT_VERSION:\w+=(.+)$", cache, re.MULTILINE)[1]
    recipe = ROOT / "packaging/vcpkg/oru/vcpkg.json"
    if (named := json.loads(recipe.read_text(encoding="utf-8"))["version"]) != version:
        sys.exit(f"package: {recipe.relative_to(ROOT)} names version {named}, CMakeLists.txt {version}")
    return version


def time_of_revision():
    """When the revision was committed, in seconds; SOURCE_DATE_EPOCH wins, as everywhere."""
    if epoch := os.environ.get("SOURCE_DATE_EPOCH"):
        return int(epoch)
    if output_of("git", "status", "--porcelain"):
        print("package: the tree has changes that are not committed: the package is of no revision", file=sys.stderr)
    return int(output_of("git", "log", "-1", "--format=%ct"))


def contents(build, prefix):
    """Every file of the package: its path there, and its bytes."""
    subprocess.run(["cmake", "--install", build, "--prefix", prefix], check=True, stdout=subprocess.DEVNULL)
    files = {path.relative_to(prefix).as_posix(): path.read_bytes() for path in prefix.rglob("*") if path.is_file()}
    for source, target in FILES:
        names = output_of("git", "ls-files", "-z", "--", source).split("\0")[:-1]
        if not names:
            sys.exit(f"package: the repository has no {source}")
        for name in names:
            files[target + name.removeprefix(source)] = (ROOT / name).read_bytes()
    files.update(site(prefix.parent))
    for name, text in licences.texts(build).items():
        files[f"licences/{name}"] = text
    for library in [name for name in files if name.endswith(".dll")]:
        data = build / (library + DEBUG_DATA)
        if data.is_file():
            files[library + DEBUG_DATA] = data.read_bytes()
    return files


def require_links(files):
    """Every page's links lead to something in the package."""
    folders = {str(parent) for name in files for parent in pathlib.PurePosixPath(name).parents}
    for page in sorted(name for name in files if name.endswith(".md")):
        text = re.sub(r"^```.*?^```", "", files[page].decode("utf-8"), flags=re.DOTALL | re.MULTILINE)
        for link in re.findall(r"\]\(([^)#:]+)(?:#[^)]*)?\)", text):  # not in code: [](State &state)
            target = posixpath.normpath(posixpath.join(posixpath.dirname(page), link))
            if target not in files and target not in folders:
                sys.exit(f"package: {page} links to {link}, which is not in the package")


def site(scratch):
    """The documentation as tools/docs builds it, without its look in a browser."""
    folder = scratch / "site"
    subprocess.run([sys.executable, "-B", ROOT / "docs/site/build.py", scratch / "site-work", folder], check=True,
                   stdout=subprocess.DEVNULL)
    return {f"docs/site/{path.relative_to(folder).as_posix()}": path.read_bytes()
            for path in folder.rglob("*") if path.is_file()}


def write_zip(path, files, folder, seconds):
    """Entries in order, with the revision's time and modes that no umask changes."""
    moment = time.gmtime(seconds)[:6]
    with zipfile.ZipFile(path, "w", zipfile.ZIP_DEFLATED, compresslevel=9) as archive:
        for name in sorted(files):
            entry = zipfile.ZipInfo(f"{folder}/{name}", moment)
            entry.create_system = 3  # Unix, whose modes follow
            mode = 0o755 if name.endswith((".dll", ".exe")) else 0o644
            entry.external_attr = (0o100000 | mode) << 16
            entry.compress_type = zipfile.ZIP_DEFLATED
            archive.writestr(entry, files[name])


def main(build, output):
    build, output = pathlib.Path(build).resolve(), pathlib.Path(output)
    name = f"oru-{version_of(build)}-windows-x86_64"
    seconds = time_of_revision()
    output.mkdir(parents=True, exist_ok=True)
    with tempfile.TemporaryDirectory(dir=output, prefix=".package-") as scratch:
        scratch = pathlib.Path(scratch)
        files = contents(build, scratch / "prefix")
        require_links(files)
        debug = {path: files.pop(path) for path in list(files) if path.endswith(DEBUG_DATA)}
        made = []
        for stem, part in ((name, files), (f"{name}-debug", debug)):
            if part:
                file = scratch / f"{stem}.zip"
                write_zip(file, part, name, seconds)
                digest = hashlib.sha256(file.read_bytes()).hexdigest()
                (scratch / f"{file.name}.sha256").write_text(f"{digest}  {file.name}\n", encoding="utf-8")
                made += [file.name, f"{file.name}.sha256"]
        for file in made:
            os.replace(scratch / file, output / file)
            print(f"{output / file}  {(output / file).stat().st_size:,} bytes")


if __name__ == "__main__":
    if len(sys.argv) != 3:
        sys.exit(__doc__)
    try:
        main(*sys.argv[1:])
    except (OSError, subprocess.CalledProcessError, licences.Unknown) as failure:
        sys.exit(f"package: {failure}")
