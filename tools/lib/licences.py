"""Whose work the installed files contain, by what the compiler and the linker read, and under which terms.

The terms are the copyright files of the Debian packages that the files came from.
"""
import os
import pathlib
import re
import subprocess

ROOT = pathlib.Path(__file__).resolve().parents[2]
DEPS = ROOT / "build/deps"
COMMON = pathlib.Path("/usr/share/common-licenses")

# Where the objects lie, relative to the build folder, of which the installed files are made.
OBJECTS = ("oru/", "apps/")

# The cross-built libraries: what their installed files' names begin with, and the Debian source package.
CROSS_BUILT = [
    (("include/tbb", "include/oneapi", "lib/libtbb"), "onetbb"),
    (("include/png", "include/libpng", "lib/libpng"), "libpng1.6"),
    (("include/j", "lib/libjpeg"), "libjpeg-turbo"),
    (("include/lcms2", "lib/liblcms2"), "lcms2"),
    (("include/tiff", "lib/libtiff"), "tiff"),
]


class Unknown(Exception):
    """A file that nobody's licence is known for."""


def files_read(build):
    """Every file outside the repository that a compiler or linker of the installed files read."""
    listing = subprocess.run(["ninja", "-C", build, "-t", "deps"], check=True, capture_output=True, text=True).stdout
    names, wanted = set(), False
    for line in listing.splitlines():
        if line.startswith("    "):
            if wanted:
                names.add(line.strip())
        else:
            wanted = line.startswith(OBJECTS)
    lists = list(build.glob("*.linked"))
    if not lists or not names:
        raise Unknown(f"{build} has no list of what was compiled and linked; build it with tools/package")
    for linked in lists:
        names |= set(re.split(r"[\s\\]+", linked.read_text(encoding="utf-8").split(":", 1)[1]))
    for name in names - {""}:
        # Without "..", but with the links of build/deps, which tell a library's files from the repository's.
        path = pathlib.Path(os.path.normpath(build / name.rstrip(":")))
        if inside_deps(path) or not (path.is_relative_to(ROOT) or path.is_relative_to(build)):
            yield path


def inside_deps(path):
    """The path below build/deps, which may itself be a link; None for other files."""
    return next((path.relative_to(folder) for folder in (DEPS, DEPS.resolve()) if path.is_relative_to(folder)), None)


def source_package(path):
    """The cross-built library that a file below build/deps belongs to; None for a link to the system's."""
    inside = inside_deps(path)
    if inside is None or path.resolve().is_relative_to("/usr"):
        return None
    for beginnings, package in CROSS_BUILT:
        if inside.as_posix().startswith(beginnings):
            return package
    raise Unknown(f"build/deps/{inside} belongs to no library that tools/lib/licences.py knows: add it there")


def debian_packages(paths):
    """Source packages and versions of the system's files, each with one of its packages' copyright file."""
    owners = subprocess.run(["dpkg", "-S", *sorted(paths)], capture_output=True, text=True).stdout
    owned = dict(reversed(line.rsplit(": ", 1)) for line in owners.splitlines())
    if missing := sorted(set(paths) - set(owned)):
        raise Unknown(f"no Debian package owns {missing[0]}, so its licence is not known")
    packages = sorted({owner.split(",")[0].split(":")[0] for owner in owned.values()})
    told = subprocess.run(["dpkg-query", "-W", "-f", "${Package}\t${source:Package}\t${source:Version}\n", *packages],
                          check=True, capture_output=True, text=True).stdout
    for line in told.splitlines():
        package, source, version = line.split("\t")
        yield source, version, pathlib.Path("/usr/share/doc") / package / "copyright"


def texts(build):
    """The licences as files: name and bytes."""
    cross_built, system = set(), set()
    for path in files_read(build):
        if package := source_package(path):
            cross_built.add(package)
        else:
            system.add(str(path.resolve()))
    found = {}
    for package in cross_built:
        folder = DEPS / "src" / package / "debian"
        version = re.search(r"\((.+?)\)", (folder / "changelog").read_text(encoding="utf-8"))[1]
        found[package] = (version, (folder / "copyright").read_bytes())
    for source, version, copyright_file in debian_packages(system):
        found[source] = (version, copyright_file.read_bytes())

    files = {f"{name}.txt": text for name, (_, text) in found.items()}
    # Some of them refer to texts that every Debian system has.
    for text in list(files.values()):
        for name in re.findall(rb"/usr/share/common-licenses/([\w.-]*\w)", text):
            name = name.decode()
            files[f"common-licenses/{name}.txt"] = (COMMON / name).read_bytes()
    table = "".join(f"| {name} | {version} | [{name}.txt]({name}.txt) |\n"
                    for name, (version, _) in sorted(found.items()))
    files["README.md"] = (
        "# What the package contains of others\n\n"
        "The programs, the library and the run-time libraries beside it contain work of these Debian source packages,\n"
        "under the terms of the files. Not everything that a file lists is in the package. Texts that a file refers to\n"
        "lie in common-licenses. ORU's own licence is LICENSE in the folder above.\n\n"
        f"| source package | version | terms |\n|---|---|---|\n{table}").encode()
    return files
