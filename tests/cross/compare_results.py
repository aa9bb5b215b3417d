#!/usr/bin/env python3
# Runs one program built for two machines with the same arguments, and compares what both print,
# byte for byte.
# usage: compare_results.py NATIVE EMULATED -- ARGUMENT...   EMULATED runs the other through its
# emulator
import subprocess
import sys

TIMEOUT_SECONDS = 600


def output_of(program, arguments):
    done = subprocess.run([program, *arguments], stdin=subprocess.DEVNULL, capture_output=True,
                          timeout=TIMEOUT_SECONDS, check=False)
    if done.returncode != 0 or not done.stdout:
        sys.exit(f"{program} ended with {done.returncode} after {len(done.stdout)} bytes:\n"
                 + done.stderr.decode("latin-1"))
    return done.stdout


def main():
    if len(sys.argv) < 4 or sys.argv[3] != "--":
        sys.exit("usage: compare_results.py NATIVE EMULATED -- ARGUMENT...")
    native, emulated = (output_of(program, sys.argv[4:]) for program in sys.argv[1:3])
    if native == emulated:
        print(f"{len(native)} bytes are equal")
        return
    pairs = zip(native.split(b"\n"), emulated.split(b"\n"))
    for number, (wanted, got) in enumerate(pairs, 1):
        if wanted != got:
            sys.exit(f"line {number} differs:\n  here:  {wanted!r}\n  there: {got!r}")
    sys.exit(f"lengths differ: {len(native)} bytes here, {len(emulated)} there")


main()
