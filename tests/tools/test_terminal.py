#!/usr/bin/env python3
# On a terminal long work says how far it is and can be interrupted; elsewhere nothing is said.
import argparse
import os
import pty
import signal
import subprocess
import sys
import time

LONG = ["table", "--format", "csv", "^".join(f"v{number}" for number in range(26))]
TIMEOUT_SECONDS = 60


def read_until(descriptor, wanted):
    seen = b""
    end = time.monotonic() + TIMEOUT_SECONDS
    while wanted not in seen and time.monotonic() < end:
        try:
            piece = os.read(descriptor, 4096)
        except OSError:  # the other side has gone
            break
        if not piece:
            break
        seen += piece
    return seen


def heed_interrupts():
    """A shell's background job starts with them ignored, and so the tool would leave it."""
    signal.signal(signal.SIGINT, signal.SIG_DFL)


def check_terminal(tool):
    terminal, side = pty.openpty()
    with subprocess.Popen([tool, *LONG], stdin=subprocess.DEVNULL, stdout=subprocess.DEVNULL,
                          stderr=side, preexec_fn=heed_interrupts) as process:
        os.close(side)
        seen = read_until(terminal, b"booleq: rows: ")
        assert b"67108864 rows, about " in seen, seen
        assert b"booleq: rows: " in seen, seen
        process.send_signal(signal.SIGINT)
        seen = read_until(terminal, b"interrupted")
        assert b"booleq: interrupted, the output is not complete" in seen, seen
        assert process.wait(TIMEOUT_SECONDS) == -signal.SIGINT
    os.close(terminal)


def check_wiped(tool):
    """What was shown is gone at the end."""
    terminal, side = pty.openpty()
    words = ["table", "--format", "csv", "^".join(f"v{number}" for number in range(22))]
    with subprocess.Popen([tool, *words], stdin=subprocess.DEVNULL, stdout=subprocess.PIPE,
                          stderr=side) as process:
        os.close(side)
        time.sleep(0.8)  # the pipe is full and the clock runs
        with process.stdout:
            while process.stdout.read(1 << 20):
                pass
        seen = read_until(terminal, b"never")
        assert process.wait(TIMEOUT_SECONDS) == 0
    assert b"rows: " in seen, seen
    assert seen.endswith(b" \r"), seen[-40:]
    os.close(terminal)


def check_silence(tool):
    words = ["table", "--format", "csv", "^".join(f"v{number}" for number in range(20))]
    done = subprocess.run([tool, *words], stdin=subprocess.DEVNULL, stdout=subprocess.DEVNULL,
                          stderr=subprocess.PIPE, timeout=TIMEOUT_SECONDS, check=True)
    assert done.stderr.count(b"\n") == 1 and b"\r" not in done.stderr, done.stderr


def main():
    parser = argparse.ArgumentParser()
    parser.add_argument("--tool", required=True)
    tool = os.path.abspath(parser.parse_args().tool)
    check_terminal(tool)
    check_wiped(tool)
    check_silence(tool)
    print("progress, interrupt, silence: as they should be")
    return 0


if __name__ == "__main__":
    sys.exit(main())
