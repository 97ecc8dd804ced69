# Sums up CTest's JUnit results and holds the skipped tests against the list of expected ones.
#
#     test_summary.py EXPECTED RESULTS...   sums up; a test in several results counts as in the last
#     test_summary.py --interrupted RESULTS LOG   prints a pattern of the failed tests that did not fail:
#                                                 their program never began, or was killed after its work
import argparse
import collections
import pathlib
import re
import sys
import xml.etree.ElementTree as ElementTree


def read_expected(path):
    """Lines 'Suite.Name  # reason' as a dict of name to reason; a name without a reason is an error."""
    expected = {}
    with open(path, encoding="utf-8") as lines:
        for line in lines:
            name, _, reason = (part.strip() for part in line.partition("#"))
            if name and not reason:
                raise SystemExit(f"{path}: {name} is listed without a reason")
            if name:
                expected[name] = reason
    return expected


def read_results(paths):
    """The names of the tests that passed, failed and were skipped, as CTest tells."""
    last = {}
    for path in paths:
        statuses = collections.defaultdict(list)
        for case in ElementTree.parse(path).iter("testcase"):
            statuses[case.get("name")].append(case.get("status"))
        last.update(statuses)
    results = {"run": [], "fail": [], "skipped": []}
    for name, statuses in last.items():
        for status in statuses:
            results.get(status, results["skipped"]).append(name)
    return results["run"], results["fail"], results["skipped"]


def interrupted(results, log):
    """The failed tests whose program printed nothing (GoogleTest's first line comes before any test), or
    was killed from outside, as CTest's log tells, when GoogleTest had said that all had passed."""
    text = pathlib.Path(log).read_text(encoding="utf-8", errors="replace")
    killed = set(re.findall(r"Test +#\d+: (\S+) [ .]*Subprocess (?:killed|terminated)", text))
    for case in ElementTree.parse(results).iter("testcase"):
        if case.get("status") == "fail":
            output = (case.findtext("system-out") or "").strip()
            passed = re.search(r"^\[  PASSED  \] \d+ tests?\.$", output, re.MULTILINE)
            if not output or (passed and case.get("name") in killed):
                yield case.get("name")


def main(expected_path, *results_paths):
    expected = read_expected(expected_path)
    try:
        passed, failed, skipped = read_results(results_paths)
    except FileNotFoundError:
        raise SystemExit("No test ran.")
    names = collections.Counter(passed + failed + skipped)
    ambiguous = [name for name, count in names.items() if count > 1]
    unexpected = [name for name in skipped if name not in expected]
    for name in skipped:
        print(f"skipped: {name} ({expected.get(name, 'NOT EXPECTED: list it with its reason')})")
    for name in sorted(set(expected) & set(passed)):
        print(f"note: {name} is listed as an expected skip, but it ran")
    for name in ambiguous:
        print(f"ambiguous: {names[name]} tests are named {name}")
    for name in failed:
        print(f"failed: {name}")
    if unexpected:
        print(f"{len(unexpected)} skipped unexpectedly")
    print(f"Tests: {len(passed)} passed, {len(failed)} failed, {len(skipped)} skipped")
    if not passed and not failed:
        raise SystemExit("No test ran.")
    return 1 if failed or unexpected or ambiguous else 0


if __name__ == "__main__":
    parser = argparse.ArgumentParser(description="Sums up the results of CTest.")
    parser.add_argument("--interrupted", action="store_true")
    parser.add_argument("files", nargs="+", metavar="FILE")
    arguments = parser.parse_args()
    if arguments.interrupted:
        print("|".join(re.escape(name) for name in interrupted(*arguments.files)))
    else:
        sys.exit(main(*arguments.files))
