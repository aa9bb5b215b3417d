#!/usr/bin/env python3
# On a terminal, long work shows its progress and can be interrupted; elsewhere it shows nothing.
import argparse
import os
import pty
import random
import select
import signal
import subprocess
import sys
import tempfile
import time

from test_proofs import pigeons

LONG = ["table", "--format", "csv", "^".join(f"v{number}" for number in range(26))]
TIMEOUT_SECONDS = 60


def read_until(descriptor, wanted):
    seen = b""
    end = time.monotonic() + TIMEOUT_SECONDS
    while wanted not in seen and time.monotonic() < end:
        if not select.select([descriptor], [], [], 1)[0]:
            continue
        try:
            piece = os.read(descriptor, 4096)
        except OSError:  # the other side is closed
            break
        if not piece:
            break
        seen += piece
    return seen


def heed_interrupts():
    """A shell's background job starts with them ignored, and the tool would leave them so."""
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
    """An endless search shows progress, and ends when it is interrupted."""
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
    """The progress line is erased at the end."""
    terminal, side = pty.openpty()
    words = ["table", "--format", "csv", "^".join(f"v{number}" for number in range(22))]
    with subprocess.Popen([tool, *words], stdin=subprocess.DEVNULL, stdout=subprocess.PIPE,
                          stderr=side) as process:
        os.close(side)
        time.sleep(0.8)  # the pipe is full while time passes
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


def searches(folder):
    """Command lines that would take far too long."""
    hard = pigeons(14)
    inputs = ["--inputs", ",".join(f"i{k}" for k in range(16))]
    # Here both groups are never 1, and that is what has to be decided.
    grouped = f"({hard}) | ({hard.replace('p', 'q')}) & ({hard.replace('p', 'r')})"
    rng = random.Random(1)
    lines = os.path.join(folder, "lines")
    with open(lines, "w", encoding="ascii") as file:
        for _ in range(400):
            file.write(f"0x{rng.getrandbits(1 << 16):0{1 << 14}x}\n")
    over_lines = [["match", *inputs, "--file", lines, "0x1" + "0" * ((1 << 14) - 1)],
                  ["explain", *inputs, "--file", lines]]
    return [["equal", hard, "0"], ["sat", hard], ["lint", "--seconds", "1000", grouped]], over_lines


def started(tool, words, side):
    return subprocess.Popen([tool, *words], stdin=subprocess.DEVNULL, stdout=subprocess.DEVNULL,
                            stderr=side, preexec_fn=heed_interrupts)


def check_searches(tool, has_solver):
    """Progress, and an interrupt that ends the search at once."""
    longest = 0
    with tempfile.TemporaryDirectory() as folder:
        by_solver, over_lines = searches(folder)
        if not has_solver: # without a solver it gives up at once
            by_solver = []
        for words in by_solver + over_lines:
            terminal, side = pty.openpty()
            with started(tool, words, side) as process:
                os.close(side)
                wanted = b"booleq: reading: " if words in over_lines else b"booleq: working, seconds: 1"
                seen = read_until(terminal, wanted)
                assert wanted in seen, (words[0], seen[-200:])
                start = time.monotonic()
                process.send_signal(signal.SIGINT)
                assert process.wait(TIMEOUT_SECONDS) == -signal.SIGINT, words[0]
                longest = max(longest, time.monotonic() - start)
                seen = read_until(terminal, b"not complete")
                assert b"booleq: interrupted, the output is not complete" in seen, words[0]
            os.close(terminal)
        # Without a terminal nothing is shown, and the end is the same.
        for words in by_solver:
            with started(tool, words, subprocess.PIPE) as process:
                time.sleep(1.2)
                process.send_signal(signal.SIGINT)
                said = process.stderr.read()
                assert process.wait(TIMEOUT_SECONDS) == -signal.SIGINT, words[0]
            assert said == b"\nbooleq: interrupted, the output is not complete\n", said
    # A tenth of a second is promised, and a thousandth is measured; the limit allows for a busy
    # machine.
    assert longest < 1, longest
    return longest


def main():
    parser = argparse.ArgumentParser()
    parser.add_argument("--tool", required=True)
    parser.add_argument("--without-solver", action="store_true")
    options = parser.parse_args()
    tool = os.path.abspath(options.tool)
    check_terminal(tool)
    check_search(tool)
    check_wiped(tool)
    check_silence(tool)
    print(f"progress, interrupt, silence: as they should be; a search ended after "
          f"{check_searches(tool, not options.without_solver):.3f} s")
    return 0


if __name__ == "__main__":
    sys.exit(main())
