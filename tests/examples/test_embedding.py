#!/usr/bin/env python3
"""The example embedding: its whole log for the rules next to it, traces whole and cut, bad input.

usage: test_embedding.py PROGRAM EXAMPLE
"""
import os
import pathlib
import subprocess
import sys
import tempfile
import unittest

PROGRAM = EXAMPLE = None

LOG = """\
info    press.rules:2: guard holds; it changes with each of door_closed, emergency
trace   DEBUG:../s/Kq_BoolEquationImpNode.cpp:446 Eval TOP.L type=ID token=door_closed value=1
trace   DEBUG:../s/Kq_BoolEquationImpNode.cpp:446 Eval TOP.RL type=ID token=emergency value=0
trace   DEBUG:../s/Kq_BoolEquationImpNode.cpp:446 Eval TOP.R type=NOT token=~ value=1
trace   DEBUG:../s/Kq_BoolEquationImpNode.cpp:446 Eval TOP. type=AND token=& value=1
"""
REST = """\
warning press.rules:3: no value for right_button; taken as 0
alarm   press.rules:3: hands does NOT hold; it changes with each of right_button
warning press.rules:4: no value for 'oil.hot'; taken as 0
info    press.rules:4: oil holds; it changes with each of 'oil.pressure', 'oil.hot'
warning press.rules:5: no value for guard_a, guard_b; taken as 0
alarm   press.rules:5: either does NOT hold; it changes with each of guard_a, guard_b
error   press.rules:6: column 23: operator '&' has nothing on its right
          door_closed && ~emergency
                      ^
library   LEFT:
library   NODE: TOP.L parent=TOP. type=AND token=& val=0
library   LEFT:
library     NODE: TOP.LL parent=TOP.L type=ID token=door_closed val=0
error   press.rules:7: column 28: '[' is not part of the syntax; a name with other characters than \
letters, digits and '_' is written between single quotes
          door_closed & oil[0]
                           ^
error   press.rules:8: column 11: '(' has no partner
          (left_button | right_button
          ^
"""
SIGNALS = ["door_closed=1", "emergency=0", "left_button=1", "'oil.pressure'=1", "maintenance=0",
           "ready=1"]


def run(*arguments, directory=None, **variables):
    environment = {**os.environ, **variables}
    done = subprocess.run([PROGRAM, *arguments], stdout=subprocess.PIPE, stderr=subprocess.PIPE,
                          text=True, timeout=60, check=False, cwd=directory or EXAMPLE,
                          env=environment)
    return done.returncode, done.stdout, done.stderr


class Embedding(unittest.TestCase):
    maxDiff = None

    def with_rules(self, text, *arguments, **variables):
        with tempfile.TemporaryDirectory() as directory:
            pathlib.Path(directory, "r").write_text(text, encoding="utf-8")
            return run("r", *arguments, directory=directory, **variables)

    def test_whole_log(self):
        status, output, errors = run("press.rules", *SIGNALS)
        self.assertEqual(output, LOG.splitlines(True)[0] + REST)
        self.assertEqual((status, errors), (2, ""))

    def test_trace_of_one_rule(self):
        status, output, errors = run("press.rules", *SIGNALS, "--trace", "guard")
        self.assertEqual((status, errors), (2, ""))
        self.assertTrue(output.startswith(LOG), output)
        self.assertTrue(output.endswith(REST), output)
        self.assertEqual(output.count("DEBUG:"), 4)

    def test_trace_cut_by_a_sink_that_throws(self):
        status, output, errors = run("press.rules", *SIGNALS, "--trace", "guard", "--trace-lines",
                                     "3")
        self.assertEqual((status, errors), (2, ""))
        self.assertEqual(output, "".join(LOG.splitlines(True)[:4]) +
                         "warning press.rules:2: trace cut: more than 3 lines\n" + REST)

    def test_trace_of_a_rule_that_is_not_there(self):
        self.assertEqual(self.with_rules("a = x\n", "x=1", "--trace", "b"),
                         (0, "info    r:1: a holds; it changes with each of x\n"
                             "warning r: no rule b was there to be traced\n", ""))

    def test_verdicts(self):
        self.assertEqual(self.with_rules("a = x & y\n", "x=1", "y=1"),
                         (0, "info    r:1: a holds; it changes with each of x, y\n", ""))
        self.assertEqual(self.with_rules("a = x ^ x\n", "x=1"),
                         (1, "alarm   r:1: a does NOT hold, whatever single signal changes\n", ""))

    def test_values_of_one_rule_are_not_those_of_the_next(self):
        self.assertEqual(self.with_rules("a = x | y\nb = ~y & x\n", "x=1", "y=0"),
                         (0, "info    r:1: a holds; it changes with each of x\n"
                             "info    r:2: b holds; it changes with each of y, x\n", ""))

    def test_many_diagnostics(self):
        status, output, errors = self.with_rules("a = " + "x & (" * 40 + "y" + ")" * 40 + " && z\n")
        self.assertEqual((status, errors), (2, ""))
        self.assertEqual(output.count("library"), 21, output)
        self.assertRegex(output, r"library   lines not shown: \d+\n")

    def test_refusal_with_the_debug_mode_on_from_outside(self):
        status, output, errors = self.with_rules("a = x &\n", MAV_KQ_BOOL_EQUATION_DEBUG="1")
        self.assertEqual((status, errors), (2, ""))
        self.assertIn("operator '&' has nothing on its right", output)

    def test_bad_usage(self):
        for arguments in ([], ["r", "x"], ["r", "x=2"], ["r", "--trace-lines", "x"]):
            status, output, errors = run(*arguments)
            self.assertEqual((status, output), (2, ""), arguments)
            self.assertTrue(errors.startswith("usage: "), errors)
        self.assertEqual(run("missing")[:2], (2, "error   missing: cannot be read\n"))
        self.assertEqual(self.with_rules("a\n"),
                         (2, "error   r:1: there is no '='; write NAME = EQUATION\n", ""))


if __name__ == "__main__":
    EXAMPLE = sys.argv.pop()
    PROGRAM = str(pathlib.Path(sys.argv.pop()).resolve())
    unittest.main()
