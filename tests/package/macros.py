"""Which macros the installed headers leave behind: none but ORU_..., beyond what the system's headers define.

Usage: macros.py INCLUDE-FOLDER COMPILER [ARGUMENT...]
"""
import pathlib
import re
import subprocess
import sys


def macros(compiler, includes):
    source = "".join(f"#include <{name}>\n" for name in includes)
    listing = subprocess.run([*compiler, "-dM", "-E", "-x", "c++", "-"], input=source, check=True,
                             stdout=subprocess.PIPE, text=True).stdout
    return set(re.findall(r"^#define (\w+)", listing, re.MULTILINE))


def main(folder, *compiler):
    folder = pathlib.Path(folder)
    headers = sorted(path.relative_to(folder).as_posix() for path in folder.glob("oru/**/*.h")
                     if "khronos" not in path.parts)
    named = (re.findall(r"^\s*#\s*include <([^>]+)>", (folder / name).read_text(), re.MULTILINE) for name in headers)
    system = sorted({name for names in named for name in names})
    # windows.h comes before OpenGL's own headers, which need it.
    system.sort(key=lambda name: name != "windows.h")
    left = macros(compiler, system + headers) - macros(compiler, system)
    if not any(name.startswith("ORU_") for name in left):
        sys.exit(f"{folder} defines nothing, so these are not the headers")
    if leaks := sorted(name for name in left if not name.startswith("ORU_")):
        sys.exit(f"the installed headers define {', '.join(leaks)}")


main(*sys.argv[1:])
