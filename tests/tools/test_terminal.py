#!/usr/bin/env python3
# On a terminal long work says how far it is and can be interrupted; elsewhere nothing is said.
import argparse
import os
import pty
import random
import signal
import subprocess
import sys
import tempfile
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


def check_search(tool):
    """A search that would take for ever says that it lives, and ends when it is told to."""
    numbers = random.Random(1)
    rows = [f"{row:011b} " + "".join(numbers.choice("01-") for _ in range(8)) for row in range(2048)]
    with tempfile.NamedTemporaryFile("w", suffix=".pla") as file:
        file.write(".i 11\n.o 8\n" + "\n".join(rows) + "\n.e\n")
        file.flush()
        terminal, side = pty.openpty()
        with subprocess.Popen([tool, "minimize", "--exact", file.name], stdin=subprocess.DEVNULL,
                              stdout=subprocess.DEVNULL, stderr=side,
                              preexec_fn=heed_interrupts) as process:
            os.close(side)
            seen = read_until(terminal, b"booleq: minimising, steps: ")
            assert b"booleq: minimising, steps: " in seen, seen
            start = time.monotonic()
            process.send_signal(signal.SIGINT)
            assert process.wait(TIMEOUT_SECONDS) == -signal.SIGINT
            seconds = time.monotonic() - start
        assert b"interrupted" in read_until(terminal, b"interrupted")
        os.close(terminal)
    print(f"a search ends {seconds:.3f} s after an interrupt")


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
    check_search(tool)
    check_wiped(tool)
    check_silence(tool)
    print("progress, interrupt, silence: as they should be")
    return 0


if __name__ == "__main__":
    sys.exit(main())
