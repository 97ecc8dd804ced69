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
    def verdict(self, cases, skips=""):
        with tempfile.TemporaryDirectory() as folder:
            results, expected = pathlib.Path(folder, "results.xml"), pathlib.Path(folder, "skips.txt")
            rows = "".join(f'<testcase name="{n}" status="{s}"/>' for n, s in cases.items())
            results.write_text(f"<testsuite>{rows}</testsuite>")
            expected.write_text(skips)
            self.out = io.StringIO()
            with contextlib.redirect_stdout(self.out):
                return test_summary.main(expected, results)

    def test_listed_skips_pass_and_others_fail(self):
        cases = {"A.a": "run", "A.b": "notrun", "A.c": "disabled"}
        listed = "# why\nA.b  # no such device\nA.c  # too slow here\n"
        self.assertEqual(self.verdict(cases, listed), 0)
        self.assertEqual(self.verdict(cases, "A.b  # no such device\n"), 1)
        self.assertIn("A.c (NOT EXPECTED", self.out.getvalue())

    def test_a_listed_test_that_ran_is_a_note(self):
        self.assertEqual(self.verdict({"A.a": "run"}, "A.a  # outdated\n"), 0)
        self.assertIn("note: A.a", self.out.getvalue())

    def test_failures_and_empty_runs_fail(self):
        self.assertEqual(self.verdict({"A.a": "run", "A.b": "fail"}, "A.b  # not a licence to fail\n"), 1)
        with self.assertRaises(SystemExit):
            self.verdict({})
        with self.assertRaises(SystemExit):
            self.verdict({"A.b": "notrun"}, "A.b  # everything was skipped\n")

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

    def test_a_reason_is_demanded(self):
        with self.assertRaises(SystemExit):
            self.verdict({"A.a": "run"}, "A.a\n")


if __name__ == "__main__":
    unittest.main()
