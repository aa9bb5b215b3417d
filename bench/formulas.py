#!/usr/bin/env python3
"""Writes formulas, each as equation text and as a C++ expression for the same function.

usage: formulas.py DIRECTORY

Writes column_formulas.inc (words of 64 rows, for the column kernels), eval_formulas.inc (one value
at a time, for the compiled functions) and formula_table.inc (texts) into DIRECTORY.
The seeds are fixed, so every build measures the same formulas.

Kinds: 'order' combines neighbours in order, x0 op x1 op x2 ..., from the left, starting again at x0
after the last; 'chain' groups from the left too but draws its operands at random; 'tree' is a random
tree written with parentheses, with random operands, some negated; every variable occurs.
"""
import pathlib
import random
import sys

OPERATORS = {
    "&": ("&", False),
    "|": ("|", False),
    "^": ("^", False),
    "~&": ("&", True),
    "~|": ("|", True),
    "~^": ("^", True),
}
KINDS = ("order", "chain", "tree")
# Variables, operators, seeds of each kind.
COLUMN_SIZES = ((10, 20, (1,)), (16, 32, (1, 2, 3)), (20, 40, (1, 2, 3)), (24, 48, (1, 2, 3)),
                (28, 56, (1, 2, 3)), (30, 60, (1,)))
EVAL_SIZES = ((6, 20, (1, 2, 3)), (30, 200, (1, 2, 3)))


# A formula is ("id", index), ("not", formula) or (operator, left, right).
def draw_chain(rng, num_operators, operand):
    formula = operand(0)
    for position in range(num_operators):
        formula = (rng.choice(list(OPERATORS)), formula, operand(position + 1))
    return formula


def draw_tree(rng, num_operators, operands):
    if num_operators == 0:
        leaf = ("id", operands.pop())
        return ("not", leaf) if rng.random() < 0.25 else leaf
    num_left = rng.randrange(num_operators)
    left = draw_tree(rng, num_left, operands)
    return (rng.choice(list(OPERATORS)), left,
            draw_tree(rng, num_operators - 1 - num_left, operands))


def draw(kind, num_variables, num_operators, seed):
    rng = random.Random(f"{kind} {num_variables} {num_operators} {seed}")
    if kind == "order":
        return draw_chain(rng, num_operators, lambda position: ("id", position % num_variables))
    if kind == "chain":
        operands = [rng.randrange(num_variables)]
        while len(operands) <= num_operators:
            operand = rng.randrange(num_variables)
            # Never the previous one: "... & x1 | x1" would make everything before it redundant.
            if operand != operands[-1]:
                operands.append(operand)
        return draw_chain(rng, num_operators, lambda position: ("id", operands[position]))
    operands = list(range(num_variables))
    operands += [rng.randrange(num_variables) for _ in range(num_operators + 1 - num_variables)]
    rng.shuffle(operands)
    return draw_tree(rng, num_operators, operands)


def write_text(formula):
    if formula[0] == "id":
        return f"x{formula[1]}"
    if formula[0] == "not":
        return "~" + write_text(formula[1])
    # Operators group from the left, so only a right operand needs parentheses.
    right = write_text(formula[2])
    if formula[2][0] in OPERATORS:
        right = f"({right})"
    return f"{write_text(formula[1])} {formula[0]} {right}"


def write_words(formula):
    if formula[0] == "id":
        return f"X({formula[1]})"
    if formula[0] == "not":
        return "~" + write_words(formula[1])
    operator, negated = OPERATORS[formula[0]]
    text = f"({write_words(formula[1])} {operator} {write_words(formula[2])})"
    return "~" + text if negated else text


def write_value(formula):
    if formula[0] == "id":
        return f"v[{formula[1]}]"
    if formula[0] == "not":
        return f"({write_value(formula[1])} ^ 1u)"
    operator, negated = OPERATORS[formula[0]]
    text = f"({write_value(formula[1])} {operator} {write_value(formula[2])})"
    return f"({text} ^ 1u)" if negated else text


def list_formulas(sizes):
    for num_variables, num_operators, seeds in sizes:
        for kind in KINDS:
            for seed in seeds:
                yield kind, seed, num_variables, num_operators, draw(kind, num_variables,
                                                                     num_operators, seed)


def main():
    directory = pathlib.Path(sys.argv[1])
    directory.mkdir(parents=True, exist_ok=True)
    columns, values, table = [], [], []
    for entry in list_formulas(COLUMN_SIZES):
        kind, seed, num_variables, num_operators, formula = entry
        columns.append(f"COLUMN_FORMULA({len(columns)}, {num_variables}, {write_words(formula)})\n")
        table.append(f'COLUMN_TEXT("{kind}", {seed}, {num_variables}, {num_operators}, '
                     f'"{write_text(formula)}")\n')
    for entry in list_formulas(EVAL_SIZES):
        kind, seed, num_variables, num_operators, formula = entry
        values.append(f"EVAL_FORMULA({len(values)}, {write_value(formula)})\n")
        table.append(f'EVAL_TEXT("{kind}", {seed}, {num_variables}, {num_operators}, '
                     f'"{write_text(formula)}")\n')
    (directory / "column_formulas.inc").write_text("".join(columns))
    (directory / "eval_formulas.inc").write_text("".join(values))
    (directory / "formula_table.inc").write_text("".join(table))


if __name__ == "__main__":
    main()
