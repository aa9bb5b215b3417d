#!/usr/bin/env python3
"""Runs fuzzers one after another and prints a table of what they did.

usage: run_fuzz.py SECONDS BUILD SOURCE NAME...       run each for so many seconds
       run_fuzz.py NUMBERx BUILD SOURCE NAME...       run each for so many executions: 1000000x, 1e8x
       run_fuzz.py --keep BUILD SOURCE NAME...        choose the inputs that SOURCE/corpus keeps

Each fuzzer runs in two processes, which share what they find. BUILD is the folder of the
executables fuzz_NAME and replay_NAME, SOURCE that of the targets. Inputs found are kept in
BUILD/found/NAME, so that the next run continues from there. An input that breaks something is
reported and kept in BUILD/findings. --keep chooses, from the inputs kept and found, the fewest that
reach all the code that all of them reach. Exit status: 1 if something was found, or if a fuzzer
could not run.
"""
import os
import pathlib
import re
import shutil
import subprocess
import sys
import time

WORKERS = 2
SECONDS_PER_INPUT = 10  # a hang is a finding
MEGABYTES = 3072  # enough for the pool of names, which keeps every name that it has seen
MAX_LENGTH = {"text": 240, "init_value": 320, "script": 400, "column": 240, "lean": 80, "pla": 400,
              "netlist_blif": 2000, "netlist_edif": 3000, "netlist_json": 3000}
DICTIONARY = {"text": "text", "lean": "text"}

PROGRESS = re.compile(r"^#(\d+): cov: ", re.MULTILINE)  # the number of executions so far
COVERED = re.compile(r"^#\d+\s+INITED cov: (\d+) ", re.MULTILINE)
COUNTERS = re.compile(r"\((\d+) inline 8-bit counters\)")


class Target:
    def __init__(self, name, build, source):
        self.name = name
        self.build, self.source = build, source
        self.fuzzer = build / f"fuzz_{name}"
        self.kept = source / "corpus" / name
        self.found = build / "found" / name
        self.findings = build / "findings" / name
        for folder in (self.found, self.findings):
            folder.mkdir(parents=True, exist_ok=True)

    def command(self, *options):
        command = ["nice", "-n", "10", self.fuzzer, f"-timeout={SECONDS_PER_INPUT}",
                   f"-rss_limit_mb={MEGABYTES}", f"-max_len={MAX_LENGTH[self.name]}", *options]
        if self.name in DICTIONARY:
            command.append(f"-dict={self.source / DICTIONARY[self.name]}.dict")
        return command


def count_files(folder):
    return sum(1 for path in folder.iterdir() if path.is_file())


def describe(target, path):
    told = subprocess.run([target.build / f"replay_{target.name}", "--describe", path],
                          capture_output=True, text=True, errors="replace", check=False)
    return told.stdout.rsplit("\n", 2)[0]


def read_limit(text):
    """The option that ends a run after so many seconds or executions: '60', '1e8x'."""
    found = re.fullmatch(r"(\d+(?:e\d+)?)(x?)", text)
    if not found:
        sys.exit(f"run_fuzz.py: '{text}' is neither seconds (60) nor executions (1000000x, 1e8x)")
    number = int(float(found[1]))
    return f"-runs={number}" if found[2] else f"-max_total_time={number}"


def run(target, limit):
    """Runs one fuzzer; returns its row of the table and what it found."""
    before = count_files(target.found)
    log_path = target.build / f"fuzz_{target.name}.log"
    former = set(target.findings.iterdir())
    start = time.monotonic()
    with log_path.open("wb") as log:
        command = target.command(
            f"-fork={WORKERS}", limit, "-ignore_timeouts=0",
            "-ignore_ooms=0", f"-artifact_prefix={target.findings}/", target.found, target.kept)
        status = subprocess.run(command, stdout=log, stderr=subprocess.STDOUT, cwd=target.build,
                                check=False).returncode
    taken = time.monotonic() - start

    text = log_path.read_text(errors="replace")
    progress = PROGRESS.findall(text)
    runs = int(progress[-1]) if progress else 0
    findings = sorted(set(target.findings.iterdir()) - former)
    is_bad = bool(findings) or status != 0 or runs == 0
    for path in findings:
        print(f"\n{target.name}: {describe(target, path)}", flush=True)
    if is_bad:
        print(f"\n{target.name}: status {status}; the end of {log_path}:")
        print("\n".join(text.splitlines()[-40:]), flush=True)
    row = [target.name, f"{runs}", f"{taken:.0f}", f"{runs / taken:.0f}", covered(target),
           f"{count_files(target.found) - before}", f"{len(findings)}"]
    return row, is_bad


def covered(target):
    """The edges that all inputs reach together; the count of the fork mode counts some twice."""
    done = subprocess.run(target.command("-runs=0", target.found, target.kept),
                          stdout=subprocess.PIPE, stderr=subprocess.STDOUT, text=True,
                          errors="replace", cwd=target.build, check=False)
    edges = COVERED.findall(done.stdout)
    total = sum(int(found) for found in COUNTERS.findall(done.stdout))
    return f"{edges[-1]} of {total}" if edges else "unknown"


def print_table(rows):
    head = ["target", "executions", "seconds", "per second", "edges of the library",
            "new inputs", "findings"]
    print("\n| " + " | ".join(head) + " |")
    print("|---" + "|---:" * (len(head) - 1) + "|")
    for row in rows:
        print("| " + " | ".join(row) + " |")


def keep(target):
    chosen = target.build / "chosen" / target.name
    shutil.rmtree(chosen, ignore_errors=True)
    chosen.mkdir(parents=True)
    done = subprocess.run(
        target.command("-set_cover_merge=1", "-use_counters=0", chosen, target.kept, target.found),
        stdout=subprocess.PIPE, stderr=subprocess.STDOUT, cwd=target.build, check=False)
    if done.returncode != 0:
        sys.exit(done.stdout.decode(errors="replace"))
    shutil.rmtree(target.kept)
    target.kept.mkdir()
    for path in sorted(chosen.iterdir()):
        shutil.copy(path, target.kept / path.name[:12])
    print(f"{target.name}: {count_files(target.kept)} inputs kept")


def main():
    if len(sys.argv) < 5:
        sys.exit(__doc__)
    build, source = (pathlib.Path(path).resolve() for path in sys.argv[2:4])
    targets = [Target(name, build, source) for name in sys.argv[4:]]
    for target in targets:
        if not os.access(target.fuzzer, os.X_OK):
            sys.exit(f"run_fuzz.py: there is no {target.fuzzer}")
    if sys.argv[1] == "--keep":
        for target in targets:
            keep(target)
        return 0
    rows, is_bad = [], False
    limit = read_limit(sys.argv[1])
    for target in targets:
        print(f"fuzzing {target.name}, {limit[1:]}", file=sys.stderr, flush=True)
        row, found = run(target, limit)
        rows.append(row)
        is_bad = is_bad or found
    print_table(rows)
    return 1 if is_bad else 0


if __name__ == "__main__":
    sys.exit(main())
