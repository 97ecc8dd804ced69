# Runs clang-tidy on every source of a build folder, as many at a time as there are processors, and remembers
# the clean ones: a file is looked at again when it, a header that it includes or the configuration changed.
#
#     tidy.py CLANG-TIDY BUILD
import concurrent.futures
import hashlib
import json
import os
import pathlib
import re
import subprocess
import sys
import time

ROOT = pathlib.Path(__file__).resolve().parents[2]
FOLDERS = re.compile(r"(oru|apps|bench|examples|tests|docs)/")


def dependencies(build):
    """What each object was made from, as Ninja recorded it."""
    text = subprocess.run(["ninja", "-C", build, "-t", "deps"], capture_output=True, text=True,
                          check=True).stdout
    for block in text.strip().split("\n\n"):
        head, *files = block.splitlines()
        yield head.partition(":")[0], [file.strip() for file in files]


def digest(command, files, configuration, cache={}):
    """Names the state of a source: its command, the files it includes, the configuration."""
    parts = [command, configuration]
    for file in files:
        if file not in cache:
            cache[file] = hashlib.sha256(pathlib.Path(file).read_bytes()).hexdigest()
        parts.append(cache[file])
    return hashlib.sha256("\0".join(parts).encode()).hexdigest()


def check(tidy, build, source):
    begin = time.monotonic()
    command = [tidy, "--quiet", "-p", build, source]
    if pathlib.Path(source).is_relative_to(ROOT / "tests"):
        # A test that walks over all entry points would keep the analyser busy for a quarter of an hour.
        command += [f"--extra-arg={word}" for word in ("-Xclang", "-analyzer-config", "-Xclang",
                                                       "max-nodes=5000")]
    run = subprocess.run(command, capture_output=True, text=True)
    return run.returncode, run.stdout, time.monotonic() - begin


def main(tidy, build):
    os.chdir(build)
    build = pathlib.Path.cwd()
    clean_folder = build / "tidy"
    clean_folder.mkdir(exist_ok=True)
    configuration = "".join(file.read_text() for file in sorted(ROOT.rglob(".clang-tidy"))
                            if "build" not in file.relative_to(ROOT).parts)
    objects = dict(dependencies(build))
    waiting = {}
    total = 0
    for entry in json.loads((build / "compile_commands.json").read_text()):
        source = pathlib.Path(entry["file"])
        if not source.is_relative_to(ROOT) or source.is_relative_to(build):
            continue
        if not FOLDERS.match(str(source.relative_to(ROOT))):
            continue
        total += 1
        made = re.search(r" -o (\S+)", entry["command"])[1]
        state = digest(entry["command"], objects.get(made, [str(source)]), configuration)
        if not (clean_folder / state).exists():
            waiting[str(source)] = state
    print(f"{total - len(waiting)} of {total} files are known to be clean", flush=True)

    bad = 0
    with concurrent.futures.ThreadPoolExecutor(os.cpu_count()) as pool:
        runs = {pool.submit(check, tidy, build, source): source for source in waiting}
        for run in concurrent.futures.as_completed(runs):
            source, (code, output, seconds) = runs[run], run.result()
            print(f"{pathlib.Path(source).relative_to(ROOT)}: {seconds:.0f} s", flush=True)
            if code == 0:
                (clean_folder / waiting[source]).touch()
            else:
                bad += 1
                print(output, flush=True)
    return 1 if bad else 0


if __name__ == "__main__":
    sys.exit(main(*sys.argv[1:]))
