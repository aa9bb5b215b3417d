#!/usr/bin/env python3
"""Runs benchmark executables and turns their results into tables.

usage: bench_table.py BUILD [NAME...] [--pairs] [--doc] [--benchmark_OPTION...]

Runs BUILD/bench/bench_NAME, or all of them without NAME, keeps the results in BUILD/results, and
prints the library's times against its baselines, then how each step grows, and how much two threads
get done; with --pairs also every formula by itself.
With --doc the tables, with a description of the machine, replace what docs/benchmarks.md has
between its two 'figures' marks.
Times are processor time: the median of all repetitions, with the shortest in brackets. Of several
formulas in one line, the one with the worst ratio is shown.
Exit status: 1 if a case gave a wrong answer or could not be measured.
"""
import argparse
import collections
import json
import pathlib
import re
import statistics
import subprocess
import sys

BEGIN = "<!-- figures: begin -->"
END = "<!-- figures: end -->"
NANOSECONDS = {"ns": 1, "us": 1e3, "ms": 1e6, "s": 1e9}

# Promises. 'pair': ours against the baseline, for all cases whose name starts with the prefix.
# 'item': time per item. 'growth': time per item at the second size against the first. 'peak': bytes
# of memory for each byte of text.
Target = collections.namedtuple("Target", "work kind prefix limit")
TARGETS = (
    *(Target(f"column, {size} variables, {2 * size} operators, {kind}", "pair",
             f"column/n={size}/{kind}/", 5.0 if size == 16 else 1.5)
      for size in (16, 20, 24, 28) for kind in ("order", "chain", "tree")),
    *(Target(f"hexadecimal text, {size} variables, {2 * size} operators", "pair",
             f"hex_text/n={size}/", limit) for size, limit in ((20, 2.0), (24, 1.4), (30, 1.4))),
    Target("peak memory of that text", "peak", "hex_text_peak/n=30/", 3.0),
    Target("hexadecimal text, 6 variables, 20 operators", "pair", "hex_text/n=6/", 3.0),
    Target("engine rows, 10 variables", "pair", "engine_rows/n=10/", 1.2),
    Target("engine rows, 16 variables", "pair", "engine_rows/n=16/", 1.2),
    Target("public rows, 16 variables", "pair", "public_rows/n=16/", 1.5),
    Target("6 variables set, 20 operators evaluated", "pair", "eval/set_6_and_20_operators/", 5.0),
    Target("200 operators over 30 variables evaluated", "pair", "eval/200_operators/", 8.0),
    Target("12 tokens set", "pair", "set/12_tokens/", 2.0),
    Target("100 tokens set", "pair", "set/100_tokens/", 1.7),
    Target("init value, 6 variables, set and rendered", "pair", "read/round_trip/", 12.0),
    Target("the same, set and evaluated 64 times", "pair", "read/evaluated/", 2.0),
    Target("init value, 16 variables, a digit", "item", "read_back/n=16/", 1.0),
    Target("init value, 24 variables, a digit", "item", "read_back/n=24/", 1.0),
    Target("peak memory of that text", "peak", "read_peak/n=24/", 4.0),
    Target("init value, 30 variables, set, evaluated, rendered", "item", "read_longest/", 2e9),
    Target("peak memory of that text", "peak", "read_peak/n=30/", 5.0),
    Target("10^6 tokens against 10^4: chain", "growth", "set_long/chain/", 2.5),
    Target("10^6 tokens against 10^4: nesting to the right", "growth", "set_long/nesting/", 2.5),
    Target("10^6 tokens against 10^4: nesting to the left", "growth",
           "set_long/nesting_left/", 2.5),
    Target("10^6 tokens against 10^4: up to 10^5 names", "growth", "set_long/names/", 2.5),
    Target("column of a 16-variable init value, a node", "item",
           "column_of_terms/init_value/n=16/", 150.0),
    Target("column of the same as expression, a node", "item",
           "column_of_terms/expression/n=16/", 150.0),
)
GROWTH_SIZES = ("10000", "1000000")

# The least ratio of the work of two threads to that of one, in the same wall-clock time, on two
# cores.
ThreadTarget = collections.namedtuple("ThreadTarget", "work name limit")
THREAD_TARGETS = (
    ThreadTarget("12 tokens set, 1,000 known names", "threads/set_known_names", 1.85),
    ThreadTarget("12 tokens set, ever new names", "threads/set_new_names", 1.85),
    ThreadTarget("6 variables set, 20 operators evaluated", "threads/eval", 1.85),
    ThreadTarget("hexadecimal text, 6 inputs, 20 operators", "threads/hex_text_6_inputs", 1.85),
    ThreadTarget("column, 16 inputs, 32 operators", "threads/column_16_inputs", 1.85),
)


class Case:
    """All repetitions of one side of one case."""

    def __init__(self):
        self.times = []  # nanoseconds
        self.items = 1.0
        self.unit = "call"
        self.peaks = []
        self.threads = []  # (nanoseconds of one thread, of two, ratio of work)
        self.error = None

    def add(self, entry):
        if entry.get("error_occurred"):
            self.error = entry.get("error_message", "failed")
            return
        self.times.append(entry["cpu_time"] * NANOSECONDS[entry["time_unit"]])
        self.items = entry.get("items", self.items)
        if "peak" in entry:
            self.peaks.append(entry["peak"])
        if "two_threads" in entry:
            self.threads.append((entry["one_thread"], entry["two_threads"], entry["ratio"]))
        for key in entry:
            if key.startswith("per_") and key != "per_family_instance_index":
                self.unit = key[len("per_"):]

    def median(self):
        return statistics.median(self.times)

    def per_item(self):
        return self.median() / self.items


def read_results(paths):
    cases, contexts = {}, []
    for path in paths:
        text = pathlib.Path(path).read_text()
        if not text:
            continue  # the filter matches no case of this executable
        results = json.loads(text)
        contexts.append(results["context"])
        for entry in results["benchmarks"]:
            if entry.get("run_type") == "iteration":
                cases.setdefault(entry["run_name"], Case()).add(entry)
    return cases, contexts


def format_time(nanoseconds):
    for unit, factor in (("s", 1e9), ("ms", 1e6), ("us", 1e3), ("ns", 1.0)):
        if nanoseconds >= factor:
            return f"{nanoseconds / factor:.3g} {unit}"
    return f"{nanoseconds:.2g} ns"


def format_case(case):
    return f"{format_time(case.median())} ({format_time(min(case.times))})"


def judge(worst, target):
    return "yes" if worst <= target.limit else "no"


def find_pairs(cases, prefix):
    """The ratio, name and both sides of every pair whose name starts with the prefix."""
    pairs = []
    for name, ours in cases.items():
        stem = name[:-len("/ours")]
        baseline = cases.get(stem + "/baseline")
        if name.startswith(prefix) and name.endswith("/ours") and baseline:
            if ours.times and baseline.times:
                pairs.append((ours.median() / baseline.median(), stem, ours, baseline))
    return pairs


def pair_row(target, cases):
    ratios = find_pairs(cases, target.prefix)
    if not ratios:
        return None
    worst, _, ours, baseline = max(ratios, key=lambda entry: entry[0])
    median = statistics.median(entry[0] for entry in ratios)
    return [format_case(ours), format_case(baseline), f"{worst:.2f}", f"{median:.2f}",
            str(len(ratios)), f"{target.limit:g}", judge(worst, target)]


def growth_row(target, cases):
    first, last = (cases.get(f"{target.prefix}{size}/ours") for size in GROWTH_SIZES)
    if not (first and last and first.times and last.times):
        return None
    ratio = last.per_item() / first.per_item()
    return [f"{format_time(last.per_item())}/{last.unit}",
            f"{format_time(first.per_item())}/{first.unit}", f"{ratio:.2f}", f"{ratio:.2f}", "1",
            f"{target.limit:g}", judge(ratio, target)]


def item_row(target, cases):
    times = [case.per_item() for name, case in cases.items()
             if name.startswith(target.prefix) and case.times]
    if not times:
        return None
    return [format_time(max(times)), "", "", "", str(len(times)), format_time(target.limit),
            judge(max(times), target)]


def peak_row(target, cases):
    peaks = [peak for name, case in cases.items() if name.startswith(target.prefix)
             for peak in case.peaks]
    if not peaks:
        return None
    return ["", "", f"{max(peaks):.2f}", f"{statistics.median(peaks):.2f}", "",
            f"{target.limit:g}", judge(max(peaks), target)]


ROWS = {"pair": pair_row, "growth": growth_row, "item": item_row, "peak": peak_row}


def target_table(cases):
    table = [["work", "ours", "baseline", "worst ratio", "median", "formulas", "at most", "met"]]
    for target in TARGETS:
        row = ROWS[target.kind](target, cases)
        if row:
            table.append([target.work] + row)
    return table


def pair_table(cases):
    return [["pair", "ours", "baseline", "ratio"]] + [
        [name, format_case(ours), format_case(baseline), f"{ratio:.2f}"]
        for ratio, name, ours, baseline in sorted(find_pairs(cases, ""), key=lambda pair: pair[1])]


def shape_table(cases):
    """The time per item of every case without a baseline, with all sizes of a shape in one line."""
    lines = {}
    for name, case in cases.items():
        match = re.fullmatch(r"(.*?)/((?:n=)?\d+(?:/\d+)?)/ours", name)
        has_baseline = name[:-len("ours")] + "baseline" in cases
        if match and case.times and not case.peaks and not has_baseline:
            lines.setdefault((match[1], case.unit), []).append((match[2], case))
    table = [["case", "median time per item at each size"]]
    for (name, unit), sizes in sorted(lines.items()):
        sizes.sort(key=lambda entry: [int(number) for number in re.findall(r"\d+", entry[0])])
        table.append([name, f"per {unit}: " + "; ".join(
            f"{size}: {format_time(case.per_item())}" for size, case in sizes)])
    return table


def thread_table(cases):
    table = [["two threads, objects of their own", "one thread", "two threads", "ratio of work",
              "best", "at least", "met"]]
    for target in THREAD_TARGETS:
        case = cases.get(f"{target.name}/by_clock/manual_time")
        if case and case.threads:
            one, two, ratios = zip(*case.threads)
            ratio = statistics.median(ratios)
            table.append([target.work, f"{format_time(statistics.median(one))}/{case.unit}",
                          f"{format_time(statistics.median(two))}/{case.unit}", f"{ratio:.2f}",
                          f"{max(ratios):.2f}", f"{target.limit:g}",
                          "yes" if ratio >= target.limit else "no"])
    return table


def format_text(table):
    widths = [max(len(row[column]) for row in table) for column in range(len(table[0]))]
    return "\n".join("  ".join(cell.ljust(width) for cell, width in zip(row, widths)).rstrip()
                     for row in table)


def format_markdown(table):
    lines = ["| " + " | ".join(row) + " |" for row in table]
    lines.insert(1, "|---" * len(table[0]) + "|")
    return "\n".join(lines)


def find_processor():
    for line in pathlib.Path("/proc/cpuinfo").read_text().splitlines():
        if line.startswith("model name"):
            return line.split(":", 1)[1].strip()
    return "unknown processor"


def describe_run(contexts):
    root = pathlib.Path(__file__).resolve().parent.parent
    commit = subprocess.run(["git", "-C", str(root), "describe", "--always", "--dirty=, changed"],
                            capture_output=True, text=True, check=False).stdout.strip()
    context = contexts[0]
    caches = ", ".join(f"L{cache['level']} {cache['type'].lower()} {cache['size'] // 1024} KiB"
                       for cache in context["caches"])
    loads = [context["load_avg"][0] for context in contexts if context.get("load_avg")]
    return [["machine", f"{find_processor()}, {context['num_cpus']} processors"],
            ["caches", caches],
            ["compiler", context.get("compiler", "?")],
            ["flags", context.get("flags", "?")],
            ["commit", commit or "?"],
            ["date", min(context["date"] for context in contexts)[:10]],
            ["load", f"{min(loads):.1f} to {max(loads):.1f} before an executable started"
             if loads else "?"]]


def write_document(path, parts):
    text = pathlib.Path(path).read_text()
    before, rest = text.split(BEGIN, 1)
    after = rest.split(END, 1)[1]
    figures = "\n\n".join([BEGIN, *parts, END])
    pathlib.Path(path).write_text(before + figures + after)


ALL = ["set", "read", "eval", "render", "column", "init_value", "truth_table", "road", "threads",
       "luts"]


def run_executables(build, names, options):
    """Runs bench_NAME for each name; returns the files of results."""
    folder = build / "results"
    folder.mkdir(parents=True, exist_ok=True)
    results = []
    for name in (word.removeprefix("bench_") for word in names or ALL):
        executable = build / "bench" / f"bench_{name}"
        if not executable.exists():
            sys.exit(f"no such benchmark: {name} ({', '.join(ALL)})")
        print(f"running bench_{name}", file=sys.stderr)
        results.append(folder / f"bench_{name}.json")
        done = subprocess.run(
            [executable, *options, f"--benchmark_out={results[-1]}", "--benchmark_out_format=json"],
            stdout=subprocess.PIPE, stderr=subprocess.STDOUT, text=True, check=False)
        if done.returncode != 0:
            sys.exit(f"{done.stdout}bench_{name} failed")
    return results


def main():
    parser = argparse.ArgumentParser(prog="./dev bench", description="runs benchmarks, shows tables")
    parser.add_argument("build", type=pathlib.Path, help=argparse.SUPPRESS)
    parser.add_argument("names", nargs="*")
    parser.add_argument("--pairs", action="store_true")
    parser.add_argument("--doc", action="store_true")
    arguments, options = parser.parse_known_intermixed_args()
    strange = [option for option in options if not option.startswith("--benchmark_")]
    if strange:
        parser.error(f"no such option: {strange[0]}")

    cases, contexts = read_results(run_executables(arguments.build, arguments.names, options))
    if not cases:
        sys.exit("there are no results")
    targets, shapes, threads = target_table(cases), shape_table(cases), thread_table(cases)
    run = [["run", ""]] + describe_run(contexts)
    shown = [run[1:], targets, shapes, threads]
    shown += [pair_table(cases)] if arguments.pairs else []
    print("\n\n".join(format_text(table) for table in shown if len(table) > 1))
    if arguments.doc:
        document = pathlib.Path(__file__).resolve().parent.parent / "docs" / "benchmarks.md"
        write_document(document, [format_markdown(table)
                                  for table in (run, targets, shapes, threads)])
    failed = [f"{name}: {case.error}" for name, case in cases.items() if case.error]
    for line in failed:
        print("failed:", line, file=sys.stderr)
    return 1 if failed else 0


if __name__ == "__main__":
    sys.exit(main())
