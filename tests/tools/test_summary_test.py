"""A run is good only with every skip listed, no failure and at least one test."""
import contextlib
import io
import pathlib
import sys
import tempfile
import unittest

sys.path.insert(0, str(pathlib.Path(__file__).parents[2] / "tools/lib"))
import test_summary  # noqa: E402


class TestSummary(unittest.TestCase):
    def verdict(self, cases, skips):
        """What the summary says of a run: its exit code, None when it ends itself, and its output."""
        with tempfile.TemporaryDirectory() as folder, contextlib.redirect_stdout(io.StringIO()) as out:
            results, expected = pathlib.Path(folder, "results.xml"), pathlib.Path(folder, "skips.txt")
            rows = "".join(f'<testcase name="{n}" status="{s}"/>' for n, s in cases.items())
            results.write_text(f"<testsuite>{rows}</testsuite>")
            expected.write_text(skips)
            with contextlib.suppress(SystemExit):
                return test_summary.main(expected, results), out.getvalue()
            return None, out.getvalue()

    def test_verdicts(self):
        for cases, skips, verdict, text in (
                ({"A.a": "run", "A.b": "disabled"}, "# why\nA.b  # no device\n", 0, "A.b (no device)"),
                ({"A.a": "run", "A.b": "notrun"}, "", 1, "A.b (NOT EXPECTED"),
                ({"A.a": "run", "A.b": "fail"}, "A.b  # not a licence to fail\n", 1, "failed: A.b"),
                ({"A.b": "notrun"}, "A.b  # everything was skipped\n", None, ""),
                ({"A.a": "run"}, "A.a\n", None, "")):
            actual, output = self.verdict(cases, skips)
            self.assertEqual(actual, verdict)
            self.assertIn(text, output)

    def test_only_what_was_ended_from_outside_runs_again(self):
        passed = "[==========] Running\n[  PASSED  ] 1 test.\n"
        cases = {  # what it printed, how CTest says that it ended, whether that is no failure
            "Never.Began": ("", "***Failed", True), "Killed.After": (passed, "Subprocess killed", True),
            "Crashed.After": (passed, "***Exception: SegFault", False),
            "Killed.Before": ("[==========] Running", "Subprocess killed", False)}
        with tempfile.TemporaryDirectory() as folder:
            results, log = pathlib.Path(folder, "results.xml"), pathlib.Path(folder, "log")
            log.write_text("".join(f" 1/4 Test #{number}: {name} ....{end}***Exception:  0.1 sec\n"
                                   for number, (name, (_, end, _)) in enumerate(cases.items())))
            rows = "".join(f'<testcase name="{name}" status="fail"><system-out>{output}</system-out>'
                           '</testcase>' for name, (output, _, _) in cases.items())
            results.write_text(f"<testsuite>{rows}</testsuite>")
            self.assertEqual(list(test_summary.interrupted(results, log)),
                             [name for name, (_, _, again) in cases.items() if again])


if __name__ == "__main__":
    unittest.main()
