#!/usr/bin/env python3
# The runner itself: any difference from what a case expects must make it fail.
import contextlib
import io
import sys

import run_cases

COMMAND = "$ printf 'a\\n\\n'; echo b >&2; exit 3\n"
GOOD = "= good\n" + COMMAND + "|a\n|\n!b\n? 3\n"
BAD = {
    "another output": GOOD.replace("|a", "|A"),
    "an output line too few": GOOD.replace("|\n", ""),
    "another error output": GOOD.replace("!b\n", ""),
    "another status": GOOD.replace("? 3", "? 2"),
    "no status": GOOD.replace("? 3\n", ""),
    "no line end": "= end\n$ printf a\n|a\n",
}


def failures(text, differing=frozenset()):
    with contextlib.redirect_stdout(io.StringIO()):
        return run_cases.check(run_cases.read_cases(text)[1], "/bin/sh", "1.0", differing)


def main():
    assert failures(GOOD) == 0
    for name, text in BAD.items():
        assert failures(text) == 1, name
    assert failures(BAD["another output"], {"good"}) == 0
    assert failures(GOOD, {"good"}) == 1
    for text in ("|text before a case\n", "= no command\n|a\n", GOOD + "stray\n"):
        try:
            run_cases.read_cases(text)
        except ValueError:
            continue
        assert False, text
    assert run_cases.write_cases(*run_cases.read_cases(GOOD)) == GOOD
    print(f"{len(BAD)} wrong expectations found")
    return 0


if __name__ == "__main__":
    sys.exit(main())
