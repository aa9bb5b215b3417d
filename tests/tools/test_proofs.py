#!/usr/bin/env python3
# Clauses and proofs that the tool writes: the checker of tests/decide must accept the proof of
# every random equation that is never 1, and refuse it for satisfiable clauses.
import argparse
import pathlib
import random
import subprocess
import sys
import tempfile

NO, YES = 1, 0 # exit statuses of 'sat'


def pigeons(holes):
    """One more pigeon than holes, each in a hole and no two in the same: never 1, and too hard for
    any solver from a dozen holes on."""
    seats = [" | ".join(f"p{pigeon}_{hole}" for hole in range(holes))
             for pigeon in range(holes + 1)]
    pairs = [f"~p{pigeon}_{hole} | ~p{other}_{hole}" for hole in range(holes)
             for pigeon in range(holes + 1) for other in range(pigeon)]
    return " & ".join(f"({part})" for part in seats + pairs)


def random_clauses(rng):
    """Random clauses of three literals, in a number that makes both answers common."""
    inputs = rng.randrange(8, 24)
    return " & ".join(
        "(" + " | ".join(rng.choice(["", "~"]) + f"v{name}"
                         for name in rng.sample(range(inputs), 3)) + ")"
        for _ in range(int(4.6 * inputs)))


def run(*command):
    return subprocess.run(command, capture_output=True, text=True, check=False)


def without_last_clause(text):
    lines = text.splitlines()
    head = next(place for place, line in enumerate(lines) if line.startswith("p cnf "))
    _, _, variables, clauses = lines[head].split()
    lines[head] = f"p cnf {variables} {int(clauses) - 1}"
    return "\n".join(lines[:-1]) + "\n"


def main():
    parser = argparse.ArgumentParser()
    parser.add_argument("--tool", required=True)
    parser.add_argument("--checker", required=True)
    options = parser.parse_args()
    rng = random.Random(1)
    texts = [(["sat"], random_clauses(rng)) for _ in range(60)]
    texts += [(["sat"], pigeons(5)), (["sat"], pigeons(8)),
              (["sat", "--always"], " ^ ".join(f"v{k}" for k in range(20)) + " ^ " +
               " ^ ".join(f"(v{k} ^ (1))" for k in reversed(range(19))) + " | ~v19 | v19"),
              (["equal", "(a & b) | (c & d) | (e ^ f)"], "(f ^ e) | ~((d ~& c) & (b ~& a))")]
    num_proved = 0
    with tempfile.TemporaryDirectory() as name:
        clauses, proof = pathlib.Path(name, "clauses"), pathlib.Path(name, "proof")
        for command, text in texts:
            proof.unlink(missing_ok=True)
            answer = run(options.tool, *command, "--cnf", clauses, "--proof", proof, text)
            if not proof.exists():
                assert "the clauses are satisfiable" in answer.stderr, answer
                continue
            assert answer.returncode == (NO if command == ["sat"] else YES), (text, answer)
            checked = run(options.checker, clauses, proof)
            assert checked.returncode == 0, (text, checked.stdout)
            num_proved += 1
            # The last clause demands the result; the others describe gates and are satisfied for
            # any input.
            clauses.write_text(without_last_clause(clauses.read_text()))
            checked = run(options.checker, clauses, proof)
            assert checked.returncode == 1 and checked.stdout.startswith("refused: "), checked
    print(f"{num_proved} proofs of {len(texts)} questions")
    assert 20 < num_proved < len(texts)


if __name__ == "__main__":
    sys.exit(main())
