#!/usr/bin/env python3
"""Mutation check: changes one operator, constant or condition in s/ at a time and runs the quick
tests, which should fail. Reports the changes that no test notices. Debian 12 has no program that
does this for C++.

usage: mutate.py ROOT WORK [--count N] [--seed N] [--jobs N] [--only TEXT] [--survivors] [--list]

WORK holds copies of the tree and their builds, one for each job; ROOT is not changed. A mutant
costs one compilation (in a header: one for each source that includes it), one link and the tests up
to the first failure. It is killed by a test that fails, crashes or takes several times its usual
processor time. What counts as a mutant, and what is left out:
  - operators are those with blanks around them or in front of an operand, so no template brackets,
    pointers and references;
  - comments, texts, preprocessor lines, assertions and the check of the debug builds are left out;
  - SPEED_ONLY names what changes time or memory but no result: hints, reserved room, sizes of
    tables and stacks that grow, thresholds between two ways to the same result;
  - a mutant that does not compile, or whose machine code equals the original's, does not count.
scripts/mutants_equivalent.txt lists mutants that cannot be noticed, each with its reason; they are
not counted either.
Exit status: 1 if a mutant survived that is not listed.
"""
import argparse
import collections
import concurrent.futures
import hashlib
import json
import pathlib
import queue
import random
import re
import resource
import shutil
import signal
import subprocess
import sys

NOT_COPIED = re.compile(r"\.git|build.*")  # in the tree's root
CONFIGURE = ["-G", "Ninja", "-DCMAKE_BUILD_TYPE=Debug",
             "-DCMAKE_CXX_FLAGS_DEBUG=-O1 -D_GLIBCXX_ASSERTIONS",
             "-DCMAKE_EXPORT_COMPILE_COMMANDS=ON", "-DKQ_BUILD_TOOLS=OFF",
             "-DKQ_BUILD_LOGIC=OFF"]
LIBRARY = "kq_boolequation"

# Likely killers first; tests of large texts and of failing allocations take longest.
EXHAUSTIVE = "*UpToThreeTokens*:*EveryTextOfOneByte*:*InitValues*:*UpToFiveTokensTrace*"
TESTS = [
    ("unit_tests", "-Large.*"),
    ("golden_tests", "*"),
    ("random_tests", "Scripts.Short*:Texts.Mutated*:Texts.*NegatedOperators*:Texts.*Dumps*"),
    ("exhaustive_tests", EXHAUSTIVE),
    ("unit_tests", "Large.*"),
    ("random_tests", "Allocation.*:Operations.*"),
    ("loading/loading_tests", "*"),
]
SLOWDOWN = 4  # in processor time; wall-clock time, which other programs stretch, may be much longer
MIN_SECONDS = 4
CLOCK = 10
MAX_MEMORY = 8 << 30

# Lines that change time or memory but no result, by their text.
SPEED_ONLY = [re.compile(text) for text in (
    r"\b(reserve|max|min)\(.*(Expected|kFirstVariables|kInline|GetSize|numDigits|size\(\))",
    r"\breserve\(",
    r"\bconstexpr \w+( int)? (kKeptSlots|kKernelLevel|kMaxCopyLevel|kLongPiece|kInline|"
    r"kMaxExpected|kNumWritten|kFirstVariables|kNumRecent|kMaxUnindexed|"
    r"kTileLevel|kKqTileWords)\b",
    r"\bKqStack<",
    r"\bresize\(2 \*",
    r"\bRunTiles<",
    r"__builtin_cpu_supports|isSupported\(\)",
    r"alignas\(|__attribute__",
    r"\bhash|0x9e3779b97f4a7c15u",
    r"\w\[\d+\];",
)]
SKIPPED_FUNCTIONS = ("AdviseLargePages", "KqCheckTree")

BINARY = {
    "<": ["<=", ">"], "<=": ["<"], ">": [">=", "<"], ">=": [">"], "==": ["!="], "!=": ["=="],
    "&&": ["||"], "||": ["&&"], "+": ["-"], "-": ["+"], "*": ["+"], "/": ["*"], "%": ["/"],
    "&": ["|"], "|": ["&"], "^": ["&"], "<<": [">>"], ">>": ["<<"],
    "+=": ["-="], "-=": ["+="], "*=": ["+="], "/=": ["*="], "&=": ["|="], "|=": ["&="],
    "^=": ["|="], "<<=": [">>="], ">>=": ["<<="],
}
TOKEN = re.compile(r"""
    (?P<comment>//[^\n]*|/\*.*?\*/)
  | (?P<preprocessor>^[ \t]*\#(?:[^\n]*\\\n)*[^\n]*)
  | (?P<text>"(?:[^"\\\n]|\\.)*")
  | (?P<character>'(?:[^'\\\n]|\\.)+')
  | (?P<number>\b\d[\w']*)
  | (?P<name>[A-Za-z_]\w*)
  | (?P<operator>->|<<=|>>=|<<|>>|<=|>=|==|!=|&&|\|\||\+\+|--|[-+*/%&|^]=|::|[-+*/%&|^<>=!~?:;,.()\[\]{}])
  | (?P<blank>\s+)
""", re.X | re.M | re.S)

# What to put between two places of a file; and the line there, before and after, without extra
# blanks.
Mutant = collections.namedtuple("Mutant", "path line begin end after old new")


# --- what to change -----------------------------------------------------------------------------


def closing(tokens, opening):
    depth = 0
    for index in range(opening, len(tokens)):
        depth += {"(": 1, "{": 1, ")": -1, "}": -1}.get(tokens[index][1], 0)
        if depth == 0:
            return index
    return len(tokens) - 1


def skipped_ranges(tokens):
    """The token ranges of assertions, of functions named above and of attributes."""
    for index, (kind, text, _) in enumerate(tokens[:-1]):
        if kind != "name" or tokens[index + 1][1] != "(":
            continue
        end = closing(tokens, index + 1)
        if text in ("assert", "static_assert", "alignas", "__attribute__"):
            yield index, end
        elif text in SKIPPED_FUNCTIONS and tokens[min(end + 1, len(tokens) - 1)][1] == "{":
            yield index, closing(tokens, end + 1)


def new_number(text):
    match = re.fullmatch(r"(0[xX])?([0-9a-fA-F]+)([uUlLzZ]*)", text)
    if not match:
        return
    base = 16 if match[1] else 10
    value = int(match[2], base)
    if base == 16:
        yield f"0x{value ^ 1:x}{match[3]}"
    else:
        yield f"{value + 1}{match[3]}"
        if value > 0:
            yield f"{value - 1}{match[3]}"


def changes(tokens, source, index):
    """(begin, end, after) for each change that starts at a token."""
    kind, text, begin = tokens[index]
    end = begin + len(text)
    before, behind = source[begin - 1:begin], source[end:end + 1]
    if kind == "number":
        yield from ((begin, end, after) for after in new_number(text))
    elif kind == "character":
        yield begin, end, "'?'" if text != "'?'" else "'!'"
    elif kind == "name" and text in ("true", "false"):
        yield begin, end, "false" if text == "true" else "true"
    elif kind == "name" and text in ("if", "while") and tokens[index + 1][1] == "(":
        first, last = tokens[index + 1][2] + 1, tokens[closing(tokens, index + 1)][2]
        yield first, last, f"!({source[first:last]})"
    elif kind == "operator" and text in BINARY and before.isspace() and behind.isspace():
        yield from ((begin, end, after) for after in BINARY[text])
    elif kind == "operator" and text in ("!", "~", "-") and behind.strip() and behind != "=":
        if before in "( \n[!" and tokens[index - 1][1] != "operator":
            yield begin, end, ""
    elif kind == "operator" and text in ("++", "--"):
        yield begin, end, "--" if text == "++" else "++"


def mutants_of(path, root):
    source = (root / path).read_text()
    tokens = [(match.lastgroup, match.group(), match.start()) for match in TOKEN.finditer(source)
              if match.lastgroup not in ("comment", "preprocessor", "text", "blank")]
    skipped = set()
    for first, last in skipped_ranges(tokens):
        skipped.update(range(first, last + 1))
    lines = source.split("\n")
    for index in range(len(tokens)):
        line = source.count("\n", 0, tokens[index][2]) + 1
        if index in skipped or any(pattern.search(lines[line - 1]) for pattern in SPEED_ONLY):
            continue
        for begin, end, after in changes(tokens, source, index):
            first, last = source.rfind("\n", 0, begin) + 1, source.find("\n", end)
            changed = source[first:begin] + after + source[end:last]
            yield Mutant(path, line, begin, end, after, " ".join(source[first:last].split()),
                         " ".join(changed.split()))


def read_equivalent(path):
    """{(file, before, after)} from blocks 'file', '- before', '+ after', '= reason'."""
    found = set()
    block = {}
    for line in path.read_text().splitlines() if path.exists() else []:
        if line.startswith("#") or not line.strip():
            continue
        block[line[0]] = line[2:]
        if line[0] not in "-+=":
            block = {"file": line}
        elif line[0] == "=":
            found.add((block["file"], block["-"], block["+"]))
    return found


def read_survivors(path):
    lines = path.read_text().splitlines()
    return {(line.split(":")[0], lines[index + 1][2:], lines[index + 2][2:])
            for index, line in enumerate(lines) if line.endswith(": survived")}


# --- a tree to change ---------------------------------------------------------------------------


def limit(seconds):
    resource.setrlimit(resource.RLIMIT_CPU, (seconds, seconds))
    resource.setrlimit(resource.RLIMIT_AS, (MAX_MEMORY, MAX_MEMORY))
    resource.setrlimit(resource.RLIMIT_CORE, (0, 0))


def children_seconds():
    usage = resource.getrusage(resource.RUSAGE_CHILDREN)
    return usage.ru_utime + usage.ru_stime


class Tree:
    """A copy of the sources with its build, and how to change one source at a time."""

    def __init__(self, root, work):
        self.source, self.build = work / "tree", work / "build"
        self.copy(root)
        self.run(["cmake", "-S", self.source, "-B", self.build, *CONFIGURE])
        targets = [LIBRARY, *sorted({pathlib.Path(name).name for name, _ in TESTS})]
        self.run(["ninja", "-C", self.build, "-j1", *targets])
        self.objects = {}  # by source or header: [(command, object)]
        self.read_commands()
        self.originals = {path: (self.build / path).read_bytes()
                          for uses in self.objects.values() for _, path in uses}
        self.links = self.read_links(targets)
        self.seconds = {}
        for test in TESTS:
            started = children_seconds()
            self.run(self.test_command(test))
            self.seconds[test] = children_seconds() - started

    def copy(self, root):
        wanted = [path for top in root.iterdir() if not NOT_COPIED.fullmatch(top.name)
                  for path in ([top] if top.is_file() else top.rglob("*"))
                  if path.is_file() and "__pycache__" not in path.parts]
        names = {path.relative_to(root) for path in wanted}
        for path in list(self.source.rglob("*")) if self.source.exists() else []:
            if path.is_file() and path.relative_to(self.source) not in names:
                path.unlink()
        for name in sorted(names):
            to = self.source / name
            if not to.exists() or to.read_bytes() != (root / name).read_bytes():
                to.parent.mkdir(parents=True, exist_ok=True)
                shutil.copy(root / name, to)

    def run(self, command):
        done = subprocess.run(command, cwd=self.build if self.build.exists() else None, text=True,
                              stdout=subprocess.PIPE, stderr=subprocess.STDOUT, check=False)
        if done.returncode != 0:
            sys.exit(f"mutate: {' '.join(map(str, command))}\n{done.stdout}")
        return done.stdout

    def read_commands(self):
        entries = json.loads((self.build / "compile_commands.json").read_text())
        commands = {re.search(r" -o (\S+)", entry["command"])[1]: entry["command"]
                    for entry in entries}
        path = None
        for line in self.run(["ninja", "-C", self.build, "-t", "deps"]).splitlines():
            if line and not line.startswith((" ", "ninja")):
                path = line.split(":")[0]
            elif path in commands and line.strip():
                used = (self.build / line.strip()).resolve()
                if used.is_relative_to((self.source / "s").resolve()):
                    name = used.relative_to(self.source.resolve()).as_posix()
                    self.objects.setdefault(name, []).append((commands[path], path))

    def read_links(self, targets):
        """The command of each link in which objects of s/ take part, the shared library's first."""
        objects = {used for path, uses in self.objects.items() if path.endswith(".cpp")
                   for _, used in uses if used.endswith(".cpp.o")}
        links = []
        for target in targets:
            # The shared library's link command is followed by the links to its other names.
            links += [line for line in self.run(
                ["ninja", "-C", self.build, "-t", "commands", target]).splitlines()
                      if " -c " not in line and not objects.isdisjoint(line.split())]
        return sorted(dict.fromkeys(links), key=lambda line: " -shared " not in line)

    def test_command(self, test):
        name, selected = test
        return [str(self.build / "tests" / name), "--gtest_brief=1", "--gtest_fail_fast",
                f"--gtest_filter={selected}"]

    def shell(self, command):
        return subprocess.run(command, shell=True, cwd=self.build, stdout=subprocess.DEVNULL,
                              stderr=subprocess.DEVNULL, check=False).returncode == 0

    def run_mutant(self, mutant):
        """'killed by ...', 'survived', 'same code' or 'does not compile'."""
        path = self.source / mutant.path
        original = path.read_text()
        uses = self.objects.get(mutant.path, [])
        try:
            path.write_text(original[:mutant.begin] + mutant.after + original[mutant.end:])
            if not all(self.shell(command) for command, _ in uses):
                return "does not compile"
            if all((self.build / used).read_bytes() == self.originals[used] for _, used in uses):
                return "same code"
            if not all(self.shell(command) for command in self.links):
                return "does not compile"
            return self.run_tests()
        finally:
            path.write_text(original)
            for _, used in uses:
                (self.build / used).write_bytes(self.originals[used])

    def run_tests(self):
        for test in TESTS:
            seconds = round(max(MIN_SECONDS, SLOWDOWN * self.seconds[test]))
            try:
                done = subprocess.run(self.test_command(test), cwd=self.build,
                                      timeout=CLOCK * seconds, stdout=subprocess.PIPE,
                                      stderr=subprocess.DEVNULL,
                                      preexec_fn=lambda: limit(seconds), check=False)
            except subprocess.TimeoutExpired:
                return f"killed by {test[0]}: no end"
            if done.returncode in (-signal.SIGXCPU, -signal.SIGKILL):
                return f"killed by {test[0]}: no end"
            if done.returncode != 0:
                failed = re.search(rb"\[  FAILED  \] ([\w./]+)", done.stdout)
                return f"killed by {test[0]}: " + (failed[1].decode() if failed else "crash")
        return "survived"


# --- the campaign -------------------------------------------------------------------------------


def sources(root):
    """All sources and headers in all folders of s/."""
    return sorted(path for path in (root / "s").rglob("*") if path.suffix in (".cpp", ".h"))


def choose(root, seed, only):
    paths = [path.relative_to(root).as_posix() for path in sources(root)]
    mutants = [mutant for path in paths for mutant in mutants_of(path, root)]
    random.Random(seed).shuffle(mutants)
    return [mutant for mutant in mutants if only in mutant.path]


def campaign(trees, mutants, count, report):
    """The results of the first 'count' mutants that count."""
    free = queue.Queue()
    for tree in trees:
        free.put(tree)

    def work(mutant):
        tree = free.get()
        try:
            return mutant, tree.run_mutant(mutant)
        finally:
            free.put(tree)

    results = []
    with concurrent.futures.ThreadPoolExecutor(len(trees)) as pool:
        position = 0
        while len(results) < count and position < len(mutants):
            batch = mutants[position:position + min(4 * len(trees), count - len(results))]
            position += len(batch)
            for mutant, result in pool.map(work, batch):
                print(f"{mutant.path}:{mutant.line}: {result}\n- {mutant.old}\n+ {mutant.new}",
                      file=report, flush=True)
                if result.startswith(("killed", "survived")):
                    results.append((mutant, result))
    return results


def digest(root):
    texts = b"".join(path.read_bytes() for path in sources(root))
    return hashlib.sha256(texts).hexdigest()[:12]


def main():
    parser = argparse.ArgumentParser()
    parser.add_argument("root", type=pathlib.Path)
    parser.add_argument("work", type=pathlib.Path)
    parser.add_argument("--count", type=int, default=300)
    parser.add_argument("--seed", type=int, default=1)
    parser.add_argument("--jobs", type=int, default=1)
    parser.add_argument("--only", default="", help="only files with this text in their path")
    parser.add_argument("--survivors", action="store_true",
                        help="only what survived the campaign before, if it is still there")
    parser.add_argument("--list", action="store_true", help="print all mutants, run none")
    arguments = parser.parse_args()
    root = arguments.root.resolve()

    mutants = choose(root, arguments.seed, arguments.only)
    if arguments.list:
        for mutant in mutants:
            print(f"{mutant.path}:{mutant.line}\n- {mutant.old}\n+ {mutant.new}")
        print(f"{len(mutants)} mutants")
        return 0

    equivalent = read_equivalent(root / "scripts" / "mutants_equivalent.txt")
    mutants = [mutant for mutant in mutants
               if (mutant.path, mutant.old, mutant.new) not in equivalent]
    if arguments.survivors:
        survived = read_survivors(arguments.work / "report.txt")
        mutants = [mutant for mutant in mutants
                   if (mutant.path, mutant.old, mutant.new) in survived]
    trees = [Tree(root, arguments.work.resolve() / str(job)) for job in range(arguments.jobs)]
    with open(arguments.work / "report.txt", "w", encoding="utf-8") as report:
        print(f"seed {arguments.seed}, sources {digest(root)}", file=report)
        results = campaign(trees, mutants, arguments.count, report)
    survivors = [mutant for mutant, result in results if result == "survived"]
    for mutant in sorted(survivors):
        print(f"{mutant.path}:{mutant.line}\n- {mutant.old}\n+ {mutant.new}")
    killed = len(results) - len(survivors)
    print(f"{killed} of {len(results)} mutants killed"
          f" ({100 * killed / max(1, len(results)):.1f} %); {arguments.work}/report.txt has all")
    return 1 if survivors else 0


if __name__ == "__main__":
    sys.exit(main())
