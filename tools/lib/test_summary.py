# Sums up CTest's JUnit results and holds the skipped tests against the list of expected ones.
import collections
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


def read_results(path):
    """The names of the tests that passed, failed and were skipped, as CTest tells."""
    results = {"run": [], "fail": [], "skipped": []}
    for case in ElementTree.parse(path).iter("testcase"):
        results.get(case.get("status"), results["skipped"]).append(case.get("name"))
    return results["run"], results["fail"], results["skipped"]


def main(results_path, expected_path):
    expected = read_expected(expected_path)
    try:
        passed, failed, skipped = read_results(results_path)
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
    sys.exit(main(*sys.argv[1:]))
