#!/usr/bin/env python3
"""Links the objects that clang-cl made for Microsoft's binary interface and names what is missing beyond the run-time
libraries, which only Microsoft has.

Usage: link_msvc.py BUILD
"""
import pathlib
import re
import subprocess
import sys
import tempfile

IMPORTS = pathlib.Path("/usr/x86_64-w64-mingw32/lib")
SYSTEM = ["opengl32", "gdi32", "user32", "dxgi", "dxguid", "kernel32", "ucrtbase"]
# Standard library, oneTBB, and what the compiler itself calls: allocation, statics, thread-local variables, checks of
# the stack, type information; four functions that MinGW keeps elsewhere than in ucrtbase.
RUN_TIME = re.compile(r"""\bstd:: | \btbb:: | \boperator\ (new|delete)\b | ^const\ type_info::
    | ^(_Init_thread_\w+ | __dyn_tls_\w+ | __tls_guard | _tls_index | __security_\w+ | __std_terminate | _fltused)$
    | ^(atexit | exp | ldexp | pow)$""", re.VERBOSE)


def main(build):
    objects = [str(path) for path in sorted((pathlib.Path(build) / "oru/CMakeFiles/oru.dir").rglob("*"))
               if path.suffix in (".obj", ".res")]
    with tempfile.TemporaryDirectory() as scratch:
        command = ["lld-link-14", "/dll", "/noentry", "/nologo", "/nodefaultlib", "/errorlimit:0",
                   f"/out:{scratch}/oru.dll", *objects, *(str(IMPORTS / f"lib{name}.a") for name in SYSTEM)]
        said = subprocess.run(command, capture_output=True, text=True).stderr
    undefined = set(re.findall(r"error: undefined symbol: (?:__declspec\(dllimport\) )?(.+)", said))
    errors = {line for line in said.splitlines() if ": error: " in line and "undefined symbol" not in line}
    strange = sorted(name for name in undefined if not RUN_TIME.search(name))
    for line in [*sorted(errors), *(f"error: nobody defines {name}" for name in strange)]:
        print(line)
    if not undefined: # the run-time libraries are missing for sure
        print(f"error: the linker did not get as far as names:\n{said}")
    print(f"{len(objects)} objects; {len(undefined)} names are left to run-time libraries")
    return 1 if errors or strange or not undefined else 0


if __name__ == "__main__":
    sys.exit(main(*sys.argv[1:]) if len(sys.argv) == 2 else __doc__)
