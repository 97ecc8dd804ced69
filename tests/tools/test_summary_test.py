"""A run is good only with every skip listed, no failure and at least one test."""
import contextlib
import importlib.util
import io
import pathlib
import tempfile
import unittest

SCRIPT = pathlib.Path(__file__).parents[2] / "tools/lib/test_summary.py"
spec = importlib.util.spec_from_file_location("test_summary", SCRIPT)
test_summary = importlib.util.module_from_spec(spec)
spec.loader.exec_module(test_summary)


class TestSummary(unittest.TestCase):
    def verdict(self, cases, skips):
        """What the summary says of a run: its exit code, None when it ends itself, and its output."""
        with tempfile.TemporaryDirectory() as folder, contextlib.redirect_stdout(io.StringIO()) as out:
            results, expected = pathlib.Path(folder, "results.xml"), pathlib.Path(folder, "skips.txt")
            rows = "".join(f'<testcase name="{n}" status="{s}"/>' for n, s in cases.items())
            results.write_text(f"<testsuite>{rows}</testsuite>")
            expected.write_text(skips)
            try:
                return test_summary.main(expected, results), out.getvalue()
            except SystemExit:
                return None, out.getvalue()

    def test_verdicts(self):
        for cases, skips, verdict, text in (
                ({"A.a": "run", "A.b": "notrun", "A.c": "disabled"},
                 "# why\nA.b  # no such device\nA.c  # too slow here\n", 0, "skipped: A.b (no such device)"),
                ({"A.a": "run", "A.b": "notrun"}, "", 1, "A.b (NOT EXPECTED"),
                ({"A.a": "run"}, "A.a  # outdated\n", 0, "note: A.a"),
                ({"A.a": "run", "A.b": "fail"}, "A.b  # not a licence to fail\n", 1, "failed: A.b"),
                ({}, "", None, ""),
                ({"A.b": "notrun"}, "A.b  # everything was skipped\n", None, ""),
                ({"A.a": "run"}, "A.a\n", None, "")):
            actual, output = self.verdict(cases, skips)
            self.assertEqual(actual, verdict)
            self.assertIn(text, output)

    def test_only_a_program_that_never_began_runs_again(self):
        with tempfile.TemporaryDirectory() as folder:
            first, second = pathlib.Path(folder, "1.xml"), pathlib.Path(folder, "2.xml")
            expected = pathlib.Path(folder, "skips.txt")
            expected.write_text("")
            first.write_text('<testsuite><testcase name="A.a" status="fail"><system-out/></testcase>'
                             '<testcase name="A.b" status="fail"><system-out>crash</system-out>'
                             '</testcase><testcase name="A.c" status="run"/></testsuite>')
            self.assertEqual(test_summary.unbegun(first), ["A.a"])
            for again, failed in ("run", ["A.b"]), ("fail", ["A.a", "A.b"]):
                second.write_text(f'<testsuite><testcase name="A.a" status="{again}"/></testsuite>')
                self.assertEqual(test_summary.read_results([first, second])[1], failed)


if __name__ == "__main__":
    unittest.main()
