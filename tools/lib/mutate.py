"""Puts each fault of a table into a copy of the tree and tells which the tests catch: see tools/mutate.

A verdict holds for one row and one state of the tree. It is written as soon as it is known, so that a run goes on
where the last one ended.
"""
import argparse
import collections
import contextlib
import hashlib
import json
import os
import pathlib
import re
import shutil
import signal
import subprocess
import sys
import tempfile
import time

ROOT = pathlib.Path(__file__).resolve().parents[2]
TABLE = ROOT / "tools/faults"
WORK = ROOT / "build/mutate"
TREE = WORK / "tree"
BUILD = TREE / "build/mingw"
RESULTS = WORK / "results.tsv"
COLUMNS = ["name", "file", "text", "replacement", "effect", "filter", "survives"]
FEWEST_ROWS = 120
LOWEST_RATE = 95
FIRST_PROGRAMS = 4  # built and run before the rest is
FIXTURES = {"FIXTURES_REQUIRED", "FIXTURES_SETUP"}
KNOWN_PROPERTIES = FIXTURES | {
    "DISABLED", "ENVIRONMENT", "LABELS", "PASS_REGULAR_EXPRESSION", "RUN_SERIAL", "SKIP_REGULAR_EXPRESSION", "TIMEOUT",
    "WORKING_DIRECTORY"}

Row = collections.namedtuple("Row", ["area"] + COLUMNS)
Test = collections.namedtuple("Test", "name command environment folder serial passes")
Result = collections.namedtuple("Result", "group passed skipped output seconds")


# The table

def read_table():
    """The rows of every area, and a line for everything that is wrong with them."""
    rows, errors = [], []
    for path in sorted(TABLE.glob("*.tsv")):
        header, *lines = path.read_text(encoding="utf-8").splitlines()
        if header.split("\t") != COLUMNS:
            errors.append(f"{path.name}: the first line does not name the columns {' '.join(COLUMNS)}")
        for number, line in enumerate(lines, 2):
            cells = line.split("\t")
            if len(cells) == len(COLUMNS) and all(cells[i] for i in (0, 1, 2, 4)):
                rows.append(Row(path.stem, *cells))
            else:
                errors.append(f"{path.name}:{number}: not {len(COLUMNS)} columns with a name, file, text and effect")
    errors += [f"{row.name}: {error}" for row in rows for error in row_errors(row, rows)]
    if len(rows) < FEWEST_ROWS:
        errors.append(f"{len(rows)} rows are fewer than {FEWEST_ROWS}")
    sources = (path for top in ("oru", "apps") for path in (ROOT / top).rglob("*.cpp"))
    bare = {path.parent for path in sources} - {(ROOT / row.file).parent for row in rows}
    return rows, errors + [f"no row puts a fault into {folder.relative_to(ROOT)}" for folder in sorted(bare)]


def row_errors(row, rows):
    if not re.fullmatch(r"[a-z0-9]+(-[a-z0-9]+)*", row.name):
        yield "the name is not in kebab-case"
    if any(row is not other and (row.name == other.name or row[2:5] == other[2:5]) for other in rows):
        yield "another row has its name or its fault"
    if row.text == row.replacement:
        yield "the replacement does not differ from the text"
    path = ROOT / row.file
    if not path.is_file():
        yield f"there is no file {row.file}"
    elif (count := path.read_text(encoding="utf-8").count(row.text)) != 1:
        yield f"its text stands {count} times in {row.file}"
    try:
        re.compile(row.filter)
    except re.error as error:
        yield f"the filter is no regular expression: {error}"


# The copy of the tree

def tree_files():
    listed = subprocess.run(["git", "ls-files", "-z", "--cached", "--others", "--exclude-standard"], cwd=ROOT,
                            check=True, capture_output=True, text=True)
    return sorted(name for name in set(listed.stdout.split("\0")) if (ROOT / name).is_file())


def tree_state():
    """A hash of all that a verdict depends on: every file but documentation, the table and this tool."""
    state = hashlib.sha256()
    for name in tree_files():
        if not re.search(r"\.md$|^tools/faults/|^tools/(lib/)?mutate", name):
            state.update(f"{name}\0".encode() + hashlib.sha256((ROOT / name).read_bytes()).digest())
    return state.hexdigest()


def synchronise():
    """Makes the copy equal to the tree. Only what differs is written, with the time of now, so that Ninja builds again
    what an interrupted run left with a fault in it, and nothing else."""
    names = tree_files()
    for name in names:
        source, copy = ROOT / name, TREE / name
        if not copy.is_file() or copy.read_bytes() != source.read_bytes():
            copy.parent.mkdir(parents=True, exist_ok=True)
            shutil.copyfile(source, copy)
        shutil.copymode(source, copy)
    for path in TREE.rglob("*"):
        name = str(path.relative_to(TREE))
        if path.is_file() and not name.startswith("build/") and name not in names:
            path.unlink()


def prepare():
    """The copy as the tree is, built."""
    if not (TREE / "build/deps").exists():
        (TREE / "build").mkdir(parents=True, exist_ok=True)
        (TREE / "build/deps").symlink_to((ROOT / "build/deps").resolve())
    synchronise()
    if not (BUILD / "build.ninja").exists():
        subprocess.run(["cmake", "-S", TREE, "--preset", "mingw", "-B", BUILD, "-DORU_BUILD_BENCHMARKS=OFF"],
                       check=True, stdout=subprocess.DEVNULL)
    if failure := build():
        raise SystemExit(failure + "the tree does not build")


def build(*targets):
    """Builds the targets, or everything, and returns what the build printed when it failed. A library whose exports are
    still the same makes no program link again: its import library gets its old time back."""
    def ninja(*names):
        done = subprocess.run(["ninja", "-C", BUILD, *names], stdin=subprocess.DEVNULL, stdout=subprocess.PIPE,
                              stderr=subprocess.STDOUT, text=True, errors="replace")
        return done.stdout if done.returncode else None

    rules = (BUILD / "build.ninja").read_text(encoding="utf-8")
    links = re.findall(r"^build (\S+) (\S+): \w*_SHARED_LIBRARY_LINKER_", rules, re.MULTILINE)
    imports = [BUILD / link[1] for link in links]
    before = {path: (path.read_bytes(), path.stat()) for path in imports if path.exists()}
    failure = ninja(*(link[0] for link in links))
    for path, (content, stat) in before.items():
        if path.exists() and path.read_bytes() == content:
            os.utime(path, ns=(stat.st_atime_ns, stat.st_mtime_ns))
    return failure or ninja(*targets)


# The tests

def gtest_case(test):
    return next((a.partition("=")[2] for a in test.command if a.startswith("--gtest_filter=")), None)


def without_case(test):
    return [argument for argument in test.command if not argument.startswith("--gtest_filter=")]


class Group:
    """Tests that one process can run, the cases of a GoogleTest program in one environment, or a single test."""

    def __init__(self, tests, seconds):
        self.tests, self.seconds, self.serial = tests, seconds, tests[0].serial
        self.program = next((a for a in tests[0].command if a.endswith(".exe") and gtest_case(tests[0])), None)
        paths = [os.path.relpath(path, BUILD) for path in (tests[0].folder, self.program) if path]
        self.words = {word.lower().rstrip("s") for text in paths + [test.name for test in tests]
                      for word in re.findall("[A-Z]?[a-z]{2,}", text)}

    def command(self):
        if len(self.tests) == 1:
            return self.tests[0].command
        cases = ":".join(map(gtest_case, self.tests))
        return without_case(self.tests[0]) + ["--gtest_fail_fast", f"--gtest_filter={cases}"]

    def part(self, wanted):
        """The group of its tests that are wanted, in a list of one or none."""
        tests = [test for test in self.tests if wanted(test)]
        return [Group(tests, self.seconds)] if tests else []

    def singles(self):
        return [Group([test], self.seconds) for test in self.tests]

    def nearness(self, row, catches):
        """How likely it catches the row: what it caught of the same file and folder, then the words in common."""
        names = {test.name for test in self.tests}
        files = {file for file, test in catches.values() if test in names}
        learned = (row.file in files) + (os.path.dirname(row.file) in map(os.path.dirname, files))
        return learned, sum(len(word) for word in self.words if word in row.file), -self.seconds

    def suspect(self, output):
        """The test that failed, as far as the output of all of them tells."""
        cases = re.findall(r"^\[  FAILED  \] (\S+?)(?:,| \(|$)", output, re.MULTILINE)[:1] or \
            re.findall(r"^\[ RUN      \] (\S+)", output, re.MULTILINE)[-1:]
        return next((test for test in self.tests if [gtest_case(test)] == cases), self.tests[0])


def list_groups():
    """Every test of the copy, but the test of this table, which each fault would fail, and those that need what
    another test made: the package's, which want a repository too."""
    listed = subprocess.run(["ctest", "--test-dir", BUILD, "--show-only=json-v1"], check=True, capture_output=True,
                            stdin=subprocess.DEVNULL)
    groups = collections.defaultdict(list)
    for entry in json.loads(listed.stdout)["tests"]:
        properties = {p["name"]: p["value"] for p in entry.get("properties", [])}
        if unknown := properties.keys() - KNOWN_PROPERTIES:
            raise SystemExit(f"{entry['name']} has properties that are not known here: {' '.join(unknown)}")
        left_out = properties.get("DISABLED") or properties.keys() & FIXTURES
        if not left_out and str(TREE / "tools/mutate") not in entry["command"]:
            test = Test(entry["name"], entry["command"], properties.get("ENVIRONMENT", []),
                        properties["WORKING_DIRECTORY"], properties.get("RUN_SERIAL", False),
                        properties.get("PASS_REGULAR_EXPRESSION", []))
            groups[str((without_case(test), test[2:], gtest_case(test) is None and test.name))].append(test)
    return [Group(tests, 0) for tests in groups.values()]


def end_all(mark):
    """Ends every process that was started with the mark in its environment, and what those started."""
    found = True
    while found:
        found = False
        for folder in pathlib.Path("/proc").glob("[0-9]*"):
            with contextlib.suppress(OSError):  # it may end by itself
                if mark.encode() in (folder / "environ").read_bytes().split(b"\0"):
                    os.kill(int(folder.name), signal.SIGKILL)
                    found = True
        time.sleep(0.05 * found)


def run(groups, jobs, limit):
    """Runs groups in their order, several at a time, and yields the result of each; limit(group) is how many seconds it
    may take. When the caller wants no more, those that still run are ended."""
    mark = f"ORU_MUTATE_RUN={os.getpid()}.{time.monotonic_ns()}"
    waiting, running = collections.deque(groups), []
    try:
        while waiting or running:
            while waiting and len(running) < jobs and not (running and (waiting[0].serial or running[0][0].serial)):
                group, log = waiting.popleft(), tempfile.TemporaryFile()
                environment = os.environ | dict(e.split("=", 1) for e in [mark, *group.tests[0].environment])
                process = subprocess.Popen(group.command(), cwd=group.tests[0].folder, env=environment,
                                           stdin=subprocess.DEVNULL, stdout=log, stderr=subprocess.STDOUT)
                running.append((group, process, log, time.monotonic()))
            time.sleep(0.02)
            for entry in list(running):
                group, process, log, start = entry
                seconds = time.monotonic() - start
                if process.poll() is not None or seconds > limit(group):
                    running.remove(entry)
                    log.seek(0)
                    output = log.read().decode(errors="replace").replace("\r", "")
                    skipped = re.findall(r"^\[  SKIPPED \] (\S+)", output, re.MULTILINE)
                    passes = group.tests[0].passes
                    good = any(re.search(p, output) for p in passes) if passes else process.poll() == 0
                    yield Result(group, good and not skipped, skipped if good else [], output, seconds)
    finally:
        end_all(mark)


def measure_clean(jobs):
    """The groups that pass on the tree without a fault, with the time they took. Cases that fail or skip themselves in
    the company of others get a process of their own; those that skip even then tell nothing."""
    groups, passed = list_groups(), []
    for attempt in range(3):
        alone = []
        for group, good, skipped, output, seconds in run(groups, jobs, lambda group: 600):
            group.seconds = seconds
            if good or skipped:
                passed += group.part(lambda test: gtest_case(test) not in skipped)
                if len(group.tests) > 1:
                    alone += [one for test in skipped for one in group.part(lambda other: gtest_case(other) == test)]
            elif attempt < 2:
                alone += group.singles()
            else:
                raise SystemExit(f"{output}\n{group.tests[0].name} fails on the tree without a fault")
        groups = alone
    return passed


def clean_groups(state, jobs):
    """The groups as measured on this state of the tree, now or by an earlier run."""
    path = WORK / "clean.json"
    stored = json.loads(path.read_text()) if path.exists() else {}
    if stored.get("state") != state:
        print("==> Running the tests on the tree without a fault", flush=True)
        stored = {"state": state, "groups": [(group.tests, group.seconds) for group in measure_clean(jobs)]}
        path.write_text(json.dumps(stored))
    return [Group([Test(*test) for test in tests], seconds) for tests, seconds in stored["groups"]]


# Verdicts

def first_failure(groups, jobs):
    """The name of a test that fails, or None. It has to fail a second time, in a process of its own as CTest runs it:
    Wine sometimes does not start a program. When it passes, all tests of its group run alone."""
    waiting = list(groups)
    while waiting:
        done, failed = [], None
        with contextlib.closing(run(waiting, jobs, lambda group: max(4 * group.seconds, 20))) as results:
            for result in results:
                done.append(result.group)
                if not result.passed:
                    failed = result
                    break
        if failed is None:
            return None
        group = failed.group
        suspect = group.suspect(failed.output)
        again, = run(group.part(lambda test: test == suspect), 1, lambda group: max(8 * group.seconds, 40))
        if not again.passed:
            return suspect.name
        print(f"    flaky: {suspect.name} failed once", flush=True)
        waiting = [other for other in waiting if other not in done]
        waiting += group.singles() if len(group.tests) > 1 else []
    return None


def examine(row, groups, catches, jobs):
    """Builds and tests the copy with the fault in it: the verdict, and who caught it."""
    groups = [part for group in groups for part in group.part(lambda test: re.search(row.filter, test.name))]
    if not groups:
        return "broken", f"no test matches {row.filter}"
    groups.sort(key=lambda group: group.nearness(row, catches), reverse=True)
    # Who caught it last time comes first, then a few programs that are near; the rest may never have to be built.
    _, last = catches.get(row.name, ("", ""))
    first = [part for group in groups for part in group.part(lambda test: test.name == last) if group.program]
    first += [group for group in groups if group.program and not group.serial][:FIRST_PROGRAMS]
    rest = sorted((group for group in groups if group not in first), key=lambda group: group.serial)
    for stage, targets in (first, [os.path.relpath(group.program, BUILD) for group in first]), (rest, []):
        if failure := build(*targets):
            (WORK / "build.log").write_text(failure)
            # A check at compile time or a generator that stops is what a developer would see.
            if re.search(r"^FAILED: .*\.(obj|exe|dll)\b", failure, re.MULTILINE) and "static assertion" not in failure:
                return "broken", next((line for line in failure.splitlines() if "error" in line), "it does not link")
            return "caught", "the build"
        if failed := first_failure(stage, jobs):
            return "caught", failed
    return "survived", "-"


class Results:
    """The verdicts so far, in a file that grows by a line for each."""

    def __init__(self, state, restart):
        self.state, self.verdicts, self.catches = state, {}, {}
        lines = RESULTS.read_text(encoding="utf-8").splitlines() if RESULTS.exists() else []
        if restart:  # who caught what is still worth knowing
            lines = ["-" + line[line.index("\t"):] for line in lines]
            RESULTS.write_text("".join(line + "\n" for line in lines), encoding="utf-8")
        for line in lines:
            self.remember(*line.split("\t")[:5])

    def remember(self, key, name, file, verdict, by):
        self.verdicts[key] = verdict, by
        if verdict == "caught":
            self.catches[name] = file, by

    def key(self, row):
        return hashlib.sha256("\t".join([self.state, *row[2:5], row.filter]).encode()).hexdigest()[:16]

    def of(self, row):
        return self.verdicts.get(self.key(row), ("-", "-"))

    def add(self, row, verdict, by, seconds):
        cells = [self.key(row), row.name, row.file, verdict, by]
        self.remember(*cells)
        with RESULTS.open("a", encoding="utf-8") as file:
            file.write("\t".join([*cells, f"{seconds:.1f}"]) + "\n")


def measure(rows, results, jobs):
    """Prints a line for each row, whether its verdict is known already or found now."""
    prepare()
    groups = clean_groups(results.state, jobs)
    for number, row in enumerate(rows, 1):
        start = time.monotonic()
        if results.of(row)[0] == "-":
            copy = TREE / row.file
            original = copy.read_text(encoding="utf-8")
            copy.write_text(original.replace(row.text, row.replacement), encoding="utf-8")
            try:
                verdict, by = examine(row, groups, results.catches, jobs)
            finally:
                copy.write_text(original, encoding="utf-8")
            results.add(row, verdict, by, time.monotonic() - start)
        verdict, by = results.of(row)
        print(f"[{number:3}/{len(rows)}] {verdict:8} {row.name}: {by} ({time.monotonic() - start:.0f} s)", flush=True)


def summarise(rows, results):
    """Prints the rates and the survivors; whether they are good enough."""
    verdicts = collections.defaultdict(list)
    counts = collections.defaultdict(collections.Counter)
    for row in rows:
        verdict, by = results.of(row)
        verdicts[verdict].append((row, by))
        for area in (row.area, "all"):
            counts[area][verdict] += 1
    print()
    for row, by in verdicts["broken"]:
        print(f"broken row: {row.name} ({row.file}): {by}")
    for row, _ in verdicts["survived"]:
        print(f"survived: {row.name} ({row.file}): {row.effect}\n    {row.survives or 'NO REASON is given'}")
    for row, by in verdicts["caught"]:
        if row.survives:
            print(f"note: {row.name} is listed as a survivor, but {by} caught it")
    for area in sorted(counts, key=lambda area: (area == "all", area)):
        caught, total = counts[area]["caught"], counts[area]["caught"] + counts[area]["survived"]
        rate = 100 * caught / max(total, 1)
        print(f"{area}: {caught} of {total} caught, {rate:.1f} %")
    unexplained = [row for row, _ in verdicts["survived"] if not row.survives]
    return not unexplained and not verdicts["broken"] and (len(rows) < FEWEST_ROWS or rate >= LOWEST_RATE)


def main():
    parser = argparse.ArgumentParser(prog="mutate", add_help=False)
    for option in "--verify", "--list", "--restart":
        parser.add_argument(option, action="store_true")
    parser.add_argument("--jobs", type=int, default=os.cpu_count())
    parser.add_argument("names", nargs="*")
    options = parser.parse_args()

    rows, errors = read_table()
    errors += [f"there is no row named {name}" for name in sorted(set(options.names) - {row.name for row in rows})]
    if errors:
        raise SystemExit("\n".join(errors))
    if options.verify:
        return 0
    rows = [row for row in rows if not options.names or row.name in options.names]
    rows.sort(key=lambda row: not row.file.endswith(".cpp"))  # what builds most comes last
    WORK.mkdir(parents=True, exist_ok=True)
    results = Results(tree_state(), options.restart)
    if options.list:
        for row in rows:
            print(f"{row.area:14} {results.of(row)[0]:8} {row.name}: {row.effect}")
        return 0
    measure(rows, results, options.jobs)
    return 0 if summarise(rows, results) else 1


if __name__ == "__main__":
    sys.exit(main())
